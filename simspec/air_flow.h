// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "core/node.h"
#include "simspec/conditions.h"
#include "simspec/pages.h"

namespace tervane {

/// Physical constants of a run with air flow.
class CAirFlowModKvf : public CTvnKvfBase {
 public:
  explicit CAirFlowModKvf(CYbSEKvfBase* parent)
      : CTvnKvfBase("Air Flow Simulation Parameters", "AirFlowSimulationParametersMod", parent) {
    SetPage(kAirFlowModPage);
    TakesPartWhen(
        WithEngine({kEngineModflowSurfact}) && ModflowComponent(&CModModelCompKvf::Subsurface) &&
        Condition::Sentence("the subsurface is variably saturated with air flow", [](const CYbSEKvfBase& node) {
          return ModModelCompOf(node).GetSubsurfaceModelType() == kVariablySaturatedWithAir;
        }));
  }

  float DensityWater = 1000;
  float DensityAir = 1.777f;  ///< At reference pressure.
  float ViscosityWater = 0.001f;
  float ViscosityAir = 1.983e-5f;
  float CompressibilityWater = 1e-8f;
  float CompressibilityAir = 1.777e-5f;
  float StdAtmPressure = 1010;
  float GravityAcceleration = 9.81f;
  int TypeAmbientWaterHeadInput = 0;

 protected:
  void ExchangeKeys(KeyExchange& keys) override {
    keys("DensityWater", DensityWater);
    keys("DensityAir", DensityAir);
    keys("ViscosityWater", ViscosityWater);
    keys("ViscosityAir", ViscosityAir);
    keys("CompressibilityWater", CompressibilityWater);
    keys("CompressibilityAir", CompressibilityAir);
    keys("StdAtmPressure", StdAtmPressure);
    keys("GravityAcceleration", GravityAcceleration);
    keys("TypeAmbientWaterHeadInput", TypeAmbientWaterHeadInput);
  }
};

}  // namespace tervane
