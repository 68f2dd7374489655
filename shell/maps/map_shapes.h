// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QPainter>
#include <optional>
#include <vector>

#include "forms/plots.h"
#include "shell/maps/map_drawing.h"
#include "shell/maps/map_labels.h"
#include "shell/maps/map_palette.h"

namespace tervane {

/// Shapes with the rectangles around them.
class ShapePicture {
 public:
  explicit ShapePicture(ShapeLayer layer);

  const ShapeLayer& Layer() const { return layer_; }
  /// Around all shapes; nothing when there are none.
  const std::optional<Envelope>& Area() const { return area_; }
  bool ArePoints() const;
  /// The colours of values; without rows where polygons are not filled.
  const LegendBlock& Legend() const { return legend_; }
  void Draw(QPainter& painter, const DrawnMap& map) const;
  /// The values of polygons, where they fit.
  void DrawLabels(QPainter& painter, const DrawnMap& map, LabelPlaces& places) const;
  /// The topmost shape at a place, lines and points within `reach` metres.
  std::optional<std::size_t> At(MapPoint place, double reach) const;

 private:
  /// Where a polygon is widest, for its name.
  struct Room {
    MapPoint middle;
    double width = 0;
  };

  void MakeColors();
  Room RoomIn(std::size_t place) const;
  void DrawOutlines(QPainter& painter, const DrawnMap& map) const;
  void DrawFills(QPainter& painter, const DrawnMap& map) const;
  void DrawPoints(QPainter& painter, const DrawnMap& map) const;

  ShapeLayer layer_;
  std::vector<std::optional<Envelope>> around_;
  std::optional<Envelope> area_;
  std::vector<bool> standsOut_;
  std::vector<std::size_t> colorOf_;  ///< Of each shape, by its place in the legend's colours; of filled polygons.
  std::vector<QColor> colors_;
  std::vector<Room> rooms_;
  LegendBlock legend_;
};

}  // namespace tervane
