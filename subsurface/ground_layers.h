// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What lies below the ground, as a section or a column through it needs it: layers, lenses, computational layers and
// heads by their quantities, whichever way the setup tells them.
#pragma once

#include <string>
#include <vector>

#include "spatial/cell_checks.h"
#include "spatial/data2d.h"

namespace tervane {

class CSatZoneKvf;

/// A geological layer, a lens or a computational layer. Quantities that it has not are null.
struct GroundBody {
  std::string name;
  CYbSEKvfBase* node = nullptr;
  CData2DKvf* extent = nullptr;  ///< Of a lens: where it has a value other than 0.
  CData2DKvf* top = nullptr;     ///< Of a lens; layers begin where the one above ends.
  CData2DKvf* bottom = nullptr;  ///< Of a computational layer that follows the geology none.
  CData2DKvf* head = nullptr;    ///< Of a computational layer: the initial one.
};

std::vector<GroundBody> GeologicalLayersOf(const CSatZoneKvf& zone);
std::vector<GroundBody> GeologicalLensesOf(const CSatZoneKvf& zone);
/// Those that are computed; none where they are uniform.
std::vector<GroundBody> ComputationalLayersOf(const CSatZoneKvf& zone);

/// What is to be held against each other in the cells of the domain.
std::vector<CellCheck> GroundChecksOf(const CSatZoneKvf& zone);

}  // namespace tervane
