// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/grid_section.h"

#include <algorithm>
#include <cmath>
#include <limits>

namespace tervane {

namespace {

constexpr double kNoValue = std::numeric_limits<double>::quiet_NaN();

double Between(MapPoint a, MapPoint b) { return std::hypot(b.x - a.x, b.y - a.y); }

/// The value at a place in cells from the lower left corner that lies in the cell (i, j).
double BilinearValue(const CTvn2DOrthoRotatedGridData& grid, MapPoint at, int i, int j) {
  const GridGeometry& geometry = grid.Geometry();
  // Towards the neighbours on whose side of the cell's centre the place lies.
  const double dx = at.x - i - 0.5, dy = at.y - j - 0.5;
  const int toX = dx < 0 ? -1 : 1, toY = dy < 0 ? -1 : 1;
  double sum = 0, weights = 0;
  for (const int besideX : {0, 1}) {
    for (const int besideY : {0, 1}) {
      const int ni = i + besideX * toX, nj = j + besideY * toY;
      if (ni < 0 || nj < 0 || ni >= geometry.nx || nj >= geometry.ny) continue;
      const float value = grid.Value(ni, nj);
      if (grid.IsEmptyValue(value)) continue;
      const double weight = (besideX ? std::abs(dx) : 1 - std::abs(dx)) * (besideY ? std::abs(dy) : 1 - std::abs(dy));
      sum += weight * static_cast<double>(value);
      weights += weight;
    }
  }
  return sum / weights;
}

}  // namespace

double LengthOf(const std::vector<MapPoint>& line) {
  double length = 0;
  for (std::size_t i = 1; i < line.size(); ++i) length += Between(line[i - 1], line[i]);
  return length;
}

std::vector<SectionPoint> PointsAlong(const std::vector<MapPoint>& line, double step) {
  const double length = LengthOf(line);
  if (!(length > 0) || !std::isfinite(length) || !(step > 0)) return {};
  step = std::max(step, length / static_cast<double>(kMostSectionPoints));
  std::vector<SectionPoint> points{{0, line.front()}};
  double passed = 0;
  double next = 1;  // in steps
  for (std::size_t i = 1; i < line.size(); ++i) {
    const double piece = Between(line[i - 1], line[i]);
    if (piece == 0) continue;
    // What falls together with a corner is the corner itself.
    for (; next * step < passed + piece * (1 - 1e-9); ++next) {
      const double part = (next * step - passed) / piece;
      if (part < 1e-9) continue;
      points.push_back(
          {next * step,
           {line[i - 1].x + part * (line[i].x - line[i - 1].x), line[i - 1].y + part * (line[i].y - line[i - 1].y)}});
    }
    passed += piece;
    points.push_back({passed, line[i]});
  }
  return points;
}

std::vector<double> ValuesAlong(const CTvn2DOrthoRotatedGridData& grid, const std::vector<SectionPoint>& points,
                                GridSampling sampling) {
  const GridGeometry& geometry = grid.Geometry();
  const GridTransform transform(geometry);
  std::vector<double> values;
  values.reserve(points.size());
  for (const SectionPoint& point : points) {
    const MapPoint at = transform.ToCells(point.place);
    values.push_back(kNoValue);
    if (!(at.x >= 0 && at.y >= 0 && at.x < geometry.nx && at.y < geometry.ny)) continue;
    const int i = static_cast<int>(at.x), j = static_cast<int>(at.y);
    const float value = grid.Value(i, j);
    if (grid.IsEmptyValue(value)) continue;
    values.back() = sampling == GridSampling::Nearest ? static_cast<double>(value) : BilinearValue(grid, at, i, j);
  }
  return values;
}

}  // namespace tervane
