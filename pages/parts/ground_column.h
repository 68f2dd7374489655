// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <vector>

#include "forms/plots.h"
#include "pages/parts/ground_soils.h"

namespace tervane {

class CSatZoneKvf;

/// A stretch of a column of the ground, in metres; NaN where nothing is known.
struct ColumnPart {
  std::string kind;  ///< "Soil", "Layer", "Lens", "Computed".
  std::string name;
  double top = 0, bottom = 0, thickness = 0;
  double horizontalConductivity = 0, verticalConductivity = 0, specificYield = 0, specificStorage = 0;
  std::string zone = {};    ///< The zone of the soil; the geological unit, where those hold the parameters.
  std::string remark = {};  ///< What is odd: levels that cross, a head above ground.
};

/// All that lies below a place.
struct GroundColumn {
  double ground = 0;
  std::string soil = {};  ///< The name of the zone; empty where the place has none.
  std::vector<ColumnPart> parts = {};
};

/// While something is awaited, the column is not to be used.
GroundColumn ColumnAt(const CSatZoneKvf& zone, GroundSoils& soils, MapPoint place, Awaited& awaited);

}  // namespace tervane
