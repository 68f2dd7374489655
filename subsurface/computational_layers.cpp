// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/computational_layers.h"

#include <array>

#include "simspec/pages.h"
#include "simspec/water_quality_conditions.h"
#include "subsurface/geology.h"
#include "subsurface/ground_properties.h"
#include "subsurface/internal_boundary.h"
#include "subsurface/pages.h"
#include "subsurface/saturated_zone.h"
#include "wqpt/registration_lenses.h"
#include "wqpt/species_entries.h"

namespace tervane {

namespace {

const Data2DKind kInitialHead{.className = "CGeoDataInitPotHeadKvf",
                              .section = "InitPotHead",
                              .title = "Initial Potential Head",
                              .itemType = quantity::kElevation,
                              .fixedValue = -0.9F,
                              .relativeToGround = Data2DKind::RelativeToGround::On};
const Data2DKind kInitialTemperature{.className = "CGeoDataInitSoilTempKvf",
                                     .section = "InitialSoilTemperature",
                                     .title = "Initial Soil Temperature",
                                     .itemType = quantity::kTemperature,
                                     .fixedValue = 10};

using Rule = GroundProperty::Rule;
constexpr std::array kLowerLevel{
    GroundProperty{"LowerLevel", "Lower Level", Rule::Always, quantity::kElevation, 0, true}};
constexpr std::array kOfModflow{
    GroundProperty{"HydrHeadUsedForAirFlow", "Hydraulic head used as ref. for air flow simulation",
                   Rule::AirFlowOfComputation, quantity::kElevation},
    GroundProperty{"WettingThreshold", "Wetting Threshold (combined with a flag)", Rule::Rewetting,
                   quantity::kWaterDepth}};

/// A list of layers counts under one way of dividing the zone.
Condition DividedBy(int discretization) {
  return Component(&CModelCompKvf::WM) &&
         Is<CSatZoneKvf>([](const CYbSEKvfBase& node) { return node.Important(kSaturatedZone); },
                         &CSatZoneKvf::TypeOfVerDiscr, {discretization});
}

}  // namespace

CSZVerDiscrLayerKvf::CSZVerDiscrLayerKvf(std::string title, const char* helpPage, CYbSEKvfBase* parent)
    : NamedItemKvf(std::move(title), "Layer_%d", "Layer", parent) {
  SetHelp("Top.chm", helpPage);
  SetPage(kHelpPage);
}

void CSZVerDiscrLayerKvf::MakeConditions() {
  // Rules are shared by all layers, of which there may be many.
  static const Condition kWater = Component(&CModelCompKvf::WM);
  static const Condition kTemperature = SoilTemperatureNeeded(SoilCompartment::Saturated);
  NewChild<CData2DKvf>(kInitialHead, kWater);
  NewChild<CData2DKvf>(kInitialTemperature, kTemperature);
  outerBoundary_ = NewChild<CGeoDataBoundCondListKvf>();
  MakeProperties(*this, kOfModflow, false);
  NewChild<CSZVerDiscrInternalBoundaryKvf>();
  NewChild<CSatCompLayersInitConcentrationKvf>();
  NewChild<CSatCompLayersInitImmobileConcentrationKvf>();
  MakeParticleValues(*this);
}

// ---- Layers that follow the geological layers

CSZVerDiscrLayerGeoItemKvf::CSZVerDiscrLayerGeoItemKvf(CYbSEKvfBase* parent)
    : CSZVerDiscrLayerKvf("SZVerDiscrLayerGeoItem", "Computational_Layer.htm", parent) {
  MakeConditions();
}

void CSZVerDiscrLayerGeoItemKvf::ExchangeKeys(KeyExchange& keys) {
  NamedItemKvf::ExchangeKeys(keys);
  keys("ModLayAvg", ModLayAvg);
  keys("ModLayCon", ModLayCon);
  keys("id", id);
}

CSZVerDiscrLayerGeoListKvf::CSZVerDiscrLayerGeoListKvf(CYbSEKvfBase* parent)
    : NamedListKvf("Computational Layers", "CompLayersGeoSZ", parent) {
  SetPage(kComputationalLayersOfGeologyPage);
  BeginWithAquifer();
  TakesPartWhen(DividedBy(CSatZoneKvf::kAsGeology));
}

void CSZVerDiscrLayerGeoListKvf::BringInStep(const CGeoLayerSZKvf& geology) {
  SetItemCount(geology.GetItemCount(), 1);
  for (int number = 1; number <= GetItemCount(); ++number) GetItem(number)->Name = geology.GetItemName(number);
}

// ---- Layers with lower levels of their own

CSZVerDiscrLayerItemKvf::CSZVerDiscrLayerItemKvf(CYbSEKvfBase* parent)
    : CSZVerDiscrLayerKvf("SZVerDiscrLayerItem", "Lower_Level_Layer.htm", parent) {
  MakeProperties(*this, kLowerLevel, false);
  MakeConditions();
}

void CSZVerDiscrLayerItemKvf::ExchangeKeys(KeyExchange& keys) {
  NamedItemKvf::ExchangeKeys(keys);
  keys("id", id);
}

CSZVerDiscrLayerListKvf::CSZVerDiscrLayerListKvf(CYbSEKvfBase* parent)
    : NamedListKvf("Computational Layers", "CompLayersSZ", parent) {
  SetPage(kComputationalLayersPage);
  BeginWithAquifer();
  TakesPartWhen(DividedBy(CSatZoneKvf::kExplicitLevels));
}

}  // namespace tervane
