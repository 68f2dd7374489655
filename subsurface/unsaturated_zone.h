// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The soil between the ground and the water table: how its columns are classified, macropores, initial conditions.
#pragma once

#include "core/list.h"
#include "wqpt/ground.h"

namespace tervane {

class CData2DKvf;

class CUnsatzoneKvf : public CYbSEKvfBase, public MacroporeChoice {
 public:
  explicit CUnsatzoneKvf(CYbSEKvfBase* parent);

  enum MacroporeFlow : int { kNoMacropores = 0, kSimpleBypass = 1, kFullMacroporeFlow = 2 };
  enum Classification : int { kAutomatic = 0, kSpecifiedPoints = 1, kAllCells = 2, kPartialAutomatic = 3 };
  enum Initial : int { kEquilibrium = 0, kMatrixPotential = 1, kWaterContent = 2 };

  int Bypass = kNoMacropores;
  int ClassificationType = kAllCells;
  int InitialCondition = kEquilibrium;
  float Max_MP_Infiltration_Per_TimeStep = 1;
  float Max_MP_Node_Exchange_Per_TimeStep = 0.5f;
  float Max_MP_Column_Exchange_Per_TimeStep = 2;
  int USE_Green_And_Ampt = 0;  ///< 0 or 1.

  /// Of soils of two layers: how far below ground water still rises to the plants.
  CData2DKvf& EtSurfaceDepth() const { return *etSurfaceDepth_; }

  const int& GetBypass() const override { return Bypass; }
  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  CData2DKvf* etSurfaceDepth_;
};
inline constexpr ImportantName<CUnsatzoneKvf> kUnsaturatedZone{"Unsatzone"};

/// Columns of the soil are computed cell by cell: by the Richards equation or by gravity flow.
Condition SoilColumnsComputed();
/// The soil is two layers of water.
Condition TwoLayerMethod();
/// A key of the unsaturated zone has that value; where the tree has no such zone, none.
Condition UnsaturatedZoneIs(int CUnsatzoneKvf::*key, std::vector<int> values);
Condition GreenAndAmptUsed();

/// A depth of the groundwater for which columns are classified.
class CUZGroundWaterDepthItemKvf : public CYbSEKvfBase {
 public:
  explicit CUZGroundWaterDepthItemKvf(CYbSEKvfBase* parent)
      : CYbSEKvfBase("Ground Water Depth", "UZGroundWaterDepth%d", parent) {}

  float Depth = 1;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

class CUZGroundWaterDepthListKvf : public CYbSEKvfListBase<CUZGroundWaterDepthItemKvf> {
 public:
  explicit CUZGroundWaterDepthListKvf(CYbSEKvfBase* parent);

  enum Table : int { kInitialTable = 0, kSpecifiedTable = 1 };
  int GroundWaterTableOption = kInitialTable;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

}  // namespace tervane
