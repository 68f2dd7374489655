// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/station_owner.h"

#include "simspec/conditions.h"

namespace tervane {

namespace {

constexpr ZoneSourceKind kStationAreas{.typeKey = "TYPE", .countKey = "NO_TIMESERIES", .hasGlobalZone = false};
constexpr ZoneKey kStationKeys[] = {
    {ZonePart::Name, "NAME"}, {ZonePart::Id, "GRIDCODEID"}, {ZonePart::Code, "GRIDCODE"}};

}  // namespace

// ---- The areas

CStationBasedKvf::CStationBasedKvf(StationOwnerKvf* parent)
    : CTvnKvfBase("Station Based", "STATION_BASED", parent),
      ZoneSource(kStationAreas, Is(parent->DistributionType, StationOwnerKvf::kStationBased), *this, *parent) {}

void CStationBasedKvf::ExchangeKeys(KeyExchange& keys) {
  ExchangeCount(keys);
  ExchangeSourceKeys(keys);
}

void CStationBasedKvf::Load(KvfNode* parentSection) {
  ownersSection_ = parentSection;
  CTvnKvfBase::Load(parentSection);
  ownersSection_ = nullptr;
}

void CStationBasedKvf::ReadData(KvfNode* section) {
  // The parent is walking its children, and goes on to read the stations.
  ReadCount(section, ownersSection_);
  CTvnKvfBase::ReadData(section);
}

// ---- A station

StationKvf::StationKvf(std::string title, CYbSEKvfBase* parent)
    : CodedZoneProp(kStationKeys, std::move(title), "TIME_SERIES_%d", parent) {
  NAME = GRIDCODEID = "Undefined";
  SetAbbreviatedTitle(NAME);
  TakesPartWhen(IsInParent(&StationOwnerKvf::DistributionType, {StationOwnerKvf::kStationBased}));
}

int StationKvf::GetNumberWhatAmI() const {
  const CYbSEKvfBase* parent = GetParent();
  if (!parent) return -1;
  // The other children stand in front of all stations.
  int others = 0;
  for (const CYbSEKvfBase* child = parent->GetFirstChild(); child; child = parent->GetNextChild(child)) {
    if (dynamic_cast<const StationKvf*>(child)) break;
    ++others;
  }
  return parent->GetNumberWhatIs(this) - others;
}

const ZoneSource* StationKvf::AreaSource() const {
  const auto* owner = dynamic_cast<const StationOwnerKvf*>(GetParent());
  return owner ? &owner->Stations() : nullptr;
}

// ---- The owner

void StationOwnerKvf::NewStations() {
  auto stations = std::make_shared<CStationBasedKvf>(this);
  stations_ = stations.get();
  AddChild(std::move(stations));
}

void StationOwnerKvf::ExchangeKeys(KeyExchange& keys) {
  keys.FromOne("DistributionType", DistributionType).OneOf(Distributions());
}

std::shared_ptr<CFMSEKvfGroupBase> StationOwnerKvf::CreateFoundItem() {
  std::shared_ptr<CFMSEKvfGroupBase> station = CreateStationItem();
  station->SetTitle(GetTitle());
  return station;
}

}  // namespace tervane
