// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What the soil holds when the simulation begins.
#pragma once

#include "spatial/soil_layers.h"

namespace tervane {

class CUnSatInitMatrixPotenLayerListKvf : public CUnSatInitConditionLayerListKvf {
 public:
  explicit CUnSatInitMatrixPotenLayerListKvf(CYbSEKvfBase* parent);
  int GetItemType() const override { return quantity::kPressureHead; }
};

class CUnSatInitWaterConLayerListKvf : public CUnSatInitConditionLayerListKvf {
 public:
  explicit CUnSatInitWaterConLayerListKvf(CYbSEKvfBase* parent);
  int GetItemType() const override { return quantity::kWaterContent; }
};

class CUnSatInitSoilTempLayerListKvf : public CUnSatInitConditionLayerListKvf {
 public:
  explicit CUnSatInitSoilTempLayerListKvf(CYbSEKvfBase* parent);
  int GetItemType() const override { return quantity::kTemperature; }
};

/// All of them.
class CUnSatInitConditionsKvf : public CYbSEKvfGroupBase {
 public:
  explicit CUnSatInitConditionsKvf(CYbSEKvfBase* parent);
};

}  // namespace tervane
