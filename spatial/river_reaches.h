// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "geometry/grid.h"
#include "libraries/river_network.h"
#include "spatial/zone_source.h"

namespace tervane {

/// The cells of a zone.
struct ZoneCells {
  CTvn2DOrthoRotatedGridData grid;
  std::optional<float> code;  ///< Of the zone's cells; without one all cells that are not empty are its.
};
/// The cells of a zone as its source tells them; those of the model domain where the zone serves the whole area.
FileResult CellsOfZone(const ZoneSource& source, const CFMSEKvfGroupBase& zone, ZoneCells& cells);

/// A piece of a branch, by its chainages in metres.
struct RiverReach {
  std::string branch;
  double upstream = 0, downstream = 0;

  bool operator==(const RiverReach&) const = default;
};
/// The pieces of the branches that lie in a zone, in the order of the network. A branch that leaves the zone for less
/// than a cell, as one does that runs along its border, is not cut there; a touch of less than that is no reach.
std::vector<RiverReach> ReachesWithin(const CYbSimpleRiverData& network, const ZoneCells& cells);

}  // namespace tervane
