// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "edits/cell_figures.h"

#include <algorithm>
#include <cmath>
#include <limits>

#include "geometry/grid_polygons.h"

namespace tervane {

namespace {

/// A line one cell thick, row by row (Bresenham's, with whole runs of a row at a time).
void ThinLine(const GridGeometry& grid, MapPoint from, MapPoint to, const FoundCells& found) {
  if (from.y > to.y) std::swap(from, to);
  // Far away a coordinate is no number of a row.
  if (to.y < 0 || from.y >= grid.ny) return;
  const int first = static_cast<int>(std::floor(std::max(from.y, 0.0)));
  const int last = static_cast<int>(std::floor(std::min(to.y, grid.ny - 1.0)));
  for (int j = first; j <= last; ++j) {
    // The piece of the line that lies in the row.
    const double height = to.y - from.y;
    const auto at = [&](double y) {
      if (height == 0) return y <= from.y ? from.x : to.x;
      return from.x + (to.x - from.x) * std::clamp((y - from.y) / height, 0.0, 1.0);
    };
    double low = height == 0 ? from.x : at(j), high = height == 0 ? to.x : at(j + 1);
    if (low > high) std::swap(low, high);
    if (high < 0 || low >= grid.nx) continue;
    const int begin = static_cast<int>(std::floor(std::max(low, 0.0)));
    found(j, begin, static_cast<int>(std::floor(std::min(high, grid.nx - 1.0))) + 1);
  }
}

}  // namespace

void CellsAlong(const GridGeometry& grid, MapPoint from, MapPoint to, double width, const FoundCells& found) {
  const GridTransform transform(grid);
  const MapPoint a = transform.ToCells(from), b = transform.ToCells(to);
  for (const double number : {a.x, a.y, b.x, b.y})
    if (!std::isfinite(number)) return;
  if (!(width > 1)) return ThinLine(grid, a, b, found);
  const double radius = width / 2, length = std::hypot(b.x - a.x, b.y - a.y);
  // The sides of the line, from end to end.
  const double aside = length > 0 ? radius / length : 0;
  const MapPoint normal{-(b.y - a.y) * aside, (b.x - a.x) * aside};
  const double lowest = std::min(a.y, b.y) - radius, highest = std::max(a.y, b.y) + radius;
  if (highest < 0 || lowest >= grid.ny) return;
  const int first = static_cast<int>(std::max(std::ceil(lowest - 0.5), 0.0));
  const int last = static_cast<int>(std::min(std::floor(highest - 0.5), grid.ny - 1.0));
  for (int j = first; j <= last; ++j) {
    const double y = j + 0.5;
    double low = std::numeric_limits<double>::infinity(), high = -low;
    const auto take = [&](double x) {
      low = std::min(low, x);
      high = std::max(high, x);
    };
    for (const MapPoint& end : {a, b}) {
      const double rise = y - end.y, square = radius * radius - rise * rise;
      if (square < 0) continue;
      take(end.x - std::sqrt(square));
      take(end.x + std::sqrt(square));
    }
    for (const double side : {-1.0, 1.0}) {
      const MapPoint begin{a.x + side * normal.x, a.y + side * normal.y};
      const MapPoint end{b.x + side * normal.x, b.y + side * normal.y};
      if (begin.y == end.y || y < std::min(begin.y, end.y) || y > std::max(begin.y, end.y)) continue;
      take(begin.x + (end.x - begin.x) * (y - begin.y) / (end.y - begin.y));
    }
    // Centres from `low` to `high`.
    const double from0 = std::max(std::ceil(low - 0.5), 0.0), to0 = std::min(std::floor(high - 0.5), grid.nx - 1.0);
    if (from0 <= to0) found(j, static_cast<int>(from0), static_cast<int>(to0) + 1);
  }
}

void CellsWithin(const GridGeometry& grid, const std::vector<MapPoint>& corners, const FoundCells& found) {
  if (corners.size() < 3) return;
  Shape shape;
  shape.points = corners;
  shape.parts = {0};
  CellsOf(grid, shape, ShapeKind::Polygon, found);
}

void CellsOf(const GridGeometry& grid, const Shape& shape, ShapeKind kind, const FoundCells& found) {
  if (kind == ShapeKind::Polygon) {
    PolygonRaster raster(grid);
    for (const PolygonRaster::Span& span : raster.Spans(shape, 0, shape.parts.size()))
      found(span.j, span.begin, span.end);
    return;
  }
  if (kind == ShapeKind::Line) {
    for (std::size_t part = 0; part < shape.parts.size(); ++part)
      for (std::size_t i = shape.parts[part] + 1; i < shape.PartEnd(part); ++i)
        CellsAlong(grid, shape.points[i - 1], shape.points[i], 1, found);
    return;
  }
  for (const MapPoint& point : shape.points) CellsAlong(grid, point, point, 1, found);
}

}  // namespace tervane
