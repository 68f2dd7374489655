// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "data/grid_files.h"

namespace tervane {

/// Reads a grid as `ReadGridData` does, but of every so many rows and columns the middle one alone: what is seen of a
/// large grid, in a fraction of the time. Its cells are as much wider; with `every` 1 it is the grid itself.
FileResult ReadSampledGrid(const std::string& path, int item, const GridSlice& slice, int every,
                           CTvn2DOrthoRotatedGridData& grid, ProgressPart progress = {});

}  // namespace tervane
