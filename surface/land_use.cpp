// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "surface/land_use.h"

#include "simspec/conditions.h"
#include "surface/irrigation.h"
#include "surface/pages.h"
#include "surface/vegetation.h"

namespace tervane {

Condition IrrigationPossible() { return OwnEngine() && Component(&CModelCompKvf::ET) && Component(&CModelCompKvf::UZ); }

CLandUseKvf::CLandUseKvf(CYbSEKvfBase* parent) : CYbSEKvfBase("Land Use", "LandUse", parent) {
  SetPage(kLandUsePage);
  TakesPartWhen(OwnEngine() &&
                (Component(&CModelCompKvf::UZ) ||
                 (Component(&CModelCompKvf::OL) && Method(&CModelCompKvf::OL_ModelType, kFiniteDifferenceOverland) &&
                  Component(&CModelCompKvf::SZ))));
  NewImportantChild<CVegetationKvf>(kVegetation);
  NewChild<CIrrCommandAreasKvf>();
  NewChild<CIrrDemandKvf>();
  NewChild<CIrrPrioritiesKvf>();
}

bool CLandUseKvf::IsIrrigationPossible() const { return IrrigationPossible().Holds(*this); }

void CLandUseKvf::ExchangeKeys(KeyExchange& keys) {
  keys("Irrigation", Irrigation);
  keys.FromOne("Priorities", Priorities).OneOf(kPrioritySchemes);
  constexpr int kLastVersionWithPavedAreas = 13;
  keys.Until(kLastVersionWithPavedAreas, "Paved", pavedAreas_.Paved);
  keys.Until(kLastVersionWithPavedAreas, "PavedGradientCheck", pavedAreas_.PavedGradientCheck);
  keys.Until(kLastVersionWithPavedAreas, "SpecifyMaxPavedStorageChangeRate",
             pavedAreas_.SpecifyMaxPavedStorageChangeRate);
}

}  // namespace tervane
