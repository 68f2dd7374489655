// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What drives the model from above: precipitation, evapotranspiration, air temperature and radiation, their correction
// for elevation, and snow melt.
#pragma once

#include <string>

#include "platform/item_types.h"
#include "simspec/water_quality_processes.h"
#include "spatial/data2d.h"
#include "spatial/stations.h"

namespace tervane {

// ---- The forcings, found as what they are

inline constexpr ImportantName<C2DStationBasedDataKvf> kPrecipitation{"PRECIPITATION"};
inline constexpr ImportantName<C2DStationBasedDataKvf> kReferenceEvapotranspiration{"POTEVAPTRANS"};
inline constexpr ImportantName<C2DStationBasedDataKvf> kSolarRadiation{"SW Solar Radiation"};
inline constexpr ImportantName<C2DStationBasedDataKvf> kAirTemperature{"AIR TEMPERATURE"};

// ---- Snow

inline constexpr ImportantName<CData2DKvf> kMeltingTemperature{"THRESHMELTTEMP"};
/// Melting for each degree and day.
inline constexpr ImportantName<C2DStationBasedDataKvf> kDegreeDayCoefficient{"DegreeDayFactor"};

/// How snow melts.
class CSnowmeltConstKvf : public CYbSEKvfBase {
 public:
  explicit CSnowmeltConstKvf(CYbSEKvfBase* parent);

  int ThermalMelt = 0;          ///< Whether heat in rain melts snow.
  float MeltCoefficient = 0.5;  ///< Of that heat.
  float SublimationRate = 0;    ///< Factor on the sublimation from dry snow.

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  CData2DKvf* threshold_;
  C2DStationBasedDataKvf* degreeDayCoefficient_;
};
inline constexpr ImportantName<CSnowmeltConstKvf> kSnowMelt{"SNOW MELT CONST"};

// ---- The whole

/// The switches of the climate, and all of the above. Flags are 0 or 1.
class CPrecipitationRelatedKvf : public CTvnKvfBase {
 public:
  explicit CPrecipitationRelatedKvf(CYbSEKvfBase* parent);

  int SM = 0;  ///< Snow melt.
  int CorrectPrecipitation = 0;
  int CorrectAirTemperature = 0;
  int UseWetDryLapseRate = 0;
  int IncludeSolarRadiation = 0;
  // With Modflow.
  enum Recharge : int { kHighestActiveCell = 0, kTopLayer = 1, kGivenLayer = 2 };
  enum Ponding : int { kAsConfined = 0, kUpToPondingElevation = 1 };
  int RechargeOption = kHighestActiveCell;
  int PondingOption = kAsConfined;

  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};
inline constexpr ImportantName<CPrecipitationRelatedKvf> kClimate{"PRECIPITATIONRELATED"};

/// What old files keep beside the climate: they hold the evapotranspiration here, and with Modflow where it is taken
/// from. Read and never written.
class CEvapotransKvf : public CTvnKvfBase {
 public:
  explicit CEvapotransKvf(CYbSEKvfBase* parent);

  int ETLayer = 0;  ///< With Modflow: 0 from the top layer, 1 from a given layer.

  int IsDlgUsedInSetup() override { return 0; }
  void ReadData(KvfNode* section) override;
  void Save(KvfFile* /*file*/) override {}

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys.ReadOnly("ETLayer", ETLayer); }

 private:
  /// Tells of what the file holds here and no later one will.
  void NoteWhatIsLost(KvfNode* section) const;
};
inline constexpr ImportantName<CEvapotransKvf> kOldEvapotranspiration{"Evapotrans"};

}  // namespace tervane
