// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Where the cells of a grid lie, and how data files say it.
#pragma once

#include <cmath>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "geometry/grid.h"

namespace tervane {

/// The cells of a line (ny and nz 1), a grid (nz 1) or layers of grids. Column 0 is the west, row 0 the south, layer 0
/// the bottom, before the rotation.
struct FileGeometry {
  int nx = 1, ny = 1, nz = 1;
  double cellSize = 0;     ///< Width of a cell in meters, or degrees when geographical; 0 when the place is unknown.
  double cellHeight = 0;   ///< South to north; differs from the width in foreign files only.
  double x0 = 0, y0 = 0;   ///< The lower left corner of the lower left cell.
  double rotation = 0;     ///< Degrees counter-clockwise around that corner.
  std::string projection;  ///< WKT; empty for a local plane.
  bool isGeographical = false;

  bool IsPlaced() const { return cellSize > 0; }
  /// But for what rounding loses: a raster of 50.00 x 50.01 m has square cells.
  bool HasSquareCells() const { return !IsPlaced() || std::abs(cellHeight - cellSize) <= 1e-3 * cellSize; }
  bool operator==(const FileGeometry&) const = default;
};

/// A part of a grid, counted from its lower left cell.
struct CellWindow {
  int i = 0, j = 0, nx = 0, ny = 0;

  std::size_t CellCount() const { return static_cast<std::size_t>(nx) * static_cast<std::size_t>(ny); }
};

/// The cells as a model's grid has them, those of a grid without a place 1 wide. Gives why they are none, "cells of 50
/// x 25, square ones were expected", or nothing; then `grid` is as it was.
[[nodiscard]] std::string ToModelGrid(const FileGeometry& file, GridGeometry& grid);
/// The same place in the words of data files.
FileGeometry FileGeometryOf(const GridGeometry& grid);
/// The smallest axis-parallel rectangle around the cells, of any shape.
Envelope EnvelopeOf(const FileGeometry& geometry);

/// Values along an axis at equal distances.
struct EvenAxis {
  double first = 0, last = 0;  ///< Of the stored values.
  double spacing = 0;          ///< Negative when they descend; 0 when there is one value.
  std::string error;           ///< Why the values are no such axis: "its values are not equally spaced: ...".
};
/// Distances may differ by a thousandth, or by what the precision of the stored values loses.
EvenAxis FindSpacing(std::span<const double> values, bool areSinglePrecision);

/// Six numbers that lead from column and row to a place, in the order of GDAL: x = [0] + column·[1] + row·[2],
/// y = [3] + column·[4] + row·[5], counted from the outer corner of the first stored cell.
using GeoTransform = std::vector<double>;

/// The transform of a file whose row 0 is the south, or the north.
GeoTransform GeoTransformOf(const FileGeometry& geometry, bool isNorthFirst);
/// The text for a data file whose row 0 is the south.
std::string GeoTransformText(const FileGeometry& geometry);
/// Nothing when the text is not six finite numbers.
std::optional<GeoTransform> ParseGeoTransform(std::string_view text);
/// Sets place, cell size and rotation by the transform; `isNorthFirst` tells whether the stored row 0 is the north.
/// False, and nothing changes, for sheared or empty cells.
bool PlaceByGeoTransform(const GeoTransform& transform, FileGeometry& geometry, bool& isNorthFirst);

/// A coordinate system for a plane without a place on the earth, in meters.
extern const std::string_view kLocalPlaneWkt;
/// True for engineering coordinate systems, in both generations of WKT.
bool IsLocalPlane(std::string_view wkt);
/// True for coordinate systems of latitude and longitude.
bool IsGeographicalWkt(std::string_view wkt);

}  // namespace tervane
