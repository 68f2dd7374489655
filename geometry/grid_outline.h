// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "geometry/grid.h"
#include "geometry/shapes.h"

namespace tervane {

/// The lines around the cells of a grid that hold a value, along their edges: one polygon, with a ring for each part
/// and each hole. Cells that touch at a corner alone are two parts. No shape at all without such cells.
void MakeOutline(const CTvn2DOrthoRotatedGridData& grid, CTvnShapeData& outline);

}  // namespace tervane
