// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "forms/plots.h"
#include "libraries/wells.h"
#include "pages/parts/ground_soils.h"

namespace tervane {

class CSatZoneKvf;

/// What a section through the ground of a setup shows, but for its line.
SectionContent SectionOf(const CSatZoneKvf& zone, GroundSoils& soils);
/// The wells of the setup; none where they take no part.
CTvnWellDataList WellsOf(const CSatZoneKvf& zone);

}  // namespace tervane
