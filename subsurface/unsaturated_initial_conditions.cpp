// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/unsaturated_initial_conditions.h"

#include "simspec/pages.h"
#include "simspec/water_quality_conditions.h"
#include "subsurface/unsaturated_zone.h"
#include "wqpt/species_entries.h"

namespace tervane {

CUnSatInitMatrixPotenLayerListKvf::CUnSatInitMatrixPotenLayerListKvf(CYbSEKvfBase* parent)
    : CUnSatInitConditionLayerListKvf("Initial Matrix Potential", "Initial_Matrix_Potential", parent) {
  TakesPartWhen(UnsaturatedZoneIs(&CUnsatzoneKvf::InitialCondition, {CUnsatzoneKvf::kMatrixPotential}));
}

CUnSatInitWaterConLayerListKvf::CUnSatInitWaterConLayerListKvf(CYbSEKvfBase* parent)
    : CUnSatInitConditionLayerListKvf("Initial Water Content", "Initial_Water_Content", parent) {
  TakesPartWhen(UnsaturatedZoneIs(&CUnsatzoneKvf::InitialCondition, {CUnsatzoneKvf::kWaterContent}));
}

CUnSatInitSoilTempLayerListKvf::CUnSatInitSoilTempLayerListKvf(CYbSEKvfBase* parent)
    : CUnSatInitConditionLayerListKvf("Initial Soil Temperature", "Initial_Soil_Temperature", parent) {
  TakesPartWhen(SoilTemperatureNeeded(SoilCompartment::Unsaturated));
}

CUnSatInitConditionsKvf::CUnSatInitConditionsKvf(CYbSEKvfBase* parent)
    : CYbSEKvfGroupBase("Initial Conditions", "Initial_Conditions", parent) {
  SetHelp("Top.chm", "Initial_Conditions.htm");
  SetPage(kHelpPage);
  NewChild<CUnSatInitMatrixPotenLayerListKvf>();
  NewChild<CUnSatInitWaterConLayerListKvf>();
  NewChild<CUnSatInitSoilTempLayerListKvf>();
  NewChild<CUnSatInitConcenKvf>();
}

}  // namespace tervane
