// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The aquifer: how its geology is told and what it is divided into for the computation.
#pragma once

#include "spatial/geo_data.h"

namespace tervane {

inline constexpr KeyChoice kDispersions[] = {{0, "No Dispersion"}, {1, "Isotropy"}, {2, "Anisotropy"}};
inline constexpr KeyChoice kGroundParameterDistributions[] = {
    {0, "Assign parameters via geological layers"}, {1, "Assign parameters via geological units within layers"}};
inline constexpr KeyChoice kVerticalDiscretizations[] = {{0, "Defined by geological layers"},
                                                         {1, "Uniform vertical discretization"},
                                                         {2, "Explicit definition of lower levels"}};
inline constexpr KeyChoice kAmbientHeads[] = {{0, "Assume hydrostatic equilibrium"}, {1, "Assign distributed values"}};
inline constexpr KeyChoice kRelativePermeabilities[] = {{0, "Van Genuchten"}, {1, "Brooks-Corey"}};

/// Flags are 0 or 1.
class CSatZoneKvf : public CYbSEKvfBase, public GroundParameterDistribution {
 public:
  explicit CSatZoneKvf(CYbSEKvfBase* parent);

  int DispersionOption = 0;
  int Drainage = 0;
  int ParameterDistribution = 0;  ///< `TypeOfGeoParaDistribution`.
  int TypeOfVerDiscr = 0;
  int Wells = 0;
  int FractureWells = 0;
  float MimimumLayerThickness = 0.5f;
  int id = 1;  ///< What the next geological layer is numbered; it only grows.
  int TypeAmbientWaterHeadInput = 0;
  int TypeOfRelPerm = 0;
  int Threshold = 0;
  int MassTransferToImmobileWater = 0;

  const int& TypeOfGeoParaDistribution() const override { return ParameterDistribution; }

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};
inline constexpr ImportantName<CSatZoneKvf> kSaturatedZone{"SATZONE"};

}  // namespace tervane
