// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What drives the model from above: precipitation, evapotranspiration, air temperature and radiation, their correction
// for elevation, and snow melt.
#pragma once

#include <string>

#include "spatial/data2d.h"
#include "spatial/stations.h"

namespace tervane {

// ---- What the climate asks of water quality. Where the tree has no such node, the answer is no.

/// The list of decay processes, "DECAY_LIST".
class DecayProcessList {
 public:
  virtual ~DecayProcessList() = default;
  /// Whether a process of the list depends on temperature.
  virtual bool IsAnyTemperatureDependent() const = 0;
};

/// The process templates, "KINETRASPEC".
class ProcessTemplates {
 public:
  virtual ~ProcessTemplates() = default;
  /// Whether a template in use takes that input from the setup.
  virtual bool IsBuiltInUsed(int code) const = 0;

  static constexpr int kAirTemperature = 2020;
  static constexpr int kSolarRadiation = 2030;
};

// ---- The forcings

/// A station of precipitation.
class CPrecTimeSeriesKvf : public C2DStationBasedDataTimeSeriesKvf {
 public:
  using C2DStationBasedDataTimeSeriesKvf::C2DStationBasedDataTimeSeriesKvf;
};

class CPrecipitationKvf : public ForcingOf<CPrecTimeSeriesKvf> {
 public:
  explicit CPrecipitationKvf(CYbSEKvfBase* parent);
  bool IsCorrectedForElevation() const override;
};

/// A station of evapotranspiration.
class CPotEvapTransTimeSeriesKvf : public C2DStationBasedDataTimeSeriesKvf {
 public:
  using C2DStationBasedDataTimeSeriesKvf::C2DStationBasedDataTimeSeriesKvf;
};

/// Evapotranspiration of the reference crop.
class CPotEvapTransKvf : public ForcingOf<CPotEvapTransTimeSeriesKvf> {
 public:
  explicit CPotEvapTransKvf(CYbSEKvfBase* parent);
  int IsDlgUsedInSetup() override;
};

/// A station of air temperature.
class CSnowmeltTimeSeriesKvf : public C2DStationBasedDataTimeSeriesKvf {
 public:
  using C2DStationBasedDataTimeSeriesKvf::C2DStationBasedDataTimeSeriesKvf;
};

/// Air temperature.
class CSnowmeltKvf : public ForcingOf<CSnowmeltTimeSeriesKvf> {
 public:
  CSnowmeltKvf(int itemType, CYbSEKvfBase* parent);
  bool IsCorrectedForElevation() const override;
  int IsDlgUsedInSetup() override;
  void Load(KvfNode* parentSection) override;
};

class CSwSolarRadiation : public C2DStationBasedDataKvf {
 public:
  explicit CSwSolarRadiation(CYbSEKvfBase* parent);
  int IsDlgUsedInSetup() override;
};

// ---- Over the model area

class CPrecipitationLapseRateKvf : public CData2DKvf {
 public:
  explicit CPrecipitationLapseRateKvf(CYbSEKvfBase* parent);
  int IsDlgUsedInSetup() override;
};

class CTemperatureLapseRateKvf : public CData2DKvf {
 public:
  explicit CTemperatureLapseRateKvf(CYbSEKvfBase* parent);
  int IsDlgUsedInSetup() override;
};

/// The temperature's lapse rate in rain.
class CWetLapseRateKvf : public CData2DKvf {
 public:
  explicit CWetLapseRateKvf(CYbSEKvfBase* parent);
  int IsDlgUsedInSetup() override;
};

// ---- Snow

/// A quantity of the snow cover.
class SnowData2D : public CData2DKvf {
 public:
  SnowData2D(Data2DKind kind, std::string abbreviatedTitle, CYbSEKvfBase* parent);
  int IsDlgUsedInSetup() override;
};

class CThreshMeltTempKvf : public SnowData2D {
 public:
  explicit CThreshMeltTempKvf(CYbSEKvfBase* parent)
      : SnowData2D({"ThreshMeltTemp", "Threshold Melting Temperature", 100006}, "Melting temperature", parent) {}
};

/// Melting for each degree and day.
class CDegreeDayFactor : public C2DStationBasedDataKvf {
 public:
  explicit CDegreeDayFactor(CYbSEKvfBase* parent);
  int IsDlgUsedInSetup() override;
};

/// Melting by short wave radiation.
class CRadMeltingCoeffKvf : public SnowData2D {
 public:
  explicit CRadMeltingCoeffKvf(CYbSEKvfBase* parent)
      : SnowData2D({"RadMeltingCoeff", "Melting Coefficient for Adsorption of Solar Radiation", 110050},
                   "Radiation melting Coeff", parent) {}
  int IsDlgUsedInSetup() override;
};

class CMinSnowStorageKvf : public SnowData2D {
 public:
  explicit CMinSnowStorageKvf(CYbSEKvfBase* parent)
      : SnowData2D({"MinSnowStorage", "Minimum Snow Storage for Full Area Coverage", 100146}, "Min snow storage",
                   parent) {}
};

class CMaxWetSnowFracKvf : public SnowData2D {
 public:
  explicit CMaxWetSnowFracKvf(CYbSEKvfBase* parent)
      : SnowData2D({"MaxWetSnowFrac", "Maximum Wet Snow Fraction in Snow Storage", 100239}, "Max Wet Snow Fraction",
                   parent) {}
};

class CInitialTotalSnowStorageKvf : public SnowData2D {
 public:
  explicit CInitialTotalSnowStorageKvf(CYbSEKvfBase* parent)
      : SnowData2D({"InitialSnowStorage", "Initial Total Snow Storage", 100146}, "Initial Total Snow Storage", parent) {
  }
};

class CInitialWetSnowFractionKvf : public SnowData2D {
 public:
  explicit CInitialWetSnowFractionKvf(CYbSEKvfBase* parent)
      : SnowData2D({"InitialWetSnowFrac", "Initial Wet Snow Fraction", 100239}, "Initial Wet Snow Fraction", parent) {}
};

/// How snow melts.
class CSnowmeltConstKvf : public CYbSEKvfBase {
 public:
  explicit CSnowmeltConstKvf(CYbSEKvfBase* parent);

  int ThermalMelt = 0;          ///< Whether heat in rain melts snow.
  float MeltCoefficient = 0.5;  ///< Of that heat, quantity 110051.
  float SublimationRate = 0;    ///< Factor on the sublimation from dry snow, quantity 100144.

  int IsDlgUsedInSetup() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  CThreshMeltTempKvf* threshold_;
  CDegreeDayFactor* degreeDayFactor_;
};

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
  int RechargeOption = 0;  ///< With Modflow: 0 to the highest active cell, 1 to the top layer, 2 to a given layer.
  int PondingOption = 0;   ///< With Modflow: 1 recharges only up to the ponding elevation.

  int IsDlgUsedInSetup() override;
  int ValidateData() override;
  void Load(KvfNode* parentSection) override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// What old files keep beside the climate: they hold the evapotranspiration here. Read and never written.
class CEvapotransKvf : public CTvnKvfBase {
 public:
  explicit CEvapotransKvf(CYbSEKvfBase* parent) : CTvnKvfBase("Evapotranspiration", "Evapotrans", parent) {}

  int ETLayer = 0;  ///< With Modflow: 0 from the top layer, 1 from a given layer.

  int IsDlgUsedInSetup() override { return 0; }
  void ReadData(KvfNode* section) override;
  void Save(KvfFile* /*file*/) override {}

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys.ReadOnly("ETLayer", ETLayer); }
};

}  // namespace tervane
