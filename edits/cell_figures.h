// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Which cells of a grid lie in what a user draws.
#pragma once

#include <functional>
#include <vector>

#include "geometry/grid.h"
#include "geometry/shapes.h"

namespace tervane {

/// A part of a row: cells [begin, end) of row j.
using FoundCells = std::function<void(int j, int begin, int end)>;

/// The cells whose centre lies within half of `width` (in cells) of the line between two places; with a width of at
/// most 1, those that a line one cell thick has. Rows ascend; none has cells off the grid.
void CellsAlong(const GridGeometry& grid, MapPoint from, MapPoint to, double width, const FoundCells& found);
/// The cells whose centre lies in the polygon with these corners, by the even-odd rule.
void CellsWithin(const GridGeometry& grid, const std::vector<MapPoint>& corners, const FoundCells& found);
/// The cells of a shape: in a polygon, along a line, under a point.
void CellsOf(const GridGeometry& grid, const Shape& shape, ShapeKind kind, const FoundCells& found);

}  // namespace tervane
