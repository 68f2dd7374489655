// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/saturated_zone.h"

#include "simspec/conditions.h"
#include "subsurface/pages.h"

namespace tervane {

CSatZoneKvf::CSatZoneKvf(CYbSEKvfBase* parent) : CYbSEKvfBase("Saturated Zone", "SaturatedZone", parent) {
  SetPage(kSaturatedZonePage);
  TakesPartWhen(
      (OwnEngine() && Component(&CModelCompKvf::SZ) && !Method(&CModelCompKvf::SZ_ModelType, kLinearReservoir)) ||
      (AnyModflow() && ModflowComponent(&CModModelCompKvf::Subsurface)));
}

void CSatZoneKvf::ExchangeKeys(KeyExchange& keys) {
  keys("DispersionOption", DispersionOption).OneOf(kDispersions);
  constexpr int kFirstVersionOfSwitch = 8;
  keys.Since(kFirstVersionOfSwitch)("Drainage", Drainage);
  keys("TypeOfGeoParaDistribution", ParameterDistribution).OneOf(kGroundParameterDistributions);
  keys("TypeOfVerDiscr", TypeOfVerDiscr).OneOf(kVerticalDiscretizations);
  keys("Wells", Wells);
  keys("FractureWells", FractureWells);
  keys("MimimumLayerThickness", MimimumLayerThickness).Quantity(quantity::kLayerThickness);
  keys("id", id);
  keys("TypeAmbientWaterHeadInput", TypeAmbientWaterHeadInput).OneOf(kAmbientHeads);
  keys("TypeOfRelPerm", TypeOfRelPerm).OneOf(kRelativePermeabilities);
  keys("Threshold", Threshold);
  keys("MassTransferToImmobileWater", MassTransferToImmobileWater);
}

}  // namespace tervane
