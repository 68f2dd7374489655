// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/zones.h"

#include "platform/item_types.h"
#include "simspec/conditions.h"
#include "simspec/river_branches.h"
#include "spatial/pages.h"

namespace tervane {

void CSubcatchmentRiverlinkItemKvf::ExchangeKeys(KeyExchange& keys) {
  keys("Branchname", Branchname);
  keys("Upstream", Upstream).Quantity(quantity::kChainage);
  keys("Downstream", Downstream).Quantity(quantity::kChainage);
}

int CSubcatchmentRiverlinkItemKvf::ValidateData() {
  // The network may still be made, so that what it lacks is no error.
  const RiverBranches branches = RiverBranches::Of(*this);
  if (const std::string why = branches.WhyNoBranch(Branchname); !why.empty()) {
    AddWarning("The river link leads to no branch", "Branchname", why);
    return 1;
  }
  const std::pair<const char*, float> ends[] = {{"Upstream", Upstream}, {"Downstream", Downstream}};
  for (const auto& [key, chainage] : ends)
    if (const std::string why = branches.WhyOutside(Branchname, static_cast<double>(chainage)); !why.empty())
      AddWarning("The river link leaves its branch", key, why);
  return 1;
}

CSubcatchmentRiverlinksListKvf::CSubcatchmentRiverlinksListKvf(const bool& useDefaults, CYbSEKvfBase* parent)
    : CYbSEKvfListBase("River links", "Riverlinks", parent) {
  TakesPartWhen(!On(useDefaults));
  SetPage(kRiverLinksPage);
}

// ---- The parent of zones

CodedZonesKvf::CodedZonesKvf(const CodedZonesKind& kind, CYbSEKvfBase* parent)
    : CFMSEKvfBase(kind.title, kind.section, parent),
      ZoneSource(kind.source, kind.distribution ? Is(DistributionType, kDistributed) : Condition(), *this, *this),
      DistributionType(kind.distribution.value_or(kDistributed)),
      kind_(kind) {
  SetClassName(kind.className);
  SetPage(*kind.page);
}

void CodedZonesKvf::ExchangeKeys(KeyExchange& keys) {
  if (kind_.distribution) keys("DistributionType", DistributionType).OneOf(kZoneDistributions);
  ExchangeSourceKeys(keys);
  ExchangeCount(keys);
}

std::shared_ptr<CFMSEKvfGroupBase> CodedZonesKvf::CreateStationItem() {
  return kind_.makeZone ? kind_.makeZone(this) : nullptr;
}

void CodedZonesKvf::ReadData(KvfNode* section) {
  CFMSEKvfBase::ReadData(section);
  ReadCount(section, section);
}

void CodedZonesKvf::WriteData(KvfFile* file) {
  NumberZones();
  CFMSEKvfBase::WriteData(file);
}

void CodedZonesKvf::NumberZones() {
  int number = 0;
  for (CFMSEKvfGroupBase* zone : ZoneItems(*this))
    if (auto* coded = dynamic_cast<CodedZoneProp*>(zone)) coded->ProfileSecNumber = ++number;
}

// ---- Subcatchments

CSubcatchmentPropKvf::CSubcatchmentPropKvf(CYbSEKvfBase* parent)
    : CodedZoneProp(kZoneKeys, "Subcatchment", "Subcatchment", parent) {
  NewChild<CSubcatchmentRiverlinksListKvf>(DefaultRiverLinks);
  SetPage(kSubcatchmentPropPage);
}

void CSubcatchmentPropKvf::ExchangeKeys(KeyExchange& keys) {
  CodedZoneProp::ExchangeKeys(keys);
  keys("DefaultRiverLinks", DefaultRiverLinks);
}

namespace {

constexpr CodedZonesKind kSubcatchmentZones{.className = "CSubcatchmentKvf",
                                            .title = "Subcatchments",
                                            .section = "Subcatchments",
                                            .source = {.countKey = "NO_ZONES"},
                                            .makeZone = MakeZone<CSubcatchmentPropKvf>,
                                            .page = &kSubcatchmentPage};

}  // namespace

CSubcatchmentKvf::CSubcatchmentKvf(CYbSEKvfBase* parent) : CodedZonesKvf(kSubcatchmentZones, parent) {
  TakesPartWhen(OwnEngine() &&
                ((Component(&CModelCompKvf::SZ) && Method(&CModelCompKvf::SZ_ModelType, kLinearReservoir)) ||
                 (Component(&CModelCompKvf::OL) && Method(&CModelCompKvf::OL_ModelType, kSubcatchmentOverland))));
}

}  // namespace tervane
