// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/run/document_run.h"

#include <QAction>
#include <QProgressBar>
#include <QPushButton>
#include <QToolBar>
#include <QToolButton>
#include <algorithm>

#include <gmock/gmock.h>

#include "data/series_file.h"
#include "execution/engine_search.h"
#include "pages/findings.h"
#include "platform/files.h"
#include "shell/findings_view.h"
#include "shell/maps/map_canvas.h"
#include "shell/run/log_view.h"
#include "shell/run/run_panel.h"
#include "shell/widgets/banner.h"
#include "shell/widgets/plot_frame.h"
#include "tests/shell/next_answer.h"
#include "tests/shell/opened_setup.h"
#include "tests/support/engine_script.h"

namespace tervane::document_run_test {
namespace {

using test::NextAnswer;
using test::OpenedSetup;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

/// A setup with an engine for it.
class RunOf : public OpenedSetup {
 public:
  explicit RunOf(const std::string& commands, std::string_view sections = {}) : OpenedSetup(sections) {
    Program().Settings().setValue(kEnginePathSetting, ToQt(Folder().File("engines")));
    test::WriteEngine(Folder(), "engines/Tvn_Simulation", commands);
  }

  DocumentRun& Run() { return Frame().Run(); }
  bool WaitForEnd() {
    const bool hasEnded = QTest::qWaitFor([&] { return !Run().IsExecuting(); }, 20'000);
    QApplication::processEvents();
    return hasEnded;
  }
  QStringList Log() {
    QStringList lines;
    for (std::size_t i = 0; i < Run().Log().Count(); ++i)
      lines << QString::fromStdString(std::string(Run().Log().Line(i)));
    return lines;
  }
  bool ShowsProgress() { return Window().findChild<RunWindow*>() != nullptr; }
  void ClickButton(const QString& toolTip, Qt::KeyboardModifiers modifiers) {
    for (QToolButton* button : Window().findChildren<QToolButton*>())
      if (button->isVisible() && button->toolTip() == toolTip) {
        const QPoint place = button->mapTo(&Window(), button->rect().center());
        return QTest::mouseClick(Window().windowHandle(), Qt::LeftButton, modifiers, place);
      }
    ADD_FAILURE() << "no button " << FromQt(toolTip);
  }
};

/// Waits until the test lets it go on.
constexpr const char* kWait = "\nwhile [ ! -e go ]; do sleep 0.02; done";

TEST(DocumentRun, SavesRunsAndLeadsFromAMessageToTheControl) {
  RunOf setup(
      "echo \"got $2, $(grep -c 'Title = .Karup' \"$1\")\"; echo 'error: SimSpec/SimTitle:Title: is odd'\n"
      "echo 'warning: Nowhere:Key: hm'; echo 'progress 42 half'" +
      std::string(kWait));
  setup.GoTo("SimSpec/SimTitle:Title");
  setup.Type("Karup");  // not entered yet
  setup.Command("Run water movement only");
  EXPECT_TRUE(setup.ShowsProgress());
  EXPECT_FALSE(setup.Action("Execute...")->isEnabled());
  EXPECT_TRUE(setup.Action("Run preprocessor only")->isEnabled());
  auto* bar = setup.Frame().findChild<RunPanel*>()->findChild<QProgressBar*>();
  EXPECT_TRUE(QTest::qWaitFor([&] { return bar->isVisible() && bar->value() == 42; }));
  EXPECT_TRUE(setup.Shows("half"));
  setup.Folder().Write("go", "");
  ASSERT_TRUE(setup.WaitForEnd());
  EXPECT_TRUE(setup.Action("Execute...")->isEnabled());
  QApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
  EXPECT_FALSE(setup.ShowsProgress());
  EXPECT_TRUE(setup.Shows("The run is done after"));
  EXPECT_TRUE(setup.Log().contains("got /WM, 1")) << FromQt(setup.Log().join("\n"));

  auto* findings = setup.Frame().findChild<FindingsView*>();
  EXPECT_FALSE(findings->findItems("Nowhere:Key: hm — told by the engine", Qt::MatchExactly, 2).empty());
  const auto odd = findings->findItems("is odd — told by the engine", Qt::MatchExactly, 2);
  ASSERT_EQ(odd.size(), 1);
  EXPECT_EQ(odd[0]->toolTip(1), "SimSpec/SimTitle:Title");
  setup.GoTo("ExtraParams");
  emit findings->itemActivated(odd[0], 1);
  EXPECT_EQ(setup.Frame().CurrentPath(), "SimSpec/SimTitle");
  EXPECT_EQ(setup.Focused<QLineEdit>()->text(), "Karup");
}

TEST(DocumentRun, ItsEndLeadsToTheFirstErrorAndWhatItToldGoesStale) {
  RunOf setup("echo 'error: SimSpec/SimTitle:Title: is odd'; echo 'error: x'; echo 'error: y'; exit 3");
  setup.GoTo("ExtraParams");
  setup.Command("Run water movement only");
  ASSERT_TRUE(setup.WaitForEnd());
  EXPECT_TRUE(setup.Shows("Simulation title > Simulation Title: is odd (and 2 more)"));
  auto* findings = setup.Frame().findChild<FindingsView*>();
  const auto odd = [&] { return findings->findItems("is odd", Qt::MatchContains, 2).value(0)->text(2); };
  EXPECT_EQ(odd(), "is odd — told by the engine");
  for (QPushButton* button : setup.Frame().findChildren<QPushButton*>())
    if (button->isVisible() && button->text() == "&Go to the Place") {
      button->click();
      break;
    }
  EXPECT_EQ(setup.Frame().CurrentPath(), "SimSpec/SimTitle");
  const int count = findings->Count();
  setup.Type("Karup");
  setup.Press(Qt::Key_Return);
  EXPECT_THAT(FromQt(odd()), testing::ContainsRegex("from the run of [0-9:]+, the setup has changed since"));
  EXPECT_LT(findings->Count(), count);
  setup.Frame().Undo();
  EXPECT_EQ(odd(), "is odd — told by the engine");
  EXPECT_EQ(findings->Count(), count);
}

TEST(DocumentRun, WithShiftNoWindowShowsTheProgress) {
  RunOf setup("true");
  setup.ClickButton("Run water movement only", Qt::ShiftModifier);
  EXPECT_TRUE(setup.Run().IsExecuting());
  EXPECT_FALSE(setup.ShowsProgress());
  EXPECT_TRUE(setup.WaitForEnd());
  setup.ClickButton("Run water movement only", Qt::NoModifier);
  EXPECT_TRUE(setup.ShowsProgress());
  EXPECT_TRUE(setup.WaitForEnd());
}

TEST(DocumentRun, ExpectsTheReportOfThePreprocessorWhereItRuns) {
  RunOf setup("true");
  setup.Command("Execute...");
  EXPECT_TRUE(setup.WaitForEnd());
  EXPECT_THAT(FromQt(setup.Run().Sentence()), HasSubstr("has not written its report"));
  setup.Command("Preprocessing");
  setup.Command("Execute...");
  EXPECT_TRUE(setup.WaitForEnd());
  EXPECT_THAT(FromQt(setup.Run().Sentence()), StartsWith("The run is done"));
}

TEST(DocumentRun, StopsWhenTheUserConfirms) {
  RunOf setup(kWait);
  setup.Command("Run water movement only");
  {
    const NextAnswer no("No");
    setup.Command("Stop…");
    EXPECT_THAT(no.Text(), HasSubstr("Stop the engine that runs karup.tvd?"));
  }
  QTest::qWait(200);
  EXPECT_TRUE(setup.Run().IsExecuting());
  const NextAnswer yes("Yes");
  setup.Command("Stop…");
  EXPECT_TRUE(setup.WaitForEnd());
  EXPECT_TRUE(setup.Shows("The run was stopped after"));
}

TEST(DocumentRun, WithoutASaveNothingRuns) {
  RunOf setup("touch started");
  setup.Command("Preprocessing");
  setup.Folder().Write("karup.tvd", test::SetupText(14, "section SimSpec {\n}"));  // by another program
  std::vector<std::string> told;
  QTimer answers;
  QObject::connect(&answers, &QTimer::timeout, [&] {
    if (auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget())) {
      told.push_back(FromQt(box->text()));
      box->reject();
    }
  });
  answers.start(5);
  setup.Command("Execute...");
  EXPECT_FALSE(setup.Run().IsExecuting());
  ASSERT_EQ(told.size(), 2u);
  EXPECT_EQ(told[1], "Unable to run setup: Failed to save specification file.");
  EXPECT_FALSE(FileExists(setup.Folder().File("started")));
}

TEST(DocumentRun, TellsWhereEnginesAreLookedFor) {
  OpenedSetup setup;
  setup.Program().Settings().setValue(kEnginePathSetting, "/no/such/folder");
  const NextAnswer answer("OK");
  setup.Command("Execute...");
  EXPECT_THAT(answer.Text(), HasSubstr("the engine Tvn_Simulation was not found"));
  EXPECT_THAT(answer.Text(), HasSubstr("/no/such/folder"));
}

TEST(DocumentRun, GoesOnWhenTheSetupIsClosedAndIsFoundAgain) {
  RunOf setup("echo 'progress 7 slow'" + std::string(kWait) + "; exit 4");
  setup.Command("Run water movement only");
  ASSERT_TRUE(QTest::qWaitFor([&] { return setup.Run().Progress().has_value(); }));
  const NextAnswer yes("Yes");
  ASSERT_TRUE(setup.Window().CloseDocument(&setup.Frame()));
  EXPECT_THAT(yes.Text(), HasSubstr("let the engine run on?"));

  ASSERT_TRUE(setup.Window().OpenDocument(ToQt(setup.Path())));
  EXPECT_TRUE(setup.Run().IsExecuting());
  EXPECT_TRUE(QTest::qWaitFor([&] { return setup.Run().Progress().has_value(); }));
  ASSERT_TRUE(setup.Window().CloseDocument(&setup.Frame()));
  setup.Folder().Write("go", "");
  std::string problem;
  const std::string state = setup.Folder().File("karup_results/karup_Run.txt");
  ASSERT_TRUE(QTest::qWaitFor([&] {
    const auto read = ReadRunState(state, problem);
    return read && read->HasEnded();
  }));
  ASSERT_TRUE(setup.Window().OpenDocument(ToQt(setup.Path())));
  EXPECT_TRUE(setup.WaitForEnd());
  EXPECT_TRUE(setup.Shows("exit status 4"));
  // Once.
  ASSERT_TRUE(QTest::qWaitFor([&] { return ReadRunState(state, problem)->isReported; }));
  ASSERT_TRUE(setup.Window().CloseDocument(&setup.Frame()));
  ASSERT_TRUE(setup.Window().OpenDocument(ToQt(setup.Path())));
  EXPECT_FALSE(setup.Run().IsExecuting());
  EXPECT_THAT(setup.Frame().findChildren<Banner*>(), IsEmpty());
  // The first page tells the last run all the same.
  EXPECT_TRUE(setup.Shows("exit status 4"));
}

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

/// The road of one run, as a user goes it.
TEST(DocumentRun, LeadsFromAChangedFileToTheProcessedPages) {
  OpenedSetup setup(test::Example{"rhone", "rhone.tvd"});
  setup.Program().Settings().setValue(kEnginePathSetting, ToQt(std::string(TERVANE_BIN_DIR) + "/engines"));
  WriteShortSeries(setup.Folder().File("january.nds0"));
  const auto findings = [&] {
    std::vector<SetupFinding> found = FindingsOf(setup.Session().Document());
    // The gauge whose area is smaller than a cell stays as it is.
    std::erase_if(found, [](const SetupFinding& finding) { return finding.key == "GRIDCODEID"; });
    return found;
  };
  ASSERT_THAT(findings(), IsEmpty());

  const std::string station = "Climate/PrecipitationRate/TIME_SERIES_7";
  setup.GoTo(station + "/TIME_SERIES_FILE:FILE_NAME");
  setup.Type("january.nds0");
  setup.Press(Qt::Key_Return);
  ASSERT_EQ(findings().size(), 1U);
  EXPECT_EQ(findings()[0].path, station + "/TIME_SERIES_FILE");
  EXPECT_THAT(findings()[0].detail, HasSubstr("the simulation runs to 2015-12-31"));
  EXPECT_EQ(setup.Frame().findChild<FindingsView*>()->topLevelItemCount(), 2) << "with the gauge";

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
      EXPECT_EQ(canvas->Content().grids.size() + canvas->Content().shapes.size(), 1U);
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
}  // namespace tervane::document_run_test
