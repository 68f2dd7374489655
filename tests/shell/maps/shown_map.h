// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A map on the screen, and small things to show on it.
#pragma once

#include <QTest>
#include <memory>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "shell/maps/map_canvas.h"
#include "shell/maps/map_view.h"
#include "tests/shell/plot_events.h"

namespace tervane::test {

inline constexpr int kElevation = 100180;
inline constexpr float kEmpty = -9999;

inline std::shared_ptr<const CTvn2DOrthoRotatedGridData> Grid(GridGeometry geometry, std::vector<float> values,
                                                              int itemType = kElevation, int unit = 1000) {
  auto grid = std::make_shared<CTvn2DOrthoRotatedGridData>();
  EXPECT_EQ(grid->TakeValues(geometry, std::move(values), kEmpty, unit, itemType), "");
  return grid;
}

/// 0, 1, 2, ... along the rows from the south.
inline std::shared_ptr<const CTvn2DOrthoRotatedGridData> Counting(const GridGeometry& geometry) {
  std::vector<float> values(geometry.CellCount());
  for (std::size_t i = 0; i < values.size(); ++i) values[i] = static_cast<float>(i);
  return Grid(geometry, std::move(values));
}

inline std::shared_ptr<const CYbShapeData> Square(double from, double to, double holeFrom, double holeTo,
                                                  const std::string& name = "Skjern") {
  auto shapes = std::make_shared<CTvnShapeData>();
  shapes->Create(ShapeKind::Polygon, {{"NAME", AttributeKind::Text}}, {});
  Shape shape;
  shape.points = {{from, from},         {from, to},         {to, to},         {to, from},         {from, from},
                  {holeFrom, holeFrom}, {holeTo, holeFrom}, {holeTo, holeTo}, {holeFrom, holeTo}, {holeFrom, holeFrom}};
  shape.parts = {0, 5};
  shape.values = {name};
  shapes->AddShape(shape);
  return shapes;
}

/// A map on the screen, worked as a user works it.
class ShownMap {
 public:
  explicit ShownMap(MapContent content, const DisplayUnits* units = nullptr) : view_(host_) {
    view_.resize(700, 500);
    view_.Show(std::move(content), units);
    view_.show();
    Canvas().WaitUntilReady();
    QApplication::processEvents();
  }
  MapView& View() { return view_; }
  MapCanvas& Canvas() { return view_.Canvas(); }
  QPointF At(MapPoint place) { return Canvas().Window().ToScreen(place); }
  QColor ColorAt(MapPoint place) { return Canvas().grab().toImage().pixelColor(At(place).toPoint()); }
  QImage Picture() { return Canvas().grab().toImage(); }
  void Click(MapPoint place) { QTest::mouseClick(&Canvas(), Qt::LeftButton, {}, At(place).toPoint()); }
  std::string TextAt(MapPoint place) {
    Hover(Canvas(), At(place));
    return view_.Status().toStdString();
  }

 private:
  NobodyToAsk host_;
  MapView view_;
};

}  // namespace tervane::test
