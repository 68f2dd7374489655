// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/zones.h"

#include <algorithm>

#include "platform/item_types.h"
#include "platform/units.h"
#include "simspec/conditions.h"
#include "spatial/data2d.h"
#include "spatial/pages.h"

namespace tervane {

namespace {

constexpr int kMostZones = kLargestItemCount;

}  // namespace

void CSubcatchmentRiverlinkItemKvf::ExchangeKeys(KeyExchange& keys) {
  keys("Branchname", Branchname);
  keys("Upstream", Upstream).Quantity(quantity::kChainage);
  keys("Downstream", Downstream).Quantity(quantity::kChainage);
}

CSubcatchmentRiverlinksListKvf::CSubcatchmentRiverlinksListKvf(const bool& useDefaults, CYbSEKvfBase* parent)
    : CYbSEKvfListBase("River links", "Riverlinks", parent) {
  TakesPartWhen(!On(useDefaults));
  SetPage(kRiverLinksPage);
}

// ---- One zone

void CodedZoneProp::ExchangeKeys(KeyExchange& keys) {
  keys("ProfileSecNumber", ProfileSecNumber);
  keys("GRIDCODEID", GRIDCODEID);
  keys.WriteOnly("GRIDCODE", StationCode());
  keys("Name", Name);
}

void CodedZoneProp::ReadData(KvfNode* section) {
  CFMSEKvfGroupBase::ReadData(section);
  SetAbbreviatedTitle(Name);
}

// ---- The parent of zones

CodedZonesKvf::CodedZonesKvf(std::string title, std::string section, const char* countKey, CYbSEKvfBase* parent)
    : CFMSEKvfBase(std::move(title), std::move(section), parent),
      ShapeAxisUnit(BaseUnit(*FindItemType(quantity::kMapCoordinate)).key),
      countKey_(countKey),
      gridFile_(NewChild<CTvnData2DNdsFile>(quantity::kCode)),
      shapeFile_(NewChild<CData2DShpFile>()) {
  const Condition isDistributed = Is(DistributionType, kDistributed);
  gridFile_->UsedWhen(isDistributed && Is(Type, kGridCodes));
  shapeFile_->UsedWhen(isDistributed && Is(Type, kPolygons));
  shapeFile_->SetPolygonShape(1);
  shapeFile_->SetAxisUnit(ShapeAxisUnit);
}

void CodedZonesKvf::ExchangeKeys(KeyExchange& keys) {
  keys("DistributionType", DistributionType).OneOf(kZoneDistributions);
  keys.FromOne("Type", Type).OneOf(kZoneSources);
  keys("ShapeAxisUnit", ShapeAxisUnit);
  keys("ShapeGapFillName", ShapeGapFillName);
  keys.WriteOnly(countKey_, static_cast<int>(ZoneItems(*this).size()));
}

void CodedZonesKvf::ReadData(KvfNode* section) {
  CFMSEKvfBase::ReadData(section);
  int count = 0;
  kvfGetParam(section, countKey_, &count, 1, 1);
  if (count < 0 || count > kMostZones) {
    kvfAddNote(section, countKey_, count < 0 ? "a negative count is read as 0" : "the count is cut to 1000000");
    count = std::clamp(count, 0, kMostZones);
  }
  for (int number = 1; number <= count; ++number) AddChild(CreateStationItem());
}

void CodedZonesKvf::WriteData(KvfFile* file) {
  int number = 0;
  for (CFMSEKvfGroupBase* zone : ZoneItems(*this))
    if (auto* coded = dynamic_cast<CodedZoneProp*>(zone)) coded->ProfileSecNumber = ++number;
  CFMSEKvfBase::WriteData(file);
}

ZoneFinder CodedZonesKvf::Finder() const {
  if (UsesPolygons()) return PolygonFinder(*shapeFile_, ShapeAxisUnit);
  if (UsesGridCodes()) return CodeFinder(*gridFile_);
  return [](ProgressPart) { return FoundZones(); };
}

GridSource CodedZonesKvf::CurrentSource() const {
  if (UsesGridCodes()) return CodesOfGrid(*gridFile_);
  if (UsesPolygons()) return CodesOfPolygons(*shapeFile_, ShapeAxisUnit, IdOfItem(*this, ShapeGapFillName));
  return {};
}

SyncPlan CodedZonesKvf::PlanZones(const FoundZones& found) {
  return DistributionType == kUniform ? PlanGlobalItem(*this) : PlanSync(*this, found);
}

SyncResult CodedZonesKvf::SyncZones(const FoundZones& found) {
  if (DistributionType == kUniform) return MakeGlobalItem(*this);
  const SyncResult result = SyncItems(*this, found);
  // Without a file there is nothing to keep in step with, and that is said also where nothing was removed.
  const bool isNamed = UsesPolygons() ? !shapeFile_->File.IsEmpty() : !gridFile_->File.IsEmpty();
  return isNamed ? result : kRemoved;
}

CFMSEKvfGroupBase* CodedZonesKvf::SelectZoneByName(const std::string& name) const {
  for (CFMSEKvfGroupBase* zone : ZoneItems(*this))
    if (zone->GetStationId() == name) return zone;
  return nullptr;
}

CFMSEKvfGroupBase* CodedZonesKvf::SelectZoneByCode(int code) const {
  for (CFMSEKvfGroupBase* zone : ZoneItems(*this)) {
    if (zone->StationCode() < 1) return nullptr;
    if (zone->StationCode() == code) return zone;
  }
  return nullptr;
}

// ---- Subcatchments

CSubcatchmentPropKvf::CSubcatchmentPropKvf(CYbSEKvfBase* parent)
    : CodedZoneProp("Subcatchment", "Subcatchment", parent) {
  NewChild<CSubcatchmentRiverlinksListKvf>(DefaultRiverLinks);
  SetPage(kSubcatchmentPropPage);
}

void CSubcatchmentPropKvf::ExchangeKeys(KeyExchange& keys) {
  CodedZoneProp::ExchangeKeys(keys);
  keys("DefaultRiverLinks", DefaultRiverLinks);
}

CSubcatchmentKvf::CSubcatchmentKvf(CYbSEKvfBase* parent)
    : CodedZonesKvf("Subcatchments", "Subcatchments", "NO_ZONES", parent) {
  SetPage(kSubcatchmentPage);
  TakesPartWhen(OwnEngine() &&
                ((Component(&CModelCompKvf::SZ) && Method(&CModelCompKvf::SZ_ModelType, kLinearReservoir)) ||
                 (Component(&CModelCompKvf::OL) && Method(&CModelCompKvf::OL_ModelType, kSubcatchmentOverland))));
}

std::shared_ptr<CFMSEKvfGroupBase> CSubcatchmentKvf::CreateStationItem() {
  return std::make_shared<CSubcatchmentPropKvf>(this);
}

}  // namespace tervane
