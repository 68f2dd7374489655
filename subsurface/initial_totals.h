// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What initial conditions of computational layers come to: the mass of a species, the number of particles.
#pragma once

#include <optional>

#include "spatial/cell_totals.h"

namespace tervane {

class CSatZoneKvf;

/// Nothing for a quantity of another kind. Mass counts with the porosity, or for a sorbed species the bulk density, of
/// the geological layers that a computational layer lies in.
std::optional<CellTotals> InitialTotalsOf(const CSatZoneKvf& zone, CData2DKvf& quantity);

}  // namespace tervane
