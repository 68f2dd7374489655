// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/maps/map_labels.h"

#include <algorithm>

#include <gmock/gmock.h>

#include "tests/shell/maps/shown_map.h"

namespace tervane::map_labels_test {
namespace {

using test::ShownMap;
using testing::HasSubstr;

TEST(MapLabels, NamesOfNeighboursEvadeEachOtherUntilNoPlaceIsLeft) {
  QImage picture(300, 200, QImage::Format_RGB32);
  picture.fill(Qt::white);
  QPainter painter(&picture);
  const DrawnMap map{{}, picture.rect()};
  // How many points get their name.
  const auto named = [&](const std::vector<QPointF>& markers) {
    LabelPlaces places(picture.rect());
    for (const QPointF at : markers) places.Take({at.x() - 4, at.y() - 4, 8, 8});
    return std::ranges::count_if(markers, [&](QPointF at) { return places.DrawAround(painter, at, 4, "Well", map); });
  };
  EXPECT_EQ(named({{150, 100}}), 1);
  EXPECT_EQ(named({{150, 100}, {164, 100}, {157, 118}}), 3);
  std::vector<QPointF> crowd;
  for (int x = 0; x < 5; ++x)
    for (int y = 0; y < 5; ++y) crowd.emplace_back(150 + 9 * x, 80 + 9 * y);
  EXPECT_LT(named(crowd), 20);
  // A name never leaves the map.
  LabelPlaces narrow(QRectF(0, 0, 30, 200));
  EXPECT_FALSE(narrow.DrawAround(painter, {15, 100}, 4, "A well with a long name", map));
}

TEST(MapLabels, AMarkerHoldsItsNumberAndTellsItsNameUnderThePointer) {
  MapContent content;
  content.points = {{{{0, 0}, {1000, 0}, {500, 800}}, {"North", "South", ""}, true}};
  MapPick last;
  content.picked = [&](const MapPick& pick) { last = pick; };
  ShownMap map(content);
  EXPECT_THAT(map.TextAt({1000, 0}), HasSubstr("point 2: South"));
  map.Click({500, 800});
  EXPECT_EQ(last.point, 2U);
  map.Click({300, 400});
  EXPECT_EQ(last.point, std::nullopt);
  // One that stands out has another colour, by its place or its name.
  for (const Highlight& highlight : {Highlight{.place = 1}, Highlight{.name = "South"}}) {
    LetStandOut(content, highlight);
    map.View().Show(content, nullptr);
    const QImage picture = map.Picture();
    const auto hasColor = [&](MapPoint place) {
      const QPoint at = map.At(place).toPoint();
      for (int dx = -7; dx <= 7; ++dx)
        for (int dy = -7; dy <= 7; ++dy)
          if (picture.pixelColor(at + QPoint(dx, dy)) == kHighlightColor) return true;
      return false;
    };
    EXPECT_TRUE(hasColor({1000, 0}));
    EXPECT_FALSE(hasColor({0, 0}));
  }
}

TEST(MapLabels, PolygonsOfOneValueHaveOneColourAndBearItWhereItFits) {
  auto shapes = std::make_shared<CTvnShapeData>();
  shapes->Create(ShapeKind::Polygon, {{"SOIL", AttributeKind::Text}}, {});
  const auto add = [&](double x, double y, double side, const char* value) {
    Shape shape;
    shape.points = {{x, y}, {x, y + side}, {x + side, y + side}, {x + side, y}, {x, y}};
    shape.parts = {0};
    shape.values = {std::string(value)};
    shapes->AddShape(shape);
  };
  add(0, 0, 1000, "Sand");
  add(1500, 0, 1000, "Clay");
  add(3000, 0, 1000, "Sand");
  add(4500, 0, 60, "Peat");
  MapContent content;
  content.shapes = {{shapes}};
  content.shapes[0].isFilled = true;
  ShownMap map(content);
  const QColor sand = map.ColorAt({200, 200});
  EXPECT_EQ(map.ColorAt({3200, 200}), sand);
  EXPECT_NE(map.ColorAt({1700, 200}), sand);
  const QImage plain = map.Picture();
  content.shapes[0].withLabels = true;
  map.View().Show(content, nullptr);
  const QImage labelled = map.Picture();
  const auto differs = [&](MapPoint from, MapPoint to) {
    const QRect part = QRectF(map.At(from), map.At(to)).normalized().toRect();
    return plain.copy(part) != labelled.copy(part);
  };
  EXPECT_TRUE(differs({100, 100}, {900, 900}));
  EXPECT_TRUE(differs({1600, 100}, {2400, 900}));
  EXPECT_FALSE(differs({4300, -300}, {4700, 300}));
}

}  // namespace
}  // namespace tervane::map_labels_test
