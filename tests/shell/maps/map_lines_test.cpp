// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/maps/map_lines.h"

#include <cmath>
#include <random>

#include <gmock/gmock.h>

#include "tests/shell/maps/shown_map.h"

namespace tervane::map_lines_test {
namespace {

using test::ShownMap;
using testing::HasSubstr;

/// A river of 500 points that goes east in waves, with a short one that joins it.
std::shared_ptr<const std::vector<MapLine>> Rivers() {
  auto lines = std::make_shared<std::vector<MapLine>>(2);
  MapLine &river = (*lines)[0], &brook = (*lines)[1];
  river.name = "Skjern";
  for (int i = 0; i < 500; ++i) {
    river.points.push_back({i * 20.0, 3000 + 800 * std::sin(i / 40.0)});
    river.chainages.push_back(1000 + 25.0 * i);
  }
  brook.name = "Brook";
  brook.points = {{6000, 6000}, {6000, 4500}, {7000, 4500}};
  return lines;
}

TEST(MapLines, ALineTellsItsNameAndChainageUnderThePointer) {
  MapContent content;
  content.lines = {{Rivers()}};
  MapPick last;
  content.picked = [&](const MapPick& pick) { last = pick; };
  ShownMap map(content);
  const MapPoint place = (*content.lines[0].lines)[0].points[200];
  EXPECT_THAT(map.TextAt(place), testing::ContainsRegex("Skjern, chainage 6[0-9][0-9][0-9] m"));
  map.Click(place);
  EXPECT_EQ(last.line, 0U);
  EXPECT_NEAR(last.chainage, 6000, 2 * map.Canvas().Window().metresPerPixel * 1.25);
  // Without chainages it counts from the first point, around corners.
  map.Click({6400, 4500});
  EXPECT_EQ(last.line, 1U);
  EXPECT_NEAR(last.chainage, 1900, 2 * map.Canvas().Window().metresPerPixel);
  map.Click({3000, 5500});
  EXPECT_EQ(last.line, std::nullopt);
}

TEST(MapLines, AMapThatWasMovedLooksAsIfItWereDrawnAnew) {
  MapContent content;
  content.lines = {{Rivers()}};
  content.lines[0].withPoints = true;
  content.shapes = {{test::Square(1000, 5000, 2000, 4000)}};
  content.shapes[0].isFilled = true;
  ShownMap map(content);
  map.Canvas().Zoom(3);
  map.Picture();
  std::mt19937 random(7);
  std::uniform_int_distribution<int> pixels(-90, 90);
  for (int i = 0; i < 20; ++i) {
    map.Canvas().Pan({static_cast<double>(pixels(random)), static_cast<double>(pixels(random))});
    const QImage moved = map.Picture();
    const double pixelRatio = map.Canvas().devicePixelRatioF();
    const QImage anew = map.Canvas().Picture(pixelRatio);
    int differing = 0;
    for (int y = 0; y < moved.height(); ++y)
      for (int x = 0; x < moved.width(); ++x) {
        const QColor a = moved.pixelColor(x, y), b = anew.pixelColor(x, y);
        differing += std::abs(a.red() - b.red()) + std::abs(a.green() - b.green()) + std::abs(a.blue() - b.blue()) > 60;
      }
    // Points that melt into one may be others where a piece begins elsewhere.
    ASSERT_LT(differing, 30) << "after move " << i;
  }
}

TEST(MapLines, PiecesOfABoundaryHaveTheColoursOfTheirValues) {
  auto pieces = std::make_shared<std::vector<MapLine>>();
  const std::optional<double> values[] = {1.0, 2.0, 7.0, std::nullopt};
  for (int i = 0; i < 4; ++i) pieces->push_back({{}, {{i * 1000.0, 0}, {i * 1000.0 + 1000, 0}}, {}, values[i]});
  MapContent content;
  content.lines = {{pieces}};
  content.lines[0].painted = ValueScale{"Boundary type", {{1, "Fixed Head"}, {2, "Flux"}}};
  content.area = Envelope{0, -1000, 4000, 1000};
  ShownMap map(content);
  const LinePicture lines(content.lines[0], {});
  ASSERT_EQ(lines.Legend().rows.size(), 3U);
  EXPECT_EQ(lines.Legend().rows[1].text.toStdString(), "Flux");
  EXPECT_EQ(lines.Legend().rows[2].text.toStdString(), "others");
  for (int i = 0; i < 4; ++i)
    EXPECT_EQ(map.ColorAt({i * 1000.0 + 500, 0}), lines.Legend().rows[static_cast<std::size_t>(std::min(i, 2))].color)
        << i;
  EXPECT_THAT(map.TextAt({1500, 0}), HasSubstr("Flux"));
  // A scale is told in the user's unit.
  content.lines[0].painted = ValueScale{"Head", {}, test::kElevation, 1000};
  DisplayUnits feet;
  feet.Choose(test::kElevation, 1003);
  const LinePicture scaled(content.lines[0], feet);
  EXPECT_EQ(scaled.Legend().title.toStdString(), "Head [ft]");
  EXPECT_THAT(scaled.Legend().rows.front().text.toStdString(), HasSubstr("25"));
  // What stands out lies above.
  LetStandOut(content, {.place = 1});
  map.View().Show(content, nullptr);
  EXPECT_EQ(map.ColorAt({1500, 0}), kHighlightColor);
}

}  // namespace
}  // namespace tervane::map_lines_test
