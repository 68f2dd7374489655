// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A raster put on another grid. The manual tells the methods: docs/manual/rasters.md.
#pragma once

#include <functional>
#include <span>
#include <string>
#include <vector>

#include "data/file_geometry.h"
#include "data/raster_file.h"
#include "geometry/cart.h"
#include "geometry/grid.h"

namespace tervane {

enum class Resampling {
  CellForCell,  ///< The cells of both grids are the same; each takes its value.
  Nearest,      ///< The cell of the raster in which the centre lies.
  Bilinear,     ///< Between the centres of the four nearest cells of the raster, as far as they have values.
  Average,      ///< The mean of the raster's cells whose centres lie in the cell.
};
/// "the nearest cell of the raster".
std::string_view ResamplingText(Resampling method);

/// The raster and the grid on which it is to be put.
struct ResamplingTask {
  FileGeometry raster;
  /// Reads a part of the raster, rows from the south, kDeleteValue where a value is missing; "" or why not.
  std::function<std::string(const CellWindow& window, std::span<float> values)> read;
  GridGeometry grid;
  /// From the raster's projection to the grid's; null when both are the same.
  const CYbProjectionChange* change = nullptr;
};

/// The method that suits a raster: cell for cell where the grids agree, nearest for codes, average where at least two
/// cells of the raster go across a cell of the grid, else bilinear.
Resampling SuitableResampling(const ResamplingTask& task, bool areCodes);
/// Gives each cell of the grid a value, kDeleteValue outside the raster and where it has none. Reads no more of the
/// raster than the grid needs, and in pieces. "" or why not.
std::string Resample(const ResamplingTask& task, Resampling method, std::vector<float>& values);

}  // namespace tervane
