// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A band of a raster as a grid of the model: with an item type, a unit, and on the model's cells.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "data/grid_resampling.h"
#include "data/raster_file.h"
#include "geometry/grid.h"
#include "platform/item_types.h"

namespace tervane {

struct RasterImport {
  int itemType = quantity::kUndefined;
  int band = 0;                          ///< Its number; 0 for the only one.
  std::string unit;                      ///< Of the raster's values; empty: what the raster says, else the base unit.
  std::optional<GridGeometry> grid;      ///< Where the values are to stand; without it on the raster's own cells.
  std::optional<Resampling> resampling;  ///< Without one what suits; see `SuitableResampling`.
};

/// What was done, for the user.
struct RasterImportReport {
  std::string error;
  std::vector<std::string> notes, warnings;
  Resampling resampling = Resampling::CellForCell;
  std::size_t values = 0, empty = 0;

  bool Ok() const { return error.empty(); }
};

/// Makes the grid; it stays as it was on failure. Whole numbers count as codes, which are never averaged, when the item
/// type is that of codes, or is undefined and the band has whole numbers of at most 100 different values.
RasterImportReport ImportRaster(const std::string& path, const RasterImport& import, CTvn2DOrthoRotatedGridData& grid);

}  // namespace tervane
