// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/maps/map_view.h"

#include <QTest>
#include <cmath>
#include <numbers>

#include <gmock/gmock.h>

#include "shell/maps/map_canvas.h"
#include "shell/maps/map_palette.h"
#include "shell/widgets/theme.h"
#include "tests/shell/maps/shown_map.h"
#include "tests/shell/plot_events.h"

namespace tervane::map_view_test {
namespace {

using test::Wheel;
using testing::ElementsAre;
using testing::HasSubstr;

using test::Counting;
using test::Grid;
using test::kElevation;
using test::kEmpty;
using test::ShownMap;
using test::Square;

TEST(MapView, ClassesHaveBordersAtNumbersThatPeopleLike) {
  EXPECT_THAT(ClassBorders(193, 4292.8), ElementsAre(0, 500, 1000, 1500, 2000, 2500, 3000, 3500, 4000, 4500));
  EXPECT_THAT(ClassBorders(-3, 3), ElementsAre(-3, -2, -1, 0, 1, 2, 3));
  EXPECT_THAT(ClassBorders(7, 7), ElementsAre(7));
  for (double low = -1000; low < 1000; low += 37.7) {
    for (double size = 1e-2; size < 1e9; size *= 1.7) {
      const std::vector<double> borders = ClassBorders(low, low + size);
      ASSERT_GE(borders.size(), 6U) << low << " " << size;
      ASSERT_LE(borders.size(), 11U) << low << " " << size;
      ASSERT_LE(borders.front(), low + 1e-5 * size);
      ASSERT_GE(borders.back(), low + size - 1e-5 * size);
    }
  }
}

TEST(MapView, AValueOnABorderHasTheColourOfTheClassAboveInTheUsersUnit) {
  DisplayUnits feet;
  feet.Choose(kElevation, 1003);
  const auto grid = Grid({4, 1, 100, 0, 0, 0, {}}, {0, 0.3048F * 100, 0.3048F * 1000, 0.3048F * 99.9F});
  const MapPalette palette = MapPalette::Of({grid}, &feet);
  EXPECT_EQ(palette.Legend().rows.back().text.toStdString(), "0 – 100");
  EXPECT_EQ(palette.Legend().rows.front().text.toStdString(), "900 – 1000");
  EXPECT_EQ(palette.ColorNumber(0.3048F * 99.9F), 1);
  EXPECT_EQ(palette.ColorNumber(0.3048F * 100), 2);
  EXPECT_EQ(palette.ColorNumber(0.3048F * 1000), 10);
  EXPECT_EQ(palette.ColorNumber(kEmpty), 0);
  // A few wild values leave the others their classes.
  std::vector<float> values(10'000);
  for (std::size_t i = 0; i < values.size(); ++i) values[i] = static_cast<float>(i % 100);
  values[17] = 1e6F;
  EXPECT_THAT(
      MapPalette::Of({Grid({100, 100, 1, 0, 0, 0, {}}, values)}, nullptr).Legend().rows.front().text.toStdString(),
      HasSubstr("above 90"));
}

TEST(MapView, TheLegendOfCodesTellsThemAll) {
  std::vector<float> codes;
  for (int i = 0; i < 300; ++i) codes.push_back(static_cast<float>(i + 7));
  const MapPalette palette = MapPalette::Of({Grid({300, 1, 1, 0, 0, 0, {}}, codes), true}, nullptr);
  EXPECT_EQ(palette.Legend().rows.size(), 300U);
  EXPECT_EQ(palette.Legend().rows[3].text.toStdString(), "10");
  EXPECT_EQ(palette.Legend().hidden, 0U);
  EXPECT_EQ(QColor(palette.Colors()[palette.ColorNumber(10)]), palette.Legend().rows[3].color);
  for (int i = 0; i < 300; ++i) EXPECT_NE(palette.ColorNumber(static_cast<float>(i + 7)), 0);
}

TEST(MapView, CellsOfATurnedGridStandWhereTheyMust) {
  for (const double rotation : {0.0, 90.0, 30.0, -120.0}) {
    SCOPED_TRACE(rotation);
    const auto grid = Grid({3, 2, 100, 5000, 7000, rotation, {}}, {11, 12, 13, 21, kEmpty, 23});
    MapContent content;
    content.grids = {{grid, true}};
    ShownMap map(std::move(content));
    const MapPalette palette = MapPalette::Of({grid, true}, nullptr);
    const QColor paper = map.Canvas().palette().color(QPalette::Base);
    const double angle = rotation * std::numbers::pi / 180;
    // A little inside of each cell's left and right edge, and a little outside of the grid.
    for (const double u : {-0.02, 0.02, 0.98, 1.02, 1.98, 2.02, 2.98, 3.02}) {
      for (int j = 0; j < 2; ++j) {
        const double x = 100 * u, y = 100 * (j + 0.5);
        const MapPoint place{5000 + x * std::cos(angle) - y * std::sin(angle),
                             7000 + x * std::sin(angle) + y * std::cos(angle)};
        const bool isOnGrid = u > 0 && u < 3;
        const std::uint8_t number = isOnGrid ? palette.ColorNumber(grid->Value(static_cast<int>(u), j)) : 0;
        const QColor expected = number ? QColor(palette.Colors()[number]) : paper;
        EXPECT_EQ(map.ColorAt(place), expected) << u << " " << j;
      }
    }
  }
}

TEST(MapView, ASingleCellOfACodeIsSeenFromAfar) {
  constexpr std::size_t kSide = 1500;
  std::vector<float> codes(kSide * kSide, 1);
  codes[777 * kSide + 1234] = 2;
  const auto grid = Grid({kSide, kSide, 10, 0, 0, 12, {}}, codes);
  MapContent content;
  content.grids = {{grid, true}};
  ShownMap map(std::move(content));
  const QColor color = MapPalette::Of({grid, true}, nullptr).Legend().rows[1].color;
  const MapPoint cell = grid->CellCentre(1234, 777);
  const QImage picture = map.Canvas().grab().toImage();
  const QPoint at = map.At(cell).toPoint();
  bool isSeen = false;
  for (int dx = -2; dx <= 2; ++dx)
    for (int dy = -2; dy <= 2; ++dy) isSeen = isSeen || picture.pixelColor(at + QPoint(dx, dy)) == color;
  EXPECT_TRUE(isSeen);
}

TEST(MapView, TheStatusLineTellsPlaceCellAndValueInTheUsersUnits) {
  MapContent content;
  content.grids = {{Counting({40, 30, 1000, 300000, 5000000, 0, {}})}};
  ShownMap map(content);
  EXPECT_THAT(map.View().Status().toStdString(), HasSubstr("40 × 30 cells of 1000 m"));
  const std::string text = map.TextAt({312500, 5007500});
  EXPECT_THAT(text, testing::MatchesRegex("x 3124..|x 3125..  y 5007...   cell 12, 7   292 m"));
  DisplayUnits units;
  units.Choose(kElevation, 1003);
  map.View().Show(content, &units);
  EXPECT_THAT(map.TextAt({312500, 5007500}), HasSubstr("cell 12, 7   958.005 ft"));
  EXPECT_THAT(map.TextAt({299990, 5007500}), testing::Not(HasSubstr("cell")));
}

TEST(MapView, TheWheelKeepsThePlaceUnderThePointerAndADoubleClickShowsEverything) {
  MapContent content;
  content.grids = {{Counting({40, 30, 1000, 300000, 5000000, 25, {}})}};
  ShownMap map(std::move(content));
  const double whole = map.Canvas().Window().metresPerPixel;
  const QPointF pointer(150, 120);
  const MapPoint place = map.Canvas().Window().ToMap(pointer);
  for (const int notches : {3, -1, 5, -9}) {
    Wheel(map.Canvas(), pointer, notches);
    const MapPoint now = map.Canvas().Window().ToMap(pointer);
    EXPECT_NEAR(now.x, place.x, 1e-6);
    EXPECT_NEAR(now.y, place.y, 1e-6);
  }
  EXPECT_GT(map.Canvas().Window().metresPerPixel, whole);
  QTest::mouseDClick(&map.Canvas(), Qt::LeftButton, {}, {200, 200});
  EXPECT_DOUBLE_EQ(map.Canvas().Window().metresPerPixel, whole);
  // A box with Shift: what is in it is seen afterwards, and no more than its shape asks for.
  const QPoint from(200, 150), to(300, 200);
  const MapPoint middle = map.Canvas().Window().ToMap({250, 175});
  QTest::mousePress(&map.Canvas(), Qt::LeftButton, Qt::ShiftModifier, from);
  QTest::mouseMove(&map.Canvas(), to);
  QTest::mouseRelease(&map.Canvas(), Qt::LeftButton, Qt::ShiftModifier, to);
  EXPECT_NEAR(map.Canvas().Window().centre.x, middle.x, 1e-6);
  EXPECT_NEAR(map.Canvas().Window().centre.y, middle.y, 1e-6);
  EXPECT_LT(map.Canvas().Window().metresPerPixel, whole / 4);
}

TEST(MapView, AClickPicksCellAndShapeAndADragDoesNot) {
  std::vector<MapPick> picks;
  MapContent content;
  content.grids = {{Counting({10, 10, 100, 0, 0, 0, {}})}};
  content.shapes = {{Square(200, 900, 400, 600)}};
  content.picked = [&picks](const MapPick& pick) { picks.push_back(pick); };
  ShownMap map(std::move(content));
  const auto click = [&](MapPoint place) {
    QTest::mouseClick(&map.Canvas(), Qt::LeftButton, {}, map.At(place).toPoint());
  };
  click({350, 250});
  click({550, 550});   // in the hole
  click({1010, 500});  // beside the grid
  ASSERT_EQ(picks.size(), 3U);
  EXPECT_EQ(picks[0].cell, std::pair(3, 2));
  EXPECT_EQ(picks[0].value, 23);
  EXPECT_EQ(picks[0].shape, 0U);
  EXPECT_EQ(picks[1].cell, std::pair(5, 5));
  EXPECT_EQ(picks[1].shape, std::nullopt);
  EXPECT_EQ(picks[2].cell, std::nullopt);
  EXPECT_THAT(map.TextAt({350, 250}), HasSubstr("shape 1: Skjern"));

  const MapPoint before = map.Canvas().Window().centre;
  QTest::mousePress(&map.Canvas(), Qt::LeftButton, {}, {300, 200});
  QTest::mouseMove(&map.Canvas(), {340, 230});
  QTest::mouseRelease(&map.Canvas(), Qt::LeftButton, {}, {340, 230});
  EXPECT_EQ(picks.size(), 3U);
  EXPECT_NEAR(map.Canvas().Window().centre.x, before.x - 40 * map.Canvas().Window().metresPerPixel, 1e-9);
}

TEST(MapView, TheDomainIsDrawnOverTheGridAndNobodyPointsAtIt) {
  MapContent content;
  content.grids = {{Counting({10, 10, 100, 0, 0, 0, {}})}};
  ShownMap map(content);
  const MapWindow before = map.Canvas().Window();
  // The line is finer than a pixel.
  const auto hasLine = [&map] {
    const QImage picture = map.Picture();
    const QPoint at = map.At({200, 500}).toPoint();
    for (int dx = -2; dx <= 2; ++dx) {
      const QColor color = picture.pixelColor(at + QPoint(dx, 0)), line = DomainColor(false);
      if (std::abs(color.red() - line.red()) + std::abs(color.green() - line.green()) +
              std::abs(color.blue() - line.blue()) <
          120)
        return true;
    }
    return false;
  };
  EXPECT_FALSE(hasLine());
  content.domain = Square(200, 5000, 400, 600);
  map.View().Show(content, nullptr);
  EXPECT_TRUE(hasLine());
  EXPECT_EQ(map.Canvas().Window().metresPerPixel, before.metresPerPixel) << "the grid fills the frame";
  EXPECT_THAT(map.TextAt({350, 250}), testing::Not(HasSubstr("shape")));
}

TEST(MapView, TheSameContentLeavesThePictureAndAnotherGridKeepsThePlace) {
  const GridGeometry geometry{10, 10, 100, 0, 0, 0, {}};
  MapContent content;
  content.grids = {{Counting(geometry)}};
  ShownMap map(content);
  map.Canvas().Zoom(4);
  const double zoomed = map.Canvas().Window().metresPerPixel;
  const QColor before = map.ColorAt({525, 525});
  map.View().Show(content, nullptr);
  EXPECT_EQ(map.Canvas().Window().metresPerPixel, zoomed);
  content.grids = {{Counting(geometry)}};
  LetStandOut(content, {.code = 12.0F});
  map.View().Show(content, nullptr);
  EXPECT_EQ(map.Canvas().Window().metresPerPixel, zoomed);
  EXPECT_NE(map.ColorAt({525, 525}), before);
  content.grids = {{Counting({10, 10, 200, 0, 0, 0, {}})}};
  map.View().Show(content, nullptr);
  EXPECT_GT(map.Canvas().Window().metresPerPixel, 2 * zoomed);
}

TEST(MapView, NothingToShowShowsItsMessage) {
  MapContent content, other;
  content.message = "The file maps/dem.nds2 cannot be read.";
  other.message = "-";
  ShownMap map(content);
  const QImage picture = map.Canvas().grab().toImage();
  map.View().Show(other, nullptr);
  EXPECT_NE(picture, map.Canvas().grab().toImage());
  Wheel(map.Canvas(), {100, 100}, 1);
  QTest::mouseClick(&map.Canvas(), Qt::LeftButton, {}, {100, 100});
  EXPECT_EQ(map.TextAt({}), "");
}

}  // namespace
}  // namespace tervane::map_view_test
