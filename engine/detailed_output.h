// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <vector>

#include "engine/engine_output.h"
#include "geometry/grid.h"
#include "modelcells/model_layers.h"
#include "results/detailed_points.h"
#include "results/detailed_series.h"

namespace tervane {

/// The points at which a simulation stores series, each with its cell (counted from 1 in the south-west) and, where its
/// type has a depth, its computational layer. `seriesFile` is where a simulation will put the values, an item for each
/// point. What lies outside the domain is a warning.
std::vector<DetailedPoint> PlaceDetailedPoints(const CDetailedTSOutputListKvf& list,
                                               const CTvn2DOrthoRotatedGridData& domain, const ModelLayers& layers,
                                               const std::string& seriesFile, EngineOutput& log);

/// The points for people to read, a line each.
std::string DetailedPointsText(const std::vector<DetailedPoint>& points);

}  // namespace tervane
