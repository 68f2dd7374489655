// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/maps/map_export.h"

#include <QDragEnterEvent>
#include <QDropEvent>
#include <QMimeData>
#include <QUrl>

#include <gmock/gmock.h>

#include "data/datafile.h"
#include "data/raster_file.h"
#include "shell/maps/map_canvas.h"
#include "shell/relief/relief_canvas.h"
#include "shell/relief/relief_window.h"
#include "shell/widgets/qt_text.h"
#include "tests/shell/maps/shown_map.h"
#include "tests/support/temp_folder.h"

namespace tervane::map_export_test {
namespace {

using test::Counting;
using test::ShownMap;

constexpr Envelope kArea{1000, 2000, 1400, 2200};

/// 4 x 2 cells of 100 m over the area.
const GridGeometry kGeometry{4, 2, 100, 1000, 2000, 0, {}};

MapContent OfGrid() {
  MapContent map;
  map.grids.push_back({Counting(kGeometry)});
  return map;
}

TEST(MapExport, APictureFillsItsAreaAndTellsItsPlace) {
  ShownMap map(OfGrid());
  const test::TempFolder folder;
  const QImage picture = map.Canvas().AreaPicture(kArea, {40, 20});
  ASSERT_TRUE(WritePlacedPicture(folder.File("map.png"), picture, kArea).Ok());
  for (const char* place : {"map.pgw", "map.pnw"})
    EXPECT_EQ(test::ReadFile(folder.File(place)), "10\n0\n0\n-10\n1005\n2195\n") << place;
  const QImage read(ToQt(folder.File("map.png")));
  ASSERT_EQ(read.size(), QSize(40, 20));
  // The middles of the cells, the lower left one being 0.
  const auto colorOf = [&](int i, int j) { return read.pixel(5 + 10 * i, 15 - 10 * j); };
  for (int i = 0; i < 4; ++i)
    for (int j = 0; j < 2; ++j) EXPECT_EQ(colorOf(i, j) == colorOf(0, 0), i == 0 && j == 0) << i << " " << j;
  // The map beside it is left as it was.
  EXPECT_NEAR(map.Canvas().Window().centre.x, 1200, 1);
  EXPECT_EQ(qAlpha(map.Canvas().AreaPicture({5000, 5000, 5100, 5100}, {4, 4}).pixel(1, 1)), 0);
}

TEST(MapExport, ValuesBecomeAGeoTiffWithEmptyCells) {
  std::vector<float> values{1, 2, 3, 4, 5, test::kEmpty, 7, 8};
  const test::TempFolder folder;
  ASSERT_TRUE(WriteValues(folder.File("values.tif"), *test::Grid(kGeometry, values)).Ok());
  RasterFile raster;
  ASSERT_EQ(raster.Open(folder.File("values.tif")), "");
  EXPECT_EQ(raster.Facts().geometry.x0, 1000);
  EXPECT_EQ(raster.Facts().bands.front().itemType, test::kElevation);
  std::vector<float> read(8);
  ASSERT_EQ(raster.Read(1, {0, 0, 4, 2}, read), "");
  values[5] = kDeleteValue;
  EXPECT_EQ(read, values);
}

TEST(MapExport, TheMapLiesOnItsGroundInThreeDimensions) {
  ShownMap map(OfGrid());
  SectionContent ground;
  ground.ground = Level{Counting({8, 4, 50, 1000, 2000, 0, {}})};
  ground.surfaces.push_back({"Sand", {nullptr, -20.0}});
  map.View().SetGround([&ground] { return ground; });
  const std::unique_ptr<ReliefWindow> window(map.View().OpenRelief());
  window->setAttribute(Qt::WA_DeleteOnClose, false);
  ASSERT_TRUE(QTest::qWaitFor([&] { return window->View().Canvas().Shown() != nullptr; }));
  const Relief& relief = *window->View().Canvas().Shown();
  ASSERT_EQ(relief.bodies.size(), 2U);
  EXPECT_TRUE(relief.bodies[0].isShown);
  ASSERT_TRUE(relief.bodies[0].drape);
  EXPECT_GT(relief.bodies[0].drape->pixels.front() >> 24U, 200U);
  EXPECT_EQ(relief.bodies[0].top.back(), 31);
}

TEST(MapExport, CellsHaveLinesWhereTheyAreLargeEnough) {
  ShownMap map(OfGrid());
  const auto whole = [&map] { return map.Canvas().AreaPicture(kArea, {400, 200}); };
  const auto coarse = [&map] { return map.Canvas().AreaPicture(kArea, {8, 4}); };
  const QImage before = whole(), small = coarse();
  map.Canvas().SetCellLines(kGeometry);
  EXPECT_NE(whole().pixel(100, 50), before.pixel(100, 50)) << "between two cells";
  EXPECT_EQ(whole().pixel(150, 50), before.pixel(150, 50)) << "within a cell";
  EXPECT_EQ(coarse(), small) << "a veil of lines";
}

TEST(MapExport, LayersOfTheBackdropAreToldInTheLegend) {
  MapContent content = OfGrid();
  ShapeLayer shapes{.shapes = test::Square(1000, 1400, 1100, 1200), .style = ShapeStyle{.lineColor = 0x2060a0}};
  content.above.push_back({"Shape: lakes.shp", std::move(shapes)});
  ShownMap map(std::move(content));
  const auto hasColor = [&map] {
    const QImage picture = map.Canvas().Picture(1);
    const QRect right(picture.width() * 3 / 4, 0, picture.width() / 4, picture.height());
    for (int y = right.top(); y < right.bottom(); ++y)
      for (int x = right.left(); x < right.right(); ++x)
        if (QColor(picture.pixel(x, y)) == QColor(0x20, 0x60, 0xa0)) return true;
    return false;
  };
  map.Canvas().SetLayersInLegend(false);
  EXPECT_FALSE(hasColor());
  map.Canvas().SetLayersInLegend(true);
  EXPECT_TRUE(hasColor());
}

TEST(MapExport, FilesThatAreWantedCanBeDropped) {
  ShownMap map(OfGrid());
  std::vector<std::string> dropped;
  map.View().TakeDrops([](const std::string& path) { return path.ends_with(".shp"); },
                       [&dropped](const std::vector<std::string>& paths) { dropped = paths; });
  const auto drop = [&map](const QString& path) {
    QMimeData data;
    data.setUrls({QUrl::fromLocalFile(path)});
    QDragEnterEvent enter({10, 10}, Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
    enter.ignore();
    QApplication::sendEvent(&map.View(), &enter);
    if (!enter.isAccepted()) return false;
    QDropEvent event({10, 10}, Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
    QApplication::sendEvent(&map.View(), &event);
    return true;
  };
  EXPECT_FALSE(drop("/data/notes.txt"));
  EXPECT_TRUE(dropped.empty());
  EXPECT_TRUE(drop("/data/lakes.shp"));
  EXPECT_THAT(dropped, testing::ElementsAre("/data/lakes.shp"));
}

}  // namespace
}  // namespace tervane::map_export_test
