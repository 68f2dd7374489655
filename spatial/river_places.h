// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string_view>
#include <vector>

#include "geometry/grid.h"
#include "libraries/river_network.h"

namespace tervane {

/// A place on a branch.
struct RiverPlace {
  const RiverBranch* branch = nullptr;  ///< Null where there is none.
  double chainage = 0;                  ///< In metres.
  double distance = 0;                  ///< From the point that was asked for.
};
/// The place that lies nearest to a point of the map, on any branch or on those of that name.
RiverPlace NearestPlace(const CYbSimpleRiverData& network, const MapPoint& point, std::string_view branch = {});

/// The course of a branch from one chainage to another, as far as the branch goes.
std::vector<MapPoint> CourseBetween(const RiverBranch& branch, double from, double to);

}  // namespace tervane
