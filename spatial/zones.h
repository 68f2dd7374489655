// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Zones of the model area with properties of their own: one zone for the whole area, or one for each code of a grid or
// each value of a polygon attribute.
#pragma once

#include <memory>
#include <optional>
#include <string>

#include "core/list.h"
#include "spatial/zone_source.h"

namespace tervane {

/// A reach of a river that a zone drains to.
class CSubcatchmentRiverlinkItemKvf : public CTvnKvfBase {
 public:
  explicit CSubcatchmentRiverlinkItemKvf(CYbSEKvfBase* parent) : CTvnKvfBase("Riverlink", "Riverlink_%d", parent) {}

  std::string Branchname;
  float Upstream = 0;    ///< Chainage.
  float Downstream = 0;  ///< Chainage.

  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// The reaches that a zone drains to, where the default ones are not used.
class CSubcatchmentRiverlinksListKvf : public CYbSEKvfListBase<CSubcatchmentRiverlinkItemKvf> {
 public:
  /// `useDefaults` is the owner's flag that says so.
  CSubcatchmentRiverlinksListKvf(const bool& useDefaults, CYbSEKvfBase* parent);

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys.Count("Noofreaches", *this); }
};

inline constexpr KeyChoice kZoneDistributions[] = {{0, "Uniform"}, {1, "Distributed"}};

/// What makes one parent of zones differ from the next: a row, written where its owner makes it.
struct CodedZonesKind {
  std::string_view className;
  const char* title;
  const char* section;
  ZoneSourceKind source;
  std::optional<int> distribution = 1;  ///< The default; none where zones are always distributed, and no key says so.
  /// A zone as it begins; null for a map of zones without properties.
  std::shared_ptr<CFMSEKvfGroupBase> (*makeZone)(CYbSEKvfBase* parent);
  const PageClass* page;
};

/// `MakeZone<CSubcatchmentPropKvf>`, for a row.
template <class Zone>
std::shared_ptr<CFMSEKvfGroupBase> MakeZone(CYbSEKvfBase* parent) {
  return std::make_shared<Zone>(parent);
}

/// The parent of zones.
class CodedZonesKvf : public CFMSEKvfBase, public ZoneSource {
 public:
  /// `kind` must outlive the node: a constant.
  CodedZonesKvf(const CodedZonesKind& kind, CYbSEKvfBase* parent);

  enum Distribution : int { kUniform = 0, kDistributed = 1 };

  int DistributionType;

  const CodedZonesKind& Kind() const { return kind_; }

  std::shared_ptr<CFMSEKvfGroupBase> CreateStationItem() override;
  void ReadData(KvfNode* section) override;
  void WriteData(KvfFile* file) override;
  int ValidateData() override {
    CountCells();
    return 1;
  }

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
  /// For the constructor of a class whose new nodes have the zones of their source.
  void BeginWithZones() {
    SyncZones();
    NumberZones();
  }

 private:
  void NumberZones();

  const CodedZonesKind& kind_;
};

/// A subcatchment.
class CSubcatchmentPropKvf : public CodedZoneProp {
 public:
  explicit CSubcatchmentPropKvf(CYbSEKvfBase* parent);

  bool DefaultRiverLinks = true;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// The subcatchments, for the routing of overland flow and groundwater by subcatchment.
class CSubcatchmentKvf : public CodedZonesKvf {
 public:
  explicit CSubcatchmentKvf(CYbSEKvfBase* parent);
};
inline constexpr ImportantName<CSubcatchmentKvf> kSubcatchments{"SUBCATCHMENT"};

}  // namespace tervane
