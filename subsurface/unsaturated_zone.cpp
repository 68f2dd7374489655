// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/unsaturated_zone.h"

#include "simspec/conditions.h"
#include "subsurface/pages.h"

namespace tervane {

CUnsatzoneKvf::CUnsatzoneKvf(CYbSEKvfBase* parent) : CYbSEKvfBase("Unsaturated Flow", "Unsatzone", parent) {
  SetPage(kUnsaturatedZonePage);
  TakesPartWhen(OwnEngine() && Component(&CModelCompKvf::UZ));
}

void CUnsatzoneKvf::ExchangeKeys(KeyExchange& keys) {
  keys("Bypass", Bypass).OneOf(kMacroporeFlows);
  keys("ClassificationType", ClassificationType).OneOf(kColumnClassifications);
  keys("InitialCondition", InitialCondition).OneOf(kUnsaturatedInitialConditions);
  keys("Max_MP_Infiltration_Per_TimeStep", Max_MP_Infiltration_Per_TimeStep).Unit("mm");
  keys("Max_MP_Node_Exchange_Per_TimeStep", Max_MP_Node_Exchange_Per_TimeStep).Unit("mm");
  keys("Max_MP_Column_Exchange_Per_TimeStep", Max_MP_Column_Exchange_Per_TimeStep).Unit("mm");
  keys("USE_Green_And_Ampt", USE_Green_And_Ampt);
}

}  // namespace tervane
