// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/editors/data_viewer.h"

#include <QComboBox>
#include <QSlider>
#include <QTabWidget>
#include <QToolButton>

#include <gmock/gmock.h>

#include "data/datafile_writer.h"
#include "shell/charts/series_plot.h"
#include "shell/editors/data_table.h"
#include "shell/editors/time_player.h"
#include "shell/maps/map_canvas.h"
#include "tests/shell/opened_setup.h"

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

TEST(DataViewer, AFileIsShownInATabThatFollowsItAndClosesByItself) {
  OpenedSetup setup;
  const std::string path = setup.Folder().File("dem.nds2");
  WriteDays(path, 10);
  EXPECT_TRUE(setup.Window().ShowDataFile(ToQt(path)));

  auto* tabs = setup.Window().findChild<QTabWidget*>();
  auto* viewer = qobject_cast<DataViewer*>(tabs->currentWidget());
  ASSERT_TRUE(viewer);
  EXPECT_EQ(setup.Window().Frame(), nullptr);
  EXPECT_EQ(tabs->tabText(1), "dem.nds2");
  EXPECT_FALSE(setup.Action("Save")->isEnabled());
  const auto& table = *viewer->findChild<DataTable*>();
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

/// 4 x 2 cells on six days, in the items "Flow x" and "Flow y"; the cells of a day have its number.
std::string WriteFlow(const std::string& path) {
  NewDataFile content;
  content.geometry = FileGeometryOf({4, 2, 50, 0, 0, 0, "NON-UTM"});
  content.items = {{"Flow x", 100180, 1000, {}}, {"Flow y", 100180, 1000, {}}};
  DataFileWriter writer;
  EXPECT_EQ(writer.Create(path, content), "");
  for (int day = 0; day < 6; ++day) {
    EXPECT_EQ(writer.AddStep(CYbDateTime(2000, 1, 1 + day)), "");
    for (const int item : {1, 2}) EXPECT_EQ(writer.Put(item, std::vector<float>(8, static_cast<float>(day))), "");
  }
  EXPECT_EQ(writer.Finish().error, "");
  return path;
}

/// The window with one data file open.
struct OpenedFile {
  explicit OpenedFile(const std::string& path) {
    window.resize(1200, 800);
    window.show();
    isOpen = window.OpenFile(ToQt(path));
    viewer = window.findChild<DataViewer*>();
  }
  MapCanvas& Canvas() { return *viewer->findChild<MapCanvas*>(); }
  TimePlayer& Player() { return *viewer->findChild<TimePlayer*>(); }
  bool Shows(float value) {
    return QTest::qWaitFor([&] {
      const auto& grids = Canvas().Content().grids;
      return !grids.empty() && grids.front().grid->Value(3, 1) == value;
    });
  }
  template <class Widget>
  Widget* Named(const QString& name) {
    for (Widget* widget : viewer->findChildren<Widget*>())
      if (widget->accessibleName() == name) return widget;
    return nullptr;
  }

  test::TempFolder folder;
  Program program{ToQt(folder.File("settings/quarzel.ini"))};
  MainWindow window{program};
  DataViewer* viewer = nullptr;
  bool isOpen = false;
};

TEST(DataViewer, StepsArePlayedWithTheKeyboardInColoursThatStay) {
  const test::TempFolder folder;
  OpenedFile opened(WriteFlow(folder.File("flow.nds2")));
  ASSERT_TRUE(opened.Shows(0));
  auto* slider = opened.viewer->findChild<QSlider*>();
  opened.Player().SetSpeed(60);
  opened.Player().Play();
  EXPECT_TRUE(opened.Shows(5)) << "also when nothing was read before";
  EXPECT_TRUE(QTest::qWaitFor([&] { return !opened.Player().IsPlaying(); }));
  QTest::keyClick(slider, Qt::Key_Home);
  EXPECT_TRUE(opened.Shows(0));
  QTest::keyClick(slider, Qt::Key_Right);
  EXPECT_TRUE(opened.Shows(1));
  EXPECT_EQ(opened.Canvas().Content().grids.front().range, std::pair(0.0F, 5.0F));
  QTest::keyClick(slider, Qt::Key_End);
  EXPECT_TRUE(opened.Shows(5));
  QTest::keyClick(slider, Qt::Key_Home);
  EXPECT_TRUE(opened.Shows(0));
  std::vector<int> seen;
  QObject::connect(&opened.Player(), &TimePlayer::StepChosen, [&seen](int step) { seen.push_back(step); });
  QTest::keyClick(slider, Qt::Key_Space);
  EXPECT_TRUE(opened.Player().IsPlaying());
  EXPECT_TRUE(QTest::qWaitFor([&] { return !opened.Player().IsPlaying(); })) << "it stops at the end";
  EXPECT_THAT(seen, testing::ElementsAre(1, 2, 3, 4, 5));
  EXPECT_TRUE(opened.Shows(5));
  // Around and around, until the user has seen enough.
  opened.Player().SetLooping(true);
  seen.clear();
  opened.Player().Play();
  EXPECT_TRUE(QTest::qWaitFor([&] { return seen.size() > 7; }));
  QTest::keyClick(slider, Qt::Key_Space);
  EXPECT_FALSE(opened.Player().IsPlaying());
  EXPECT_EQ(seen.front(), 0);
  const auto& table = *opened.viewer->findChild<DataTable*>();
  EXPECT_TRUE(QTest::qWaitFor([&] { return Cell(table) == QString::number(slider->value()).toStdString(); }))
      << "the table follows when it stands still";
}

TEST(DataViewer, AClickOnACellShowsItsValuesOverTime) {
  const test::TempFolder folder;
  OpenedFile opened(WriteFlow(folder.File("flow.nds2")));
  ASSERT_TRUE(opened.Shows(0));
  const QPointF place = opened.Canvas().Window().ToScreen({175, 75});
  QTest::mouseClick(&opened.Canvas(), Qt::LeftButton, {}, place.toPoint());
  SeriesPlot* shown = nullptr;
  EXPECT_TRUE(QTest::qWaitFor([&] {
    for (SeriesPlot* plot : opened.viewer->findChildren<SeriesPlot*>())
      if (plot->isVisible() && plot->ValuesAsText().contains("Cell 3, 1")) shown = plot;
    return shown != nullptr;
  }));
  ASSERT_TRUE(shown);
  EXPECT_TRUE(shown->ValuesAsText().contains("2000-01-06 00:00:00\t5")) << shown->ValuesAsText().toStdString();
  EXPECT_EQ(opened.Canvas().Content().points.front().points.size(), 1U);

  // And along a line.
  for (QToolButton* button : opened.viewer->findChildren<QToolButton*>())
    if (button->text() == "Draw Line") button->click();
  ASSERT_TRUE(opened.Canvas().IsAsking());
  for (const MapPoint point : {MapPoint{25, 25}, MapPoint{175, 75}})
    QTest::mouseClick(&opened.Canvas(), Qt::LeftButton, {}, opened.Canvas().Window().ToScreen(point).toPoint());
  QTest::keyClick(&opened.Canvas(), Qt::Key_Return);
  EXPECT_TRUE(QTest::qWaitFor([&] { return opened.Canvas().Content().lines.size() == 1; }));
  EXPECT_FALSE(opened.Canvas().IsAsking());
}

TEST(DataViewer, ASetupOfTheResultViewerOpensAsItsResult) {
  const test::TempFolder folder;
  WriteFlow(folder.File("flow.nds2"));
  const std::string setup = folder.Write(
      "Flow.REV",
      "target QUARZEL_RESULT_VIEWER {\n  section RESULT_FILES {\n    DataFileName = 6, file \"flow.nds2\"\n"
      "    section PROPERTIES {\n      ItemNo = 2\n      section Quarzel_Palette_Definition {\n"
      "        RGB_Color_Value = 0, 0, 255, 2.5\n        RGB_Color_Value = 255, 0, 0, 5.0\n      }\n    }\n"
      "    DataFileName = 6, file \"flow.nds2\"\n    section PROPERTIES {\n      VectorDisplay = true\n"
      "      XItem = 1\n      YItem = 2\n    }\n  }\n}\n");
  OpenedFile opened(setup);
  ASSERT_TRUE(opened.isOpen);
  EXPECT_EQ(opened.viewer->Title(), "Flow.REV");
  ASSERT_TRUE(opened.Shows(0));
  EXPECT_EQ(opened.Canvas().Content().grids.front().grid->ItemName(), "Flow y");
  EXPECT_EQ(opened.Canvas().Content().grids.front().scale.size(), 2U);
  ASSERT_TRUE(opened.Canvas().Content().arrows);
  EXPECT_EQ(opened.Canvas().Content().arrows->strongest, 5);
  // Colours that the user chooses instead are kept for the quantity.
  auto* colors = opened.Named<QComboBox>("Colours");
  colors->setCurrentIndex(1);
  emit colors->activated(1);
  EXPECT_TRUE(QTest::qWaitFor([&] { return opened.Canvas().Content().grids.front().ramp == Ramp::VioletToYellow; }));
  // What the setup shows is gone: it is told, and comes back with the file.
  std::filesystem::rename(folder.File("flow.nds2"), folder.File("away.nds2"));
  opened.viewer->Reload(false);
  EXPECT_THAT(opened.viewer->Problem(), testing::HasSubstr("flow.nds2 is not there any more"));
  std::filesystem::rename(folder.File("away.nds2"), folder.File("flow.nds2"));
  opened.viewer->Reload(false);
  EXPECT_EQ(opened.viewer->Problem(), "");
}

}  // namespace
}  // namespace tervane::data_viewer_test
