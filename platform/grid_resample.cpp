// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/grid_resample.h"

#include <algorithm>
#include <cmath>

namespace tervane {

namespace {

bool IsSamePlace(const GridGeometry& a, const GridGeometry& b) {
  return a.nx == b.nx && a.ny == b.ny && a.cellSize == b.cellSize && a.x0 == b.x0 && a.y0 == b.y0 &&
         a.rotation == b.rotation;
}

/// The value at a point in cells of the source, which lies in its cell (i, j).
float Between(const CTvn2DOrthoRotatedGridData& source, MapPoint point, int i, int j) {
  if (source.IsEmptyValue(source.Value(i, j))) return kUsualDeleteValue;
  const double u = point.x - 0.5, v = point.y - 0.5;
  const int left = static_cast<int>(std::floor(u)), low = static_cast<int>(std::floor(v));
  double sum = 0, weights = 0;
  for (int row = low; row <= low + 1; ++row) {
    for (int column = left; column <= left + 1; ++column) {
      if (column < 0 || row < 0 || column >= source.Geometry().nx || row >= source.Geometry().ny) continue;
      const float value = source.Value(column, row);
      if (source.IsEmptyValue(value)) continue;
      const double weight = (1 - std::abs(u - column)) * (1 - std::abs(v - row));
      sum += weight * static_cast<double>(value);
      weights += weight;
    }
  }
  return static_cast<float>(sum / weights);
}

}  // namespace

std::vector<float> Resample(const CTvn2DOrthoRotatedGridData& source, const GridGeometry& geometry, Resampling method) {
  std::vector<float> values(geometry.CellCount(), kUsualDeleteValue);
  const GridGeometry& from = source.Geometry();
  if (IsSamePlace(from, geometry)) {
    std::ranges::transform(source.Values(), values.begin(),
                           [&](float value) { return source.IsEmptyValue(value) ? kUsualDeleteValue : value; });
    return values;
  }
  const GridTransform toWorld(geometry), toSource(from);
  auto value = values.begin();
  for (int j = 0; j < geometry.ny; ++j) {
    for (int i = 0; i < geometry.nx; ++i, ++value) {
      const MapPoint point = toSource.ToCells(toWorld.ToWorld({i + 0.5, j + 0.5}));
      // Also false for a point that is no number.
      if (!(point.x >= 0 && point.y >= 0 && point.x < from.nx && point.y < from.ny)) continue;
      const int column = static_cast<int>(point.x), row = static_cast<int>(point.y);
      if (method == Resampling::Bilinear)
        *value = Between(source, point, column, row);
      else if (!source.IsEmptyValue(source.Value(column, row)))
        *value = source.Value(column, row);
    }
  }
  return values;
}

}  // namespace tervane
