// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Where zones and station areas come from: the codes of a grid, or the values of a polygon attribute. What differs from
// one source, or from one kind of zone, to the next is told in rows.
#pragma once

#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "core/condition.h"
#include "core/key_facts.h"
#include "spatial/data_use.h"
#include "spatial/domain_cells.h"
#include "spatial/file_nodes.h"
#include "spatial/zone_sync.h"

namespace tervane {

/// The kinds of source that most nodes offer.
inline constexpr KeyChoice kZoneSources[] = {{0, "Grid codes (.nds2)"}, {1, "Polygons (.shp)"}};

/// What makes one source of zones differ from the next.
struct ZoneSourceKind {
  std::string_view typeKey = "Type";  ///< Of the kind of source; the file holds it one higher.
  KeyChoices types = kZoneSources;
  int type = 0;                 ///< The default.
  bool hasGapFill = true;       ///< A zone may fill the cells outside all polygons.
  std::string_view countKey{};  ///< Of the number of zones; empty for a map of zones without properties.
  bool mayLeaveCells = false;   ///< The zones are a part of the model; cells outside them are meant.
  bool hasGlobalZone = true;    ///< One zone serves the whole area where the source is not in force; else none is left.
  const char* noValues = FoundZones::kNoValuesInGrid;  ///< What a grid without any code is told with.
};

/// A node's source of zones, for the node to derive from: its keys, and the two files as children of the node.
class ZoneSource : public CellValues {
 public:
  /// `owner` bears the zones; it may be the node itself. `kind` must outlive the source.
  ZoneSource(const ZoneSourceKind& kind, Condition isInForce, CYbSEKvfBase& node, CFMSEKvfBase& owner);

  /// Without a source, as without a file, there are no zones.
  enum Source : int { kNone = -1, kGridCodes = 0, kPolygons = 1 };

  int Type;
  int ShapeAxisUnit;             ///< Of the polygons' coordinates, a unit key of item 100187.
  std::string ShapeGapFillName;  ///< Of the zone that fills the cells outside all polygons.

  const ZoneSourceKind& SourceKind() const { return kind_; }
  CFMSEKvfBase& Owner() const { return owner_; }
  CTvnData2DNdsFile& GridFile() const { return *gridFile_; }
  CData2DShpFile& ShapeFile() const { return *shapeFile_; }

  const Condition& InForce() const { return isInForce_; }
  Condition ByCodes() const { return isInForce_ && Is(Type, kGridCodes); }
  Condition ByPolygons() const { return isInForce_ && Is(Type, kPolygons); }
  bool IsInForce() const { return isInForce_.Holds(node_); }
  bool UsesGridCodes() const { return IsInForce() && Type == kGridCodes; }
  bool UsesPolygons() const { return IsInForce() && Type == kPolygons; }
  bool HasZones() const { return !kind_.countKey.empty(); }

  /// Of the codes of the zones; nothing while the source is not in force.
  GridSource CurrentSource() const override;
  bool MayLeaveCells() const override { return kind_.mayLeaveCells; }
  /// What the source holds; nothing is asked while it is not in force.
  FoundZones FindZones() const { return Finder()({}); }
  ZoneFinder Finder() const;
  /// What `SyncZones` would do.
  SyncPlan PlanZones(const FoundZones& found);
  /// Brings the zones in step with the source.
  SyncResult SyncZones(const FoundZones& found);
  SyncResult SyncZones() { return SyncZones(FindZones()); }

  /// Counts the cells that each area gets, for the validation of the zones.
  void CountCells();
  /// Whether an area of that identity is known to get no cell of the model.
  bool HasNoCell(const std::string& id) const;

  std::vector<std::string> GetZoneTitles() const { return ZoneItemTitles(owner_); }
  /// The zone of that identity, or of that code; null when there is none. By code the search ends at the first zone
  /// whose identity gives a number below 1.
  CFMSEKvfGroupBase* SelectZoneByName(const std::string& name) const;
  CFMSEKvfGroupBase* SelectZoneByCode(int code) const;

 protected:
  void ExchangeSourceKeys(KeyExchange& keys);
  /// Tells the number of zones, where the source has any.
  void ExchangeCount(KeyExchange& keys);
  /// Makes as many zones as the section tells, as far as that is taken; `zones` holds their sections. They are loaded
  /// later, in the walk over the owner's children.
  void ReadCount(KvfNode* section, const KvfNode* zones);

 private:
  /// There is nothing to keep in step with.
  bool IsWithoutFile() const;

  const ZoneSourceKind& kind_;
  Condition isInForce_;
  CYbSEKvfBase& node_;
  CFMSEKvfBase& owner_;
  CTvnData2DNdsFile* gridFile_;
  CData2DShpFile* shapeFile_;
  std::shared_ptr<const AreaCells> cells_;  ///< As of the latest validation; null where they are not known.
};

/// What a key of a zone holds.
enum class ZonePart { Number, Id, Code, Name };
/// The keys that every zone of a kind begins with, in the order of the file.
struct ZoneKey {
  ZonePart part;
  std::string_view key;
};
using ZoneKeys = std::span<const ZoneKey>;

/// The keys of most zones.
inline constexpr ZoneKey kZoneKeys[] = {{ZonePart::Number, "ProfileSecNumber"},
                                        {ZonePart::Id, "GRIDCODEID"},
                                        {ZonePart::Code, "GRIDCODE"},
                                        {ZonePart::Name, "Name"}};

/// A zone or station: who it is and how it is called. What else it holds is told by the class.
class CodedZoneProp : public CFMSEKvfGroupBase {
 public:
  /// `zoneKeys` must outlive the zone: a constant.
  CodedZoneProp(ZoneKeys zoneKeys, std::string title, std::string section, CYbSEKvfBase* parent)
      : CFMSEKvfGroupBase(std::move(title), std::move(section), parent), zoneKeys_(zoneKeys) {}

  int ProfileSecNumber = 0;  ///< The running number among the zones, from 1, given when the parent is written.
  std::string GRIDCODEID;    ///< The grid code or the attribute value, as text.
  std::string NAME;

  void SetStationName(const std::string& name) override { NAME = name; }
  std::string GetStationName() const override { return NAME; }
  void SetStationId(const std::string& id) override { GRIDCODEID = id; }
  std::string GetStationId() const override { return GRIDCODEID; }

  /// What a part of it is called in the file; empty where it has no such part.
  std::string_view KeyOf(ZonePart part) const;

  void ReadData(KvfNode* section) override;
  /// Warns of a zone that gets no cell of the model: what it holds would be used nowhere.
  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
  /// Where its area comes from; null for one that stands alone.
  virtual const ZoneSource* AreaSource() const { return dynamic_cast<const ZoneSource*>(GetParent()); }

 private:
  ZoneKeys zoneKeys_;
};

}  // namespace tervane
