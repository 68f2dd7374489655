// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What is given for the whole model, for the area of each station, or for each cell: the owner of the stations,
// whatever quantities they hold.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "spatial/zone_source.h"

namespace tervane {

class StationOwnerKvf;

inline constexpr KeyChoice kDistributions[] = {{0, "Uniform"}, {1, "Station based"}, {2, "Fully distributed"}};

/// How the station areas are given. The stations themselves are children of its parent.
class CStationBasedKvf : public CTvnKvfBase, public ZoneSource {
 public:
  explicit CStationBasedKvf(StationOwnerKvf* parent);

  int& TYPE = Type;  ///< As its section calls it.

  void Load(KvfNode* parentSection) override;
  void ReadData(KvfNode* section) override;
  int ValidateData() override {
    CountCells();
    return 1;
  }

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  const KvfNode* ownersSection_ = nullptr;  ///< In which the stations stand; set while it is loaded.
};

/// A station; what it holds is told by the class.
class StationKvf : public CodedZoneProp {
 public:
  StationKvf(std::string title, CYbSEKvfBase* parent);

  /// Counted among the stations alone.
  int GetNumberWhatAmI() const override;

 protected:
  const ZoneSource* AreaSource() const override;
};

/// The owner. Its constructor makes what holds for the whole model, then calls `NewStations`, then makes what is given
/// for each cell; stations stand behind these.
class StationOwnerKvf : public CFMSEKvfBase {
 public:
  using CFMSEKvfBase::CFMSEKvfBase;

  enum Distribution : int { kUniform = 0, kStationBased = 1, kFullyDistributed = 2 };

  int DistributionType = kUniform;

  CStationBasedKvf& Stations() const { return *stations_; }
  bool UsesGridCodes() const { return stations_->UsesGridCodes(); }
  bool UsesPolygons() const { return stations_->UsesPolygons(); }

  FoundZones FindStations() const { return stations_->FindZones(); }
  SyncPlan PlanStations(const FoundZones& found) { return stations_->PlanZones(found); }
  /// Brings the stations in step; for another distribution than by stations all go.
  SyncResult SyncStations() { return stations_->SyncZones(); }
  CFMSEKvfGroupBase* SelectStationByName(const std::string& name) const { return stations_->SelectZoneByName(name); }
  std::vector<std::string> GetStationNames() const { return stations_->GetZoneTitles(); }

  /// A station that was found bears the title of its owner.
  std::shared_ptr<CFMSEKvfGroupBase> CreateFoundItem() override;

 protected:
  void NewStations();
  /// The choices of a distribution; a constant.
  virtual KeyChoices Distributions() const { return kDistributions; }
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  CStationBasedKvf* stations_ = nullptr;
};

}  // namespace tervane
