// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "forms/plots.h"
#include "libraries/wells.h"

namespace tervane {

/// Wells that have a place, with their names.
PointLayer PointsOf(const std::vector<CTvnWellData>& wells);

/// Puts wells with their names over a map.
void AddWells(MapContent& map, const std::vector<CTvnWellData>& wells);

/// All wells of a library, one of them standing out.
MapContent WellMap(const Library& library, std::size_t current);
/// What is pumped from each filter of a well.
SeriesContent WellChart(const Library& library, const LibraryEntry& well);

}  // namespace tervane
