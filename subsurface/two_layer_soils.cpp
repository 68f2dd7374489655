// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/two_layer_soils.h"

#include <fmt/format.h>

#include "platform/item_types.h"
#include "platform/text.h"
#include "simspec/conditions.h"
#include "subsurface/pages.h"
#include "subsurface/unsaturated_zone.h"

namespace tervane {

namespace {

constexpr ZoneKey kTwoLayerSoilKeys[] = {
    {ZonePart::Number, "SoilSecNumber"}, {ZonePart::Id, "GridCode"}, {ZonePart::Name, "Soil_ID"}};

constexpr CodedZonesKind kTwoLayerSoilZones{.className = "CUZWetlandSoilProfileKvf",
                                            .title = "2-Layer UZ Soil",
                                            .section = "TwoLayerUZSoilProperties",
                                            .source = {.countKey = "NO_SOIL_TYPES"},
                                            .distribution = CodedZonesKvf::kUniform,
                                            .makeZone = MakeZone<CUZWetlandSoilPropKvf>,
                                            .page = &kTwoLayerSoilsPage};

}  // namespace

CUZWetlandSoilPropKvf::CUZWetlandSoilPropKvf(CYbSEKvfBase* parent)
    : CodedZoneProp(kTwoLayerSoilKeys, "2-Layer UZ Soil properties", "UZSoilProp", parent),
      BypassConstants{.BYP = 0.3f, .THR1 = 0.1f, .THR2 = 0.05f} {
  SetPage(kTwoLayerSoilPage);
}

void CUZWetlandSoilPropKvf::ExchangeKeys(KeyExchange& keys) {
  CodedZoneProp::ExchangeKeys(keys);
  keys("ThetaS", ThetaS).Quantity(quantity::kSoilWaterContent).Range(0, 1);
  keys("ThetaFC", ThetaFC).Quantity(quantity::kSoilWaterContent).Range(0, 1);
  keys("ThetaWP", ThetaWP).Quantity(quantity::kSoilWaterContent).Range(0, 1);
  keys("Kint", Kint).Quantity(quantity::kHydraulicConductivity).Above(0);
  BypassConstants::Exchange(keys);
  keys("SoilSuction", SoilSuction).Quantity(quantity::kPressureHead);
}

int CUZWetlandSoilPropKvf::ValidateData() {
  int isValid = CodedZoneProp::ValidateData();
  if (!(ThetaWP <= ThetaFC && ThetaFC <= ThetaS))
    AddWarning("The water contents do not rise from wilting point over field capacity to saturation", "ThetaFC",
               fmt::format("they are {}, {} and {}", ShortestNumber(ThetaWP), ShortestNumber(ThetaFC),
                           ShortestNumber(ThetaS)));
  if (SoilSuction > 0) {
    AddError("Soil suction at wetting front must be less than or equal 0.", "SoilSuction");
    isValid = 0;
  }
  return isValid;
}

CUZWetlandSoilProfileKvf::CUZWetlandSoilProfileKvf(CYbSEKvfBase* parent) : CodedZonesKvf(kTwoLayerSoilZones, parent) {
  TakesPartWhen(Component(&CModelCompKvf::UZ) && TwoLayerMethod());
  BeginWithZones();
}

}  // namespace tervane
