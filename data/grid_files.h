// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Grids in data files.
#pragma once

#include <string>

#include "data/file_geometry.h"
#include "geometry/grid.h"
#include "geometry/shapes.h"
#include "platform/computation.h"
#include "platform/progress.h"

namespace tervane {

/// A grid that is read, interpolated or made of polygons.
using ComputedGrid = Computed<CTvn2DOrthoRotatedGridData>;

/// One grid of an item; steps and layers are counted from 0, layers from the bottom.
struct GridSlice {
  std::size_t step = 0;
  int layer = 0;

  bool operator==(const GridSlice&) const = default;
};
/// Reads a grid of an item, the first of its steps and layers unless told, in the base unit of its item type. `grid`
/// stays as it was on failure.
FileResult ReadGridData(const std::string& path, int item, CTvn2DOrthoRotatedGridData& grid, ProgressPart progress = {},
                        const GridSlice& slice = {});
/// Writes a grid as a data file with one item and no time axis, in place of a file of that name.
FileResult WriteGridData(const std::string& path, const CTvn2DOrthoRotatedGridData& grid, ProgressPart progress = {});
/// Where the grid of an item stands, without its values.
FileResult ReadGeoInfoFromNdsFile(const std::string& path, int item, GridGeometry& geometry);
/// The name of an item; empty when there is none.
std::string ItemNameOf(const std::string& path, int item);

/// What a file of a model domain looks like, by its first item.
enum class DomainFileState { Unreadable, NoItem, BadItem, NoStatistics, Read };
struct DomainFileFacts {
  double smallest = 0, largest = 0;
};
DomainFileState ReadDomainFacts(const std::string& path, DomainFileFacts& facts);

/// The points of a text file as shapes whose value is their z.
FileResult ReadXyzShapes(const std::string& path, int axisUnit, CTvnShapeData& shapes, ProgressPart progress = {});

}  // namespace tervane
