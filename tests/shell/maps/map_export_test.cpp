// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/maps/map_export.h"

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

}  // namespace
}  // namespace tervane::map_export_test
