// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The aquifer: how its geology is told and what it is divided into for the computation.
#pragma once

#include <string>

#include "simspec/modflow_output.h"
#include "spatial/cell_checks.h"
#include "spatial/cell_totals.h"
#include "spatial/geo_data.h"
#include "wqpt/ground.h"

namespace tervane {

class CGeoLayerSZKvf;
class CGeoUnitsSZListKvf;
class CSZVerDiscrLayerGeoListKvf;
class CSZVerDiscrLayerListKvf;

/// Flags are 0 or 1.
class CSatZoneKvf : public CYbSEKvfBase,
                    public GroundParameterDistribution,
                    public ImmobileWaterChoice,
                    public WellChoice,
                    public CellChecker,
                    public TotalsOfQuantities {
 public:
  explicit CSatZoneKvf(CYbSEKvfBase* parent);

  enum Dispersion : int { kNoDispersion = 0, kIsotropy = 1, kAnisotropy = 2 };
  enum Parameters : int { kByLayers = 0, kByUnits = 1 };
  enum Discretization : int { kAsGeology = 0, kUniform = 1, kExplicitLevels = 2 };
  enum AmbientHead : int { kHydrostatic = 0, kDistributedHead = 1 };
  enum RelativePermeability : int { kVanGenuchten = 0, kBrooksCorey = 1 };

  int DispersionOption = kNoDispersion;
  int Drainage = 0;
  int ParameterDistribution = kByLayers;  ///< `TypeOfGeoParaDistribution`.
  int TypeOfVerDiscr = kAsGeology;
  int Wells = 0;
  int FractureWells = 0;
  float MimimumLayerThickness = 0.5f;
  int id = 1;  ///< What the next geological layer is numbered; it only grows.
  int TypeAmbientWaterHeadInput = kHydrostatic;
  int TypeOfRelPerm = kVanGenuchten;
  int Threshold = 0;
  int MassTransferToImmobileWater = 0;

  CGeoUnitsSZListKvf& Units() const { return *units_; }
  CGeoLayerSZKvf& Layers() const { return *layers_; }
  /// The computational layers that have lower levels of their own.
  CSZVerDiscrLayerListKvf& OwnLayers() const { return *ownLayers_; }
  /// Those that follow the geological layers.
  CSZVerDiscrLayerGeoListKvf& LayersOfGeology() const { return *layersOfGeology_; }

  /// That levels lie in order, heads and screens in the ground, and that codes have a unit.
  std::vector<CellCheck> CurrentChecks() const override;
  /// Of what computational layers begin with.
  std::optional<CellTotals> TotalsOf(CData2DKvf& quantity) const override;
  /// With a Modflow engine the zone is called another name.
  const std::string& GetTitle() const override;
  /// Adds a section that tells a viewer of scenes of the wells, where they are included. False, with the reason in
  /// `error`, when their file is not named; the section is complete as far as it goes.
  bool AddWellOverlaySection(KvfFile* file, std::string& error) const;
  const int& TypeOfGeoParaDistribution() const override { return ParameterDistribution; }
  const int& GetMassTransferToImmobileWater() const override { return MassTransferToImmobileWater; }
  const int& GetWells() const override { return Wells; }

  /// Two findings of the whole: a domain whose boundary cannot be traced where segments lie on it, and computational
  /// layers that are not as many as the geological layers that they follow.
  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  CGeoUnitsSZListKvf* units_;
  CGeoLayerSZKvf* layers_;
  CSZVerDiscrLayerListKvf* ownLayers_;
  CSZVerDiscrLayerGeoListKvf* layersOfGeology_;
};
inline constexpr ImportantName<CSatZoneKvf> kSaturatedZone{"SATZONE"};

}  // namespace tervane
