// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Copies of files in another coordinate system.
#pragma once

#include <string>

#include "geometry/grid.h"
#include "platform/files.h"
#include "platform/progress.h"

namespace tervane {

/// Writes the grids of a data file on the cells of `grid`, in its coordinate system: all items with their names and
/// units, steps and layers. Codes are taken from the nearest cell, other values as suits (see `SuitableResampling`).
/// Refused where the items stand on several grids, or have units that nobody knows, and where no cell gets a value;
/// then, and when it is cancelled, nothing stands at `to`.
FileResult CopyGridsOnto(const GridGeometry& grid, const std::string& from, const std::string& to,
                         ProgressPart progress = {});

/// Writes shapes with all their attributes in another coordinate system, the coordinates in the unit of that key (one
/// of item 100187). A point that the system does not have is an error that names its shape.
FileResult CopyShapesInto(const std::string& projection, int axisUnit, const std::string& from, const std::string& to,
                          ProgressPart progress = {});

}  // namespace tervane
