// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The values of grids along a line of the map.
#pragma once

#include <vector>

#include "geometry/grid.h"

namespace tervane {

/// A point of a line, with its distance from the line's start in metres.
struct SectionPoint {
  double distance = 0;
  MapPoint place;

  bool operator==(const SectionPoint&) const = default;
};

/// The most points that a line is cut into; a step that would give more is made longer.
inline constexpr std::size_t kMostSectionPoints = 100'000;

/// The length of a line in metres.
double LengthOf(const std::vector<MapPoint>& line);

/// Points at whole multiples of the step (in metres, above 0) from the start of the line, its corners, and its end. Two
/// points never stand at one place in succession; empty for a line without length or with a number that is none.
std::vector<SectionPoint> PointsAlong(const std::vector<MapPoint>& line, double step);

enum class GridSampling {
  Nearest,   ///< The value of the cell in which a point lies.
  Bilinear,  ///< Between the centres of the four cells around a point.
};

/// The value of a grid at each point; NaN where the point lies off the grid or in an empty cell. Of neighbours that are
/// empty or off the grid nothing is taken: those that are there stand for them.
std::vector<double> ValuesAlong(const CTvn2DOrthoRotatedGridData& grid, const std::vector<SectionPoint>& points,
                                GridSampling sampling);

}  // namespace tervane
