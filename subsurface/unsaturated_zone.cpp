// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/unsaturated_zone.h"

#include "simspec/conditions.h"
#include "spatial/data2d.h"
#include "subsurface/pages.h"
#include "subsurface/soil_profiles.h"
#include "subsurface/two_layer_soils.h"
#include "subsurface/unsaturated_initial_conditions.h"

namespace tervane {

namespace {

using Zone = CUnsatzoneKvf;

constexpr KeyChoice kMacroporeFlows[] = {{Zone::kNoMacropores, "None"},
                                         {Zone::kSimpleBypass, "Simple by-pass flow"},
                                         {Zone::kFullMacroporeFlow, "Full macropore flow (Richards and Gravity only)"}};
constexpr KeyChoice kClassifications[] = {{Zone::kAutomatic, "1: Automatic"},
                                          {Zone::kSpecifiedPoints, "2: Specified calculation points"},
                                          {Zone::kAllCells, "3: Calculated in all grid points"},
                                          {Zone::kPartialAutomatic, "4: Partial automatic (combination of 1 and 2)"}};
constexpr KeyChoice kInitialConditions[] = {{Zone::kEquilibrium, "Equilibrium pressure profile"},
                                            {Zone::kMatrixPotential, "Specified matrix potential"},
                                            {Zone::kWaterContent, "Specified water content"}};

constexpr KeyChoice kTableOptions[] = {
    {CUZGroundWaterDepthListKvf::kInitialTable, "Use initial water table for classification"},
    {CUZGroundWaterDepthListKvf::kSpecifiedTable, "Specified water table for classification"}};

const Data2DKind kSurfaceDepth{.className = "CUZWetlandETSurfaceDepthKvf",
                               .section = "ETSurfaceDepth",
                               .title = "ET Surface Depth",
                               .itemType = quantity::kDepthBelowGround,
                               .fixedValue = 0.1f};
const Data2DKind kSpecified{.className = "CUZSpecifiedClassificationKvf",
                            .section = "SpecifiedClassification",
                            .title = "Specified Classification",
                            .itemType = quantity::kCode};
const Data2DKind kPartial{.className = "CUZPartialAutomationKvf",
                          .section = "PartialAutomatic",
                          .title = "Partial Automatic Classification",
                          .itemType = quantity::kCode};
const Data2DKind kGroundwaterTable{.className = "CUZGroundWaterTableKvf",
                                   .section = "UZGroundWaterTable",
                                   .title = "Groundwater table for UZ classification",
                                   .itemType = quantity::kElevation,
                                   .relativeToGround = Data2DKind::RelativeToGround::Off};

const CUnsatzoneKvf* ZoneOf(const CYbSEKvfBase& node) { return node.Important(kUnsaturatedZone); }

}  // namespace

Condition TwoLayerMethod() { return Method(&CModelCompKvf::UZ_ModelType, kTwoLayer); }

Condition SoilColumnsComputed() {
  return Method(&CModelCompKvf::UZ_ModelType, kRichardsEquation) || Method(&CModelCompKvf::UZ_ModelType, kGravityFlow);
}

Condition UnsaturatedZoneIs(int CUnsatzoneKvf::*key, std::vector<int> values) {
  return Is<CUnsatzoneKvf>(ZoneOf, key, std::move(values));
}

Condition GreenAndAmptUsed() { return On<CUnsatzoneKvf>(ZoneOf, &CUnsatzoneKvf::USE_Green_And_Ampt); }

CUnsatzoneKvf::CUnsatzoneKvf(CYbSEKvfBase* parent) : CYbSEKvfBase("Unsaturated Flow", "Unsatzone", parent) {
  SetPage(kUnsaturatedZonePage);
  const Condition isModelled = OwnEngine() && Component(&CModelCompKvf::UZ);
  TakesPartWhen(isModelled);
  NewChild<CUZSoilProfileKvf>();
  NewChild<CUZWetlandSoilProfileKvf>();
  NewChild<CData2DKvf>(kSurfaceDepth, OwnEngine() && TwoLayerMethod());
  NewChild<CUZGroundWaterDepthListKvf>()->TakesPartWhen(isModelled && !TwoLayerMethod() &&
                                                        Is(ClassificationType, {kAutomatic, kPartialAutomatic}));
  NewChild<CUnSatInitConditionsKvf>()->TakesPartWhen(isModelled && !TwoLayerMethod() &&
                                                     !Is(InitialCondition, kEquilibrium));
  NewChild<CData2DKvf>(kSpecified, SoilColumnsComputed() && Is(ClassificationType, kSpecifiedPoints));
  NewChild<CData2DKvf>(kPartial, SoilColumnsComputed() && Is(ClassificationType, kPartialAutomatic));
}

void CUnsatzoneKvf::ExchangeKeys(KeyExchange& keys) {
  keys("Bypass", Bypass).OneOf(kMacroporeFlows);
  keys("ClassificationType", ClassificationType).OneOf(kClassifications);
  keys("InitialCondition", InitialCondition).OneOf(kInitialConditions);
  keys("Max_MP_Infiltration_Per_TimeStep", Max_MP_Infiltration_Per_TimeStep).Unit("mm");
  keys("Max_MP_Node_Exchange_Per_TimeStep", Max_MP_Node_Exchange_Per_TimeStep).Unit("mm");
  keys("Max_MP_Column_Exchange_Per_TimeStep", Max_MP_Column_Exchange_Per_TimeStep).Unit("mm");
  keys("USE_Green_And_Ampt", USE_Green_And_Ampt);
}

int CUnsatzoneKvf::ValidateData() {
  if (Bypass != kFullMacroporeFlow || !TwoLayerMethod().Holds(*this)) return 1;
  AddError("Full Macropore Flow is only available with Richards- or Gravity UZ methods", "Bypass");
  return 0;
}

// ---- Depths for the classification

void CUZGroundWaterDepthItemKvf::ExchangeKeys(KeyExchange& keys) {
  keys("Depth", Depth).Quantity(quantity::kDepthBelowGround);
}

CUZGroundWaterDepthListKvf::CUZGroundWaterDepthListKvf(CYbSEKvfBase* parent)
    : CYbSEKvfListBase("Groundwater depths used for UZ classification", "UZGroundWaterDepthList", parent) {
  SetPage(kGroundwaterDepthsPage);
  NewChild<CData2DKvf>(kGroundwaterTable, Is(GroundWaterTableOption, kSpecifiedTable));
  AddItemNode();
}

void CUZGroundWaterDepthListKvf::ExchangeKeys(KeyExchange& keys) {
  keys.Count("NumberOfLayers", *this);
  keys("GroundWaterTableOption", GroundWaterTableOption).OneOf(kTableOptions);
}

}  // namespace tervane
