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

/// Lines of a network or a boundary, in pieces with rectangles around them.
class LinePicture {
 public:
  /// A place on a line.
  struct Place {
    std::size_t line = 0;
    double chainage = 0;
  };

  /// `units` are the user's.
  LinePicture(LineLayer layer, const DisplayUnits& units);

  const LineLayer& Layer() const { return layer_; }
  const std::optional<Envelope>& Area() const { return area_; }
  /// The colours of values; without rows where lines are not painted by them.
  const LegendBlock& Legend() const { return colors_.Legend(); }
  const ValueColors& Colors() const { return colors_; }
  void Draw(QPainter& painter, const DrawnMap& map) const;
  /// Names of lines, and chainages of points where these are wanted.
  void DrawLabels(QPainter& painter, const DrawnMap& map, LabelPlaces& places) const;
  /// The nearest line within `reach` metres.
  std::optional<Place> At(MapPoint place, double reach) const;

 private:
  /// Some successive points of a line.
  struct Piece {
    std::size_t line = 0, first = 0, count = 0;
    Envelope around;
  };

  const MapLine& Line(std::size_t number) const { return (*layer_.lines)[number]; }
  bool StandsOut(std::size_t line) const { return layer_.highlighted.IsOf(line, Line(line).name); }
  double ChainageAt(const MapLine& line, std::size_t segment, MapPoint place) const;
  /// Points of the network stand so many pixels apart at this scale.
  bool HasRoomForPoints(const DrawnMap& map, double pixels) const;
  double EstimatedSegments(const DrawnMap& map) const;
  void DrawPoints(QPainter& painter, const DrawnMap& map, const std::vector<Piece>& seen) const;

  LineLayer layer_;
  std::vector<Piece> pieces_;
  std::optional<Envelope> area_;
  double length_ = 0, spacing_ = 0;  ///< Metres of all lines, and between points on an average.
  ValueColors colors_;
};

}  // namespace tervane
