// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/editors/data_viewer.h"

#include <QPushButton>
#include <QSlider>
#include <QTabWidget>

#include <gmock/gmock.h>

#include "data/datafile_writer.h"
#include "shell/editors/data_table.h"
#include "shell/maps/map_canvas.h"
#include "spatial/data2d.h"
#include "spatial/domain.h"
#include "tests/shell/opened_setup.h"
#include "tests/support/data_files.h"

namespace tervane::data_viewer_test {
namespace {

using test::OpenedSetup;

/// 3 by 2 cells on two days; the cells of a day have its number.
void WriteDays(const std::string& path, float first) {
  NewDataFile content;
  content.geometry.nx = 3;
  content.geometry.ny = 2;
  content.geometry.cellSize = 50;
  content.items = {{"Head", 100180, 1000, {}}};
  DataFileWriter writer;
  ASSERT_EQ(writer.Create(path, content), "");
  for (int day = 0; day < 2; ++day) {
    ASSERT_EQ(writer.AddStep(CYbDateTime(2000, 1, 1 + day)), "");
    ASSERT_EQ(writer.Put(1, std::vector<float>(6, first + static_cast<float>(day))), "");
  }
  ASSERT_EQ(writer.Finish().error, "");
}

std::string Cell(const DataTable& table) { return FromQt(table.model()->index(1, 2).data().toString()); }

TEST(DataViewer, EditShowsTheFileInATabThatFollowsItAndClosesByItself) {
  OpenedSetup setup;
  const std::string path = setup.Folder().File("dem.nds2");
  WriteDays(path, 10);
  auto* topography = setup.Session().Document().Root().Important(kTopography);
  ASSERT_TRUE(topography);
  topography->Type = CData2DKvf::kGridFile;
  topography->GridFile().Choose(FileName(path, {}));
  test::WriteCodes(setup.Folder().File("domain.nds2"), {1, 2});
  setup.Session().Document().Root().Important(kDomain)->GridFile().Choose(
      FileName("domain.nds2", setup.Folder().Path()));
  setup.GoTo("Topography");
  for (QPushButton* button : setup.Frame().findChildren<QPushButton*>())
    if (button->isVisible() && button->text() == "Edit...") button->click();

  auto* tabs = setup.Window().findChild<QTabWidget*>();
  auto* viewer = qobject_cast<DataViewer*>(tabs->currentWidget());
  ASSERT_TRUE(viewer);
  EXPECT_EQ(setup.Window().Frame(), nullptr);
  EXPECT_EQ(tabs->tabText(1), "dem.nds2");
  EXPECT_FALSE(setup.Action("Save")->isEnabled());
  const auto& table = *viewer->findChild<DataTable*>();
  EXPECT_TRUE(QTest::qWaitFor([&] { return viewer->findChild<MapCanvas*>()->Content().domain != nullptr; }))
      << "where the model of the setup lies";
  EXPECT_TRUE(QTest::qWaitFor([&] { return Cell(table) == "10"; }));
  viewer->findChild<QSlider*>()->setValue(1);
  EXPECT_TRUE(QTest::qWaitFor([&] { return Cell(table) == "11"; }));
  WriteDays(path, 20);
  viewer->Reload(true);
  EXPECT_TRUE(QTest::qWaitFor([&] { return Cell(table) == "21"; }));
  EXPECT_TRUE(setup.Window().ShowDataFile(ToQt(path)));
  EXPECT_EQ(tabs->count(), 2);

  setup.Command("Close");
  EXPECT_EQ(tabs->count(), 1);
  EXPECT_NE(setup.Window().Frame(), nullptr);
  EXPECT_THAT(setup.Program().RecentFiles(), testing::SizeIs(1));
}

}  // namespace
}  // namespace tervane::data_viewer_test
