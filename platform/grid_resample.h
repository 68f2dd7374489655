// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A grid's values on the cells of another grid.
#pragma once

#include <vector>

#include "platform/grid.h"

namespace tervane {

enum class Resampling {
  Nearest,   ///< The value of the cell in which the new cell's centre lies: for codes.
  Bilinear,  ///< Between the centres of the four cells around; empty ones among them are left out.
};

/// The values of `source` at the cell centres of `geometry`, one for each of its cells. Centres off the source, or in
/// an empty cell of it, get `kUsualDeleteValue`. Both grids are taken to lie in one plane; their projections are not
/// asked.
std::vector<float> Resample(const CTvn2DOrthoRotatedGridData& source, const GridGeometry& geometry, Resampling method);

}  // namespace tervane
