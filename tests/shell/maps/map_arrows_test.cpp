// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/maps/map_arrows.h"

#include <cmath>

#include <gmock/gmock.h>

#include "shell/maps/map_palette.h"
#include "tests/shell/maps/shown_map.h"

namespace tervane::map_arrows_test {
namespace {

using test::Grid;
using test::kEmpty;

DrawnMap MapOf(double metresPerPixel, MapPoint centre = {500, 500}) {
  DrawnMap map;
  map.window = {QRectF(0, 0, 400, 400), centre, metresPerPixel};
  map.part = map.window.rect;
  return map;
}

ArrowLayer Flow(double rotation, float x, float y, int cells = 10) {
  const GridGeometry geometry{cells, cells, 100, 0, 0, rotation, {}};
  return {Grid(geometry, std::vector<float>(geometry.CellCount(), x)),
          Grid(geometry, std::vector<float>(geometry.CellCount(), y)), 5};
}

TEST(MapArrows, PointAsTheGridIsTurnedAndAreAsLongAsTheFlowIsStrong) {
  struct Row {
    double rotation;
    float x, y;
    double angle;  ///< Counter-clockwise from east, in degrees.
  };
  for (const Row& row : {Row{0, 3, 0, 0}, Row{0, 0, 3, 90}, Row{90, 3, 0, 90}, Row{30, 0, -3, -60}}) {
    const auto arrows = ArrowsOn(Flow(row.rotation, row.x, row.y), MapOf(5, {0, 0}));
    ASSERT_FALSE(arrows.empty());
    const QPointF along = arrows.front().to - arrows.front().from;
    EXPECT_NEAR(std::atan2(-along.y(), along.x()) * 180 / std::acos(-1.0), row.angle, 1e-6);
  }
  const auto length = [](float x) {
    const auto arrow = ArrowsOn(Flow(0, x, 0), MapOf(4)).front();
    return arrow.to.x() - arrow.from.x();
  };
  EXPECT_NEAR(length(4), 2 * length(2), 1e-6);
}

TEST(MapArrows, KeepApartAtAnyZoomAndStayAtTheirCells) {
  const ArrowLayer flow = Flow(0, 5, 0, 400);
  std::size_t before = 0;
  for (const double metres : {0.5, 4.0, 20.0, 100.0}) {
    const auto arrows = ArrowsOn(flow, MapOf(metres, {20'000, 20'000}));
    ASSERT_FALSE(arrows.empty());
    EXPECT_LE(arrows.size(), 400U) << metres;
    before = std::max(before, arrows.size());
    for (std::size_t i = 1; i < arrows.size(); ++i) {
      const QPointF apart = arrows[i].from - arrows[i - 1].from;
      EXPECT_GE(std::hypot(apart.x(), apart.y()), 20) << metres;
    }
  }
  EXPECT_GT(before, 50U);
  // Moved by a part of the way between two arrows, the same cells have them.
  const auto here = ArrowsOn(flow, MapOf(20, {20'000, 20'000})), there = ArrowsOn(flow, MapOf(20, {20'060, 20'000}));
  EXPECT_NEAR(std::fmod(here.front().from.x() - there.front().from.x() + 300, 30), 3, 1e-6);
}

TEST(MapArrows, WhereNothingFlowsNoneIsDrawn) {
  const DrawnMap map = MapOf(4);
  EXPECT_TRUE(ArrowsOn(Flow(0, 0, 0), map).empty());
  EXPECT_TRUE(ArrowsOn(Flow(0, kEmpty, 1), map).empty());
  ArrowLayer unknown = Flow(0, 1, 1);
  unknown.strongest = 0;
  EXPECT_TRUE(ArrowsOn(unknown, map).empty());
  unknown.strongest = 5;
  unknown.y = Flow(0, 1, 1, 3).y;
  EXPECT_TRUE(ArrowsOn(unknown, map).empty()) << "of another grid";
  const KeyArrow key = KeyOf(Flow(0, 1, 1), map, {});
  EXPECT_EQ(key.text.toStdString(), "5 m");
  EXPECT_GT(key.length, 10);
}

TEST(MapArrows, ScalesWithTheirOwnBordersAndDifferencesHaveTheirColours) {
  const auto grid = Grid({5, 1, 100, 0, 0, 0, {}}, {-3, 1, 1.5F, 2, 99});
  GridLayer layer{grid};
  layer.scale = {{1, 0x0000ff}, {2, 0x00ff00}, {4, 0xff0000}};
  const MapPalette scale = MapPalette::Of(layer, nullptr);
  const auto color = [](const MapPalette& palette, float value) {
    return palette.Colors()[palette.ColorNumber(value)] & 0xffffffU;
  };
  EXPECT_EQ(color(scale, -3), 0x0000ffU);
  EXPECT_EQ(color(scale, 1), 0x0000ffU) << "a class ends with its largest value";
  EXPECT_EQ(color(scale, 1.5F), 0x00ff00U);
  EXPECT_EQ(color(scale, 99), 0xff0000U);
  EXPECT_EQ(scale.ColorNumber(kEmpty), 0);
  EXPECT_EQ(scale.Legend().rows.front().text.toStdString(), "2 – 4");
  EXPECT_EQ(scale.Legend().rows.back().text.toStdString(), "up to 1");

  layer.scale.clear();
  layer.ramp = Ramp::Difference;
  layer.range = {-8, 8};
  const MapPalette difference = MapPalette::Of(layer, nullptr);
  const QColor low(color(difference, -7)), high(color(difference, 7));
  EXPECT_GT(low.blue(), low.red());
  EXPECT_GT(high.red(), high.blue());
  // Lightness grows by equal steps.
  double before = -1;
  for (double part = 0; part <= 1; part += 0.125) {
    const QColor mixed(RampColor(part, Ramp::VioletToYellow));
    const double light = 0.2126 * mixed.redF() + 0.7152 * mixed.greenF() + 0.0722 * mixed.blueF();
    EXPECT_GT(light, before);
    before = light;
  }
}

}  // namespace
}  // namespace tervane::map_arrows_test
