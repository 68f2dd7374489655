// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The soil between the ground and the water table: how its columns are classified, macropores, initial conditions.
#pragma once

#include "core/node.h"

namespace tervane {

inline constexpr KeyChoice kMacroporeFlows[] = {
    {0, "None"}, {1, "Simple by-pass flow"}, {2, "Full macropore flow (Richards and Gravity only)"}};
inline constexpr KeyChoice kColumnClassifications[] = {{0, "1: Automatic"},
                                                       {1, "2: Specified calculation points"},
                                                       {2, "3: Calculated in all grid points"},
                                                       {3, "4: Partial automatic (combination of 1 and 2)"}};
inline constexpr KeyChoice kUnsaturatedInitialConditions[] = {
    {0, "Equilibrium pressure profile"}, {1, "Specified matrix potential"}, {2, "Specified water content"}};

class CUnsatzoneKvf : public CYbSEKvfBase {
 public:
  explicit CUnsatzoneKvf(CYbSEKvfBase* parent);

  int Bypass = 0;
  int ClassificationType = 2;
  int InitialCondition = 0;
  float Max_MP_Infiltration_Per_TimeStep = 1;
  float Max_MP_Node_Exchange_Per_TimeStep = 0.5f;
  float Max_MP_Column_Exchange_Per_TimeStep = 2;
  int USE_Green_And_Ampt = 0;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};
inline constexpr ImportantName<CUnsatzoneKvf> kUnsaturatedZone{"Unsatzone"};

}  // namespace tervane
