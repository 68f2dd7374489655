// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/unsaturated_zone.h"

#include "simspec/conditions.h"
#include "spatial/data2d.h"
#include "subsurface/pages.h"
#include "subsurface/soil_profiles.h"
#include "subsurface/two_layer_soils.h"
#include "subsurface/unsaturated_initial_conditions.h"
#include "wqpt/decay_entries.h"
#include "wqpt/kinetra_values.h"
#include "wqpt/sorption_entries.h"
#include "wqpt/species_entries.h"

namespace tervane {

namespace {

using UnsaturatedZone = CUnsatzoneKvf;

constexpr KeyChoice kMacroporeFlows[] = {
    {UnsaturatedZone::kNoMacropores, "None"},
    {UnsaturatedZone::kSimpleBypass, "Simple by-pass flow"},
    {UnsaturatedZone::kFullMacroporeFlow, "Full macropore flow (Richards and Gravity only)"}};
constexpr KeyChoice kClassifications[] = {
    {UnsaturatedZone::kAutomatic, "1: Automatic"},
    {UnsaturatedZone::kSpecifiedPoints, "2: Specified calculation points"},
    {UnsaturatedZone::kAllCells, "3: Calculated in all grid points"},
    {UnsaturatedZone::kPartialAutomatic, "4: Partial automatic (combination of 1 and 2)"}};
constexpr KeyChoice kUnsaturatedInitialStates[] = {{UnsaturatedZone::kEquilibrium, "Equilibrium pressure profile"},
                                                   {UnsaturatedZone::kMatrixPotential, "Specified matrix potential"},
                                                   {UnsaturatedZone::kWaterContent, "Specified water content"}};

constexpr KeyChoice kClassificationTableOptions[] = {
    {CUZGroundWaterDepthListKvf::kInitialTable, "Use initial water table for classification"},
    {CUZGroundWaterDepthListKvf::kSpecifiedTable, "Specified water table for classification"}};

const Data2DKind kEtSurfaceDepth{.className = "CUZWetlandETSurfaceDepthKvf",
                                 .section = "ETSurfaceDepth",
                                 .title = "ET Surface Depth",
                                 .itemType = quantity::kDepthBelowGround,
                                 .fixedValue = 0.1f};
const Data2DKind kSpecifiedClassification{.className = "CUZSpecifiedClassificationKvf",
                                          .section = "SpecifiedClassification",
                                          .title = "Specified Classification",
                                          .itemType = quantity::kCode};
const Data2DKind kPartialClassification{.className = "CUZPartialAutomationKvf",
                                        .section = "PartialAutomatic",
                                        .title = "Partial Automatic Classification",
                                        .itemType = quantity::kCode};
const Data2DKind kClassificationTable{.className = "CUZGroundWaterTableKvf",
                                      .section = "UZGroundWaterTable",
                                      .title = "Groundwater table for UZ classification",
                                      .itemType = quantity::kElevation,
                                      .relativeToGround = Data2DKind::RelativeToGround::Off};

const CUnsatzoneKvf* UnsaturatedZoneOf(const CYbSEKvfBase& node) { return node.Important(kUnsaturatedZone); }

}  // namespace

Condition TwoLayerMethod() { return Method(&CModelCompKvf::UZ_ModelType, kTwoLayer); }

Condition SoilColumnsComputed() {
  return Method(&CModelCompKvf::UZ_ModelType, kRichardsEquation) || Method(&CModelCompKvf::UZ_ModelType, kGravityFlow);
}

Condition UnsaturatedZoneIs(int CUnsatzoneKvf::*key, std::vector<int> values) {
  return Is<CUnsatzoneKvf>(UnsaturatedZoneOf, key, std::move(values));
}

Condition GreenAndAmptUsed() { return On<CUnsatzoneKvf>(UnsaturatedZoneOf, &CUnsatzoneKvf::USE_Green_And_Ampt); }

CUnsatzoneKvf::CUnsatzoneKvf(CYbSEKvfBase* parent) : CYbSEKvfBase("Unsaturated Flow", "Unsatzone", parent) {
  SetPage(kUnsaturatedZonePage);
  const Condition isModelled = OwnEngine() && Component(&CModelCompKvf::UZ);
  TakesPartWhen(isModelled);
  NewChild<CUZSoilProfileKvf>();
  NewChild<CUZWetlandSoilProfileKvf>();
  etSurfaceDepth_ = NewChild<CData2DKvf>(kEtSurfaceDepth, OwnEngine() && TwoLayerMethod());
  NewChild<CMacroporeTransferCoeff>();
  NewChild<CDecayProcessListKvf>();
  NewChild<CSorptionProcessesKvf>();
  NewImportantChild<CKinetraConstantsUZKvf>(kKinetraConstantsSoil);
  NewImportantChild<CKinetraForcingsUZKvf>(kKinetraForcingsSoil);
  NewChild<CUZGroundWaterDepthListKvf>()->TakesPartWhen(isModelled && !TwoLayerMethod() &&
                                                        Is(ClassificationType, {kAutomatic, kPartialAutomatic}));
  NewChild<CUnSatInitConditionsKvf>()->TakesPartWhen(isModelled && !TwoLayerMethod() &&
                                                     !Is(InitialCondition, kEquilibrium));
  NewChild<CData2DKvf>(kSpecifiedClassification, SoilColumnsComputed() && Is(ClassificationType, kSpecifiedPoints));
  NewChild<CData2DKvf>(kPartialClassification, SoilColumnsComputed() && Is(ClassificationType, kPartialAutomatic));
}

void CUnsatzoneKvf::ExchangeKeys(KeyExchange& keys) {
  keys("Bypass", Bypass).OneOf(kMacroporeFlows);
  keys("ClassificationType", ClassificationType).OneOf(kClassifications);
  keys("InitialCondition", InitialCondition).OneOf(kUnsaturatedInitialStates);
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
  NewChild<CData2DKvf>(kClassificationTable, Is(GroundWaterTableOption, kSpecifiedTable));
  AddItemNode();
}

void CUZGroundWaterDepthListKvf::ExchangeKeys(KeyExchange& keys) {
  keys.Count("NumberOfLayers", *this);
  keys("GroundWaterTableOption", GroundWaterTableOption).OneOf(kClassificationTableOptions);
}

}  // namespace tervane
