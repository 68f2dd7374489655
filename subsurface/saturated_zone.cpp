// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/saturated_zone.h"

#include "simspec/conditions.h"
#include "subsurface/drainage.h"
#include "subsurface/pages.h"
#include "subsurface/wells.h"

namespace tervane {

CSatZoneKvf::CSatZoneKvf(CYbSEKvfBase* parent) : CYbSEKvfBase("Saturated Zone", "SaturatedZone", parent) {
  SetPage(kSaturatedZonePage);
  TakesPartWhen(
      (OwnEngine() && Component(&CModelCompKvf::SZ) && !Method(&CModelCompKvf::SZ_ModelType, kLinearReservoir)) ||
      (AnyModflow() && ModflowComponent(&CModModelCompKvf::Subsurface)));
  NewImportantChild<CDrainageSZKvf>(kDrainage);
  NewImportantChild<CDrainageMFSZKvf>(kModflowDrains);
  NewImportantChild<CSZWellKvf>(kWells, Wells);
}

void CSatZoneKvf::ExchangeKeys(KeyExchange& keys) {
  keys("DispersionOption", DispersionOption).OneOf(kDispersions);
  constexpr int kLastVersionWithOption = 7;
  keys.Since(kLastVersionWithOption + 1)("Drainage", Drainage);
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
  int option = CDrainageSZKvf::kNoDrainage;
  keys.Until(kLastVersionWithOption, "DrainageOption", option);
  if (!keys.IsReading() || keys.DocVersion() > kLastVersionWithOption) return;
  Drainage = option > CDrainageSZKvf::kNoDrainage ? 1 : 0;
  if (auto* drainage = Important(kDrainage))
    drainage->SetOption(option == CDrainageSZKvf::kNoDrainage ? CDrainageSZKvf::kDownhill : option);
}

}  // namespace tervane
