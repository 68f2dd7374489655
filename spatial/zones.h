// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Zones of the model area with properties of their own: one zone for the whole area, or one for each code of a grid or
// each value of a polygon attribute.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "core/list.h"
#include "spatial/file_nodes.h"
#include "spatial/zone_sync.h"

namespace tervane {

/// A reach of a river that a zone drains to.
class CSubcatchmentRiverlinkItemKvf : public CTvnKvfBase {
 public:
  explicit CSubcatchmentRiverlinkItemKvf(CYbSEKvfBase* parent) : CTvnKvfBase("Riverlink", "Riverlink_%d", parent) {}

  std::string Branchname;
  float Upstream = 0;    ///< Chainage.
  float Downstream = 0;  ///< Chainage.

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

/// A zone: who it is and how it is called. What else it holds is told by the class.
class CodedZoneProp : public CFMSEKvfGroupBase {
 public:
  using CFMSEKvfGroupBase::CFMSEKvfGroupBase;

  int ProfileSecNumber = 0;  ///< The running number among the zones, from 1, given when the parent is written.
  std::string GRIDCODEID;    ///< The grid code or the attribute value, as text.
  std::string Name;

  void SetStationName(const std::string& name) override { Name = name; }
  std::string GetStationName() const override { return Name; }
  void SetStationId(const std::string& id) override { GRIDCODEID = id; }
  std::string GetStationId() const override { return GRIDCODEID; }

  void ReadData(KvfNode* section) override;

 protected:
  /// The keys that every zone begins with.
  void ExchangeKeys(KeyExchange& keys) override;
};

inline constexpr KeyChoice kZoneDistributions[] = {{0, "Uniform"}, {1, "Distributed"}};
inline constexpr KeyChoice kZoneSources[] = {{0, "Grid codes (.nds2)"},
                                             {1, "Polygons (.shp)"}};  ///< One higher in the file.

/// The parent of zones.
class CodedZonesKvf : public CFMSEKvfBase, public CellValues {
 public:
  /// `countKey` is the key of the number of zones.
  CodedZonesKvf(std::string title, std::string section, const char* countKey, CYbSEKvfBase* parent);

  enum Distribution : int { kUniform = 0, kDistributed = 1 };
  enum Source : int { kGridCodes = 0, kPolygons = 1 };

  int DistributionType = kDistributed;
  int Type = kGridCodes;
  int ShapeAxisUnit;             ///< Of the polygons' coordinates, a unit key of item 100187.
  std::string ShapeGapFillName;  ///< Of the zone that fills the cells outside all polygons.

  CTvnData2DNdsFile& GridFile() const { return *gridFile_; }
  CData2DShpFile& ShapeFile() const { return *shapeFile_; }

  bool UsesGridCodes() const { return DistributionType == kDistributed && Type == kGridCodes; }
  bool UsesPolygons() const { return DistributionType == kDistributed && Type == kPolygons; }

  /// Of the codes of the zones.
  GridSource CurrentSource() const override;
  /// What the source holds; nothing is asked for a uniform distribution.
  FoundZones FindZones() const { return Finder()({}); }
  ZoneFinder Finder() const;
  /// What `SyncZones` would do.
  SyncPlan PlanZones(const FoundZones& found);
  /// Brings the zones in step with the source.
  SyncResult SyncZones(const FoundZones& found);
  SyncResult SyncZones() { return SyncZones(FindZones()); }

  std::vector<std::string> GetZoneTitles() const { return ZoneItemTitles(*this); }
  /// The zone of that name, or of that code; null when there is none. By code the search ends at the first zone whose
  /// identity gives a number below 1.
  CFMSEKvfGroupBase* SelectZoneByName(const std::string& name) const;
  CFMSEKvfGroupBase* SelectZoneByCode(int code) const;

  void ReadData(KvfNode* section) override;
  void WriteData(KvfFile* file) override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  const char* countKey_;
  CTvnData2DNdsFile* gridFile_;
  CData2DShpFile* shapeFile_;
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

  std::shared_ptr<CFMSEKvfGroupBase> CreateStationItem() override;
};
inline constexpr ImportantName<CSubcatchmentKvf> kSubcatchments{"SUBCATCHMENT"};

}  // namespace tervane
