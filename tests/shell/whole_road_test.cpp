// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The road of one run, as a user goes it: from a changed file to a look at what the preprocessor made.
#include <QAction>
#include <algorithm>

#include <gmock/gmock.h>

#include "execution/engine_search.h"
#include "execution/processed_data.h"
#include "pages/findings.h"
#include "platform/series_file.h"
#include "shell/document_run.h"
#include "shell/findings_view.h"
#include "shell/map_canvas.h"
#include "shell/plot_frame.h"
#include "tests/shell/opened_setup.h"

namespace tervane {
namespace {

using test::OpenedSetup;
using testing::HasSubstr;
using testing::IsEmpty;

/// Precipitation of one month.
void WriteShortSeries(const std::string& path) {
  NewSeries series{"Rain of January", 100431, 3, {}, {}};
  for (int day = 2; day <= 31; ++day) {
    series.times.emplace_back(2012, 1, day);
    series.values.push_back(1);
  }
  const FileResult result = WriteSeriesFile(path, series);
  ASSERT_TRUE(result.Ok()) << result.error;
}

/// The paths of the pages that a run left.
std::vector<std::string> ProcessedPages(CFlowModelDoc& document) {
  std::vector<std::string> paths;
  WalkNodes(document.Root(), [&](const NodePlace& place) {
    if (place.path.starts_with("ProcData/")) paths.push_back(place.path);
  });
  return paths;
}

TEST(TheWholeRoad, FromAChangedFileToTheProcessedPages) {
  OpenedSetup setup(test::Example{"rhone", "rhone.tvd"});
  setup.Program().Settings().setValue(kEnginePathSetting, ToQt(std::string(TERVANE_BIN_DIR) + "/engines"));
  WriteShortSeries(setup.Folder().File("january.nds0"));
  const auto findings = [&] { return FindingsOf(setup.Session().Document()); };
  ASSERT_THAT(findings(), IsEmpty());

  const std::string station = "Climate/PrecipitationRate/TIME_SERIES_7";
  setup.GoTo(station + "/TIME_SERIES_FILE:FILE_NAME");
  setup.Type("january.nds0");
  setup.Press(Qt::Key_Return);
  ASSERT_EQ(findings().size(), 1U);
  EXPECT_EQ(findings()[0].path, station + "/TIME_SERIES_FILE");
  EXPECT_THAT(findings()[0].detail, HasSubstr("the simulation runs to 2015-12-31"));
  EXPECT_EQ(setup.Frame().findChild<FindingsView*>()->topLevelItemCount(), 1);

  // The engine refuses what the editor warns of, and its message leads to the same control.
  const auto run = [&] {
    setup.Command("Run preprocessor only");
    ASSERT_TRUE(QTest::qWaitFor([&] { return !setup.Frame().Run().IsExecuting(); }, 60'000));
    QApplication::processEvents();
  };
  run();
  EXPECT_TRUE(setup.Shows("The engine failed after"));
  EXPECT_THAT(ProcessedPages(setup.Session().Document()), IsEmpty());

  setup.Window().findChild<QAction*>("Undo")->trigger();
  EXPECT_THAT(findings(), IsEmpty());
  run();
  EXPECT_TRUE(setup.Shows("The run is done"));
  const std::vector<std::string> pages = ProcessedPages(setup.Session().Document());
  ASSERT_GT(pages.size(), 60U);  // the domain, zones, 50 stations, snow
  for (const std::string& path : pages) {
    SCOPED_TRACE(path);
    setup.GoTo(path);
    EXPECT_EQ(setup.Frame().CurrentPath(), path);
    const auto isThere = [&] {
      return std::ranges::none_of(setup.Frame().findChildren<PlotFrame*>(),
                                  [](const PlotFrame* plot) { return plot->isVisible() && plot->IsBusy(); });
    };
    ASSERT_TRUE(QTest::qWaitFor(isThere));
    for (const auto* canvas : setup.Frame().findChildren<MapCanvas*>()) {
      if (!canvas->isVisible()) continue;
      EXPECT_EQ(canvas->Content().message, "");
      EXPECT_THAT(canvas->Content().grids, testing::SizeIs(1));
    }
  }

  // A second run leaves the user where he is.
  const std::string page = "ProcData/rhone/Climate/Precipitation Rate/Gauge 67";
  setup.GoTo(page);
  run();
  EXPECT_EQ(setup.Frame().CurrentPath(), page);
  EXPECT_FALSE(setup.Session().IsModified());
}

}  // namespace
}  // namespace tervane
