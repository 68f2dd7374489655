// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Forcings that vary in space and time: one value or series for the whole model, one for each station area, or a grid
// for each time step.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "data/datafile.h"
#include "spatial/data_use.h"
#include "spatial/file_nodes.h"
#include "spatial/station_owner.h"

namespace tervane {

/// Kinds of value of rates and depths: means over a step, or sums over it.
inline const std::vector<int> kMeansOrSums{static_cast<int>(ValueType::MeanStep),
                                           static_cast<int>(ValueType::StepAccumulated)};

/// What makes one forcing differ from the next.
struct ForcingKind {
  std::string_view className = {};         ///< Of the forcing; that of its type when empty.
  std::string_view stationClassName = {};  ///< The same of its stations.
  std::string shortTitle = {};
  std::vector<int> itemTypes;   ///< What its files may hold. The first is that of values typed on pages.
  std::vector<int> valueTypes;  ///< Of new files, in the order of preference; empty for any.
  std::string stationTitle;
  /// What is corrected for elevation, in words; empty for a forcing without elevations.
  std::string correctable = {};
  Condition correctedWhen = {};  ///< Asked of the forcing; only where something is correctable.
  const PageClass* page;
  const PageClass* stationPage;
};

/// A file over time, of a forcing as a whole or of one of its stations.
ForcingSeries ForcingSeriesOf(const DataFileNode& file);
/// A value or a series: a value unless `isOverTime`.
ForcingSeries ForcingSeriesOf(bool isOverTime, float value, const DataFileNode& file);

/// Texts of a value's two forms in time; in the file one higher.
inline constexpr KeyChoice kTemporalDistributions[] = {{0, "Constant"}, {1, "Time varying (.nds0)"}};

/// A constant or a time series.
class CGlobalKvf : public CTvnKvfBase {
 public:
  CGlobalKvf(std::string title, std::string section, std::vector<int> itemTypes, CYbSEKvfBase* parent);

  enum Temporal : int { kConstant = 0, kTimeVarying = 1 };

  float FIXED_VALUE = 0;
  int TYPE = kConstant;

  CFMData0DFile& SeriesFile() const { return *file_; }

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  CFMData0DFile* file_;
};

/// One grid for each time step.
class CFullyDistributedKvf : public CTvnKvfBase {
 public:
  CFullyDistributedKvf(int itemType, CYbSEKvfBase* parent);

  int TYPE = 0;

  CFMData2DNdsFile& GridFile() const { return *gridFile_; }
  void ReadData(KvfNode* section) override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys.FromOne("TYPE", TYPE); }

 private:
  CFMData2DNdsFile* gridFile_;
};

/// A station with its value or series.
class C2DStationBasedDataTimeSeriesKvf : public StationKvf {
 public:
  C2DStationBasedDataTimeSeriesKvf(const ForcingKind& kind, CYbSEKvfBase* parent);

  enum Temporal : int { kConstant = 0, kTimeVarying = 1 };

  float FIXED_VALUE = 0;
  int TYPE = kTimeVarying;
  float Elevation = 0;  ///< Of the station, quantity 100180; only where the kind has elevations.

  CFMData0DFile& SeriesFile() const { return *file_; }

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  bool hasElevation_;
  CFMData0DFile* file_;
};

/// A forcing.
class C2DStationBasedDataKvf : public StationOwnerKvf, public ForcingNode {
 public:
  /// The kind of a forcing of that quantity, or of precipitation depths, with the usual pages.
  static ForcingKind PlainKind(int itemType);
  C2DStationBasedDataKvf(ForcingKind kind, std::string title, std::string section, CYbSEKvfBase* parent);

  float Elevation = 0;  ///< Of the uniform series, quantity 100180; only where the kind has elevations.

  const ForcingKind& Kind() const { return kind_; }
  /// What the files may hold from now on, and of which value types new ones are; the first item type is that of typed
  /// values.
  void SetItemTypes(const std::vector<int>& itemTypes, const std::vector<int>& valueTypes);
  int GetItemType() const { return kind_.itemTypes.front(); }
  bool HasElevation() const { return !kind_.correctable.empty(); }
  /// Whether the setup corrects the forcing for elevation.
  bool IsCorrectedForElevation() const { return HasElevation() && kind_.correctedWhen.Holds(*this); }
  CGlobalKvf& Global() const { return *global_; }
  CFullyDistributedKvf& FullyDistributed() const { return *fully_; }

  std::shared_ptr<CFMSEKvfGroupBase> CreateStationItem() override;
  std::vector<Forcing> CurrentForcings() const override;
  /// By its rule; without one as its parent does.
  int IsDlgUsedInSetup() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  ForcingKind kind_;
  CGlobalKvf* global_;
  CFullyDistributedKvf* fully_;
};

/// A constant or a time series without anything spatial.
class CTimeseriesConstKvf : public CTvnKvfBase, public ForcingNode {
 public:
  CTimeseriesConstKvf(int itemType, CYbSEKvfBase* parent);

  int GetItemType() const { return itemType_; }
  CGlobalKvf& Global() const { return *global_; }
  std::vector<Forcing> CurrentForcings() const override;

 private:
  int itemType_;
  CGlobalKvf* global_;
};

}  // namespace tervane
