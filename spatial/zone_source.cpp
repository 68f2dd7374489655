// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/zone_source.h"

#include <algorithm>

#include "core/list.h"
#include "platform/item_types.h"
#include "platform/units.h"
#include "spatial/data2d.h"

namespace tervane {

ZoneSource::ZoneSource(const ZoneSourceKind& kind, Condition isInForce, CYbSEKvfBase& node, CFMSEKvfBase& owner)
    : Type(kind.type),
      ShapeAxisUnit(BaseUnit(*FindItemType(quantity::kMapCoordinate)).key),
      kind_(kind),
      isInForce_(std::move(isInForce)),
      node_(node),
      owner_(owner),
      gridFile_(node.NewChild<CTvnData2DNdsFile>(quantity::kCode)),
      shapeFile_(node.NewChild<CData2DShpFile>()) {
  gridFile_->UsedWhen(ByCodes());
  shapeFile_->UsedWhen(ByPolygons());
  shapeFile_->SetPolygonShape(1);
  shapeFile_->SetAxisUnit(ShapeAxisUnit);
}

void ZoneSource::ExchangeSourceKeys(KeyExchange& keys) {
  keys.FromOne(kind_.typeKey, Type).OneOf(kind_.types);
  keys("ShapeAxisUnit", ShapeAxisUnit);
  if (kind_.hasGapFill) keys("ShapeGapFillName", ShapeGapFillName);
}

void ZoneSource::ExchangeCount(KeyExchange& keys) {
  if (HasZones()) keys.WriteOnly(kind_.countKey, static_cast<int>(ZoneItems(owner_).size()));
}

void ZoneSource::ReadCount(KvfNode* section, const KvfNode* zones) {
  if (!HasZones()) return;
  int count = 0;
  if (!kvfGetParam(section, kind_.countKey, &count, 1, 1)) return;
  count = CountToTake(section, kind_.countKey, count, zones);
  // An old file may hold the zones in two places: what is read later counts.
  for (CFMSEKvfGroupBase* zone : ZoneItems(owner_)) owner_.RemoveChild(zone);
  for (int number = 1; number <= count; ++number) owner_.AddChild(owner_.CreateStationItem());
}

ZoneFinder ZoneSource::Finder() const {
  if (UsesPolygons()) return PolygonFinder(*shapeFile_, ShapeAxisUnit);
  if (UsesGridCodes()) return CodeFinder(*gridFile_, kind_.noValues);
  return [](ProgressPart) { return FoundZones(); };
}

GridSource ZoneSource::CurrentSource() const {
  if (UsesGridCodes()) return CodesOfGrid(*gridFile_);
  if (UsesPolygons()) return CodesOfPolygons(*shapeFile_, ShapeAxisUnit, IdOfItem(owner_, ShapeGapFillName));
  return {};
}

SyncPlan ZoneSource::PlanZones(const FoundZones& found) {
  if (!HasZones()) return {};
  return !IsInForce() && kind_.hasGlobalZone ? PlanGlobalItem(owner_) : PlanSync(owner_, found);
}

SyncResult ZoneSource::SyncZones(const FoundZones& found) {
  if (!HasZones()) return kNothing;
  if (!IsInForce() && kind_.hasGlobalZone) return MakeGlobalItem(owner_);
  const SyncResult result = SyncItems(owner_, found);
  // Without a file there is nothing to keep in step with, and that is said also where nothing was removed.
  return IsWithoutFile() ? kRemoved : result;
}

bool ZoneSource::IsWithoutFile() const {
  if (UsesPolygons()) return shapeFile_->File.IsEmpty();
  if (UsesGridCodes()) return gridFile_->File.IsEmpty();
  return IsInForce();
}

CFMSEKvfGroupBase* ZoneSource::SelectZoneByName(const std::string& name) const {
  for (CFMSEKvfGroupBase* zone : ZoneItems(owner_))
    if (zone->GetStationId() == name) return zone;
  return nullptr;
}

CFMSEKvfGroupBase* ZoneSource::SelectZoneByCode(int code) const {
  for (CFMSEKvfGroupBase* zone : ZoneItems(owner_)) {
    if (zone->StationCode() < 1) return nullptr;
    if (zone->StationCode() == code) return zone;
  }
  return nullptr;
}

void ZoneSource::CountCells() {
  const bool isKnown =
      UsesPolygons() ? shapeFile_->WhyNotValid().empty() : UsesGridCodes() && gridFile_->WhyNotValid().empty();
  cells_ = isKnown && HasZones() ? AreaCellsOf(node_, CurrentSource()) : nullptr;
}

bool ZoneSource::HasNoCell(const std::string& id) const { return cells_ && !cells_->cellsOfId.contains(id); }

// ---- One zone

int CodedZoneProp::ValidateData() {
  const ZoneSource* source = AreaSource();
  if (!source) return 1;
  const std::string id = source->UsesGridCodes() ? std::to_string(StationCode()) : GRIDCODEID;
  if (source->HasNoCell(id))
    AddWarning("It gets no cell of the model: what it holds is used nowhere", std::string(KeyOf(ZonePart::Id)));
  return 1;
}

void CodedZoneProp::ExchangeKeys(KeyExchange& keys) {
  for (const auto& [part, key] : zoneKeys_) {
    switch (part) {
      case ZonePart::Number:
        keys.WriteOnly(key, ProfileSecNumber);
        break;
      case ZonePart::Id:
        keys(key, GRIDCODEID);
        break;
      case ZonePart::Code:
        keys.WriteOnly(key, StationCode());
        break;
      case ZonePart::Name:
        keys(key, NAME);
        break;
    }
  }
}

void CodedZoneProp::ReadData(KvfNode* section) {
  CFMSEKvfGroupBase::ReadData(section);
  SetAbbreviatedTitle(NAME);
}

std::string_view CodedZoneProp::KeyOf(ZonePart part) const {
  for (const ZoneKey& key : zoneKeys_)
    if (key.part == part) return key.key;
  return {};
}

}  // namespace tervane
