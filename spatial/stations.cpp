// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/stations.h"

#include <algorithm>
#include <unordered_set>

#include "core/list.h"
#include "platform/file_cache.h"
#include "platform/item_types.h"
#include "platform/units.h"
#include "simspec/conditions.h"
#include "spatial/data2d.h"
#include "spatial/pages.h"

namespace tervane {

namespace {

/// A file over time, of a forcing as a whole or of one of its stations.
ForcingSeries SeriesOf(const DataFileNode& file) {
  ForcingSeries series;
  series.path = file.File.IsEmpty() ? std::string() : file.File.Absolute();
  series.stamps = StampsOf(series.path);
  series.item = file.SelectedItem();
  return series;
}

/// A value or a series.
ForcingSeries SeriesOf(int type, float value, const DataFileNode& file) {
  if (type == CGlobalKvf::kTimeVarying) return SeriesOf(file);
  ForcingSeries series;
  series.constant = static_cast<double>(value);
  return series;
}

}  // namespace

// ---- Parts

CGlobalKvf::CGlobalKvf(std::string title, std::string section, std::vector<int> itemTypes, CYbSEKvfBase* parent)
    : CTvnKvfBase(std::move(title), std::move(section), parent), file_(NewChild<CFMData0DFile>("TIME_SERIES_FILE")) {
  file_->SetMultiItemTypes(std::move(itemTypes));
  file_->UsedWhen(Is(TYPE, kTimeVarying));
}

void CGlobalKvf::ExchangeKeys(KeyExchange& keys) {
  keys("FIXED_VALUE", FIXED_VALUE).Quantity(file_->ItemTypes.front());
  keys.FromOne("TYPE", TYPE).OneOf(kTemporalDistributions);
}

CStationBasedKvf::CStationBasedKvf(CFMSEKvfBase* parent)
    : CTvnKvfBase("Station Based", "STATION_BASED", parent),
      ShapeAxisUnit(BaseUnit(*FindItemType(quantity::kMapCoordinate)).key),
      owner_(*parent),
      gridFile_(NewChild<CTvnData2DNdsFile>(quantity::kCode)),
      shapeFile_(NewChild<CData2DShpFile>()) {
  shapeFile_->SetPolygonShape(1);
  shapeFile_->SetAxisUnit(ShapeAxisUnit);
}

GridSource CStationBasedKvf::CurrentSource() const {
  return TYPE == kGridCodes ? CodesOfGrid(*gridFile_)
                            : CodesOfPolygons(*shapeFile_, ShapeAxisUnit, IdOfItem(owner_, ShapeGapFillName));
}

void CStationBasedKvf::ExchangeKeys(KeyExchange& keys) {
  keys.WriteOnly("NO_TIMESERIES", static_cast<int>(ZoneItems(owner_).size()));
  keys.FromOne("TYPE", TYPE).OneOf(kAreaSources);
  keys("ShapeAxisUnit", ShapeAxisUnit);
  keys("ShapeGapFillName", ShapeGapFillName);
}

void CStationBasedKvf::ReadData(KvfNode* section) {
  int count = 0;
  kvfGetParam(section, "NO_TIMESERIES", &count, 1, 1);
  if (count < 0 || count > kLargestItemCount) {
    kvfAddNote(section, "NO_TIMESERIES", count < 0 ? "a negative count is read as 0" : "the count is cut to 1000000");
    count = std::clamp(count, 0, kLargestItemCount);
  }
  // An old file may hold the forcing in two places: what is read later counts.
  for (CFMSEKvfGroupBase* station : ZoneItems(owner_)) owner_.RemoveChild(station);
  // The parent is walking its children, and goes on to read these.
  for (int number = 1; number <= count; ++number) owner_.AddChild(owner_.CreateStationItem());
  CTvnKvfBase::ReadData(section);
}

CFullyDistributedKvf::CFullyDistributedKvf(int itemType, CYbSEKvfBase* parent)
    : CTvnKvfBase("Fully Distributed", "FULLY_DISTRIBUTED", parent), gridFile_(NewChild<CFMData2DNdsFile>(itemType)) {}

void CFullyDistributedKvf::ReadData(KvfNode* section) {
  CTvnKvfBase::ReadData(section);
  gridFile_->PeriodCheck = TYPE == 1;
}

// ---- Stations

C2DStationBasedDataTimeSeriesKvf::C2DStationBasedDataTimeSeriesKvf(const ForcingKind& kind, CYbSEKvfBase* parent)
    : CFMSEKvfGroupBase(kind.stationTitle, "TIME_SERIES_%d", parent),
      hasElevation_(!kind.correctable.empty()),
      file_(NewChild<CFMData0DFile>("TIME_SERIES_FILE")) {
  SetPage(*kind.stationPage);
  SetAbbreviatedTitle(NAME);
  SetClassName(kind.stationClassName);
  file_->SetMultiItemTypes(kind.itemTypes);
  file_->UsedWhen(Is(TYPE, kTimeVarying));
  TakesPartWhen(IsInParent(&C2DStationBasedDataKvf::DistributionType, {C2DStationBasedDataKvf::kStationBased}));
}

void C2DStationBasedDataTimeSeriesKvf::ExchangeKeys(KeyExchange& keys) {
  keys("NAME", NAME);
  keys("GRIDCODEID", GRIDCODEID);
  keys.WriteOnly("GRIDCODE", StationCode());
  keys("FIXED_VALUE", FIXED_VALUE).Quantity(file_->ItemTypes.front());
  keys.FromOne("TYPE", TYPE).OneOf(kTemporalDistributions);
  if (hasElevation_) keys("Elevation", Elevation).Quantity(quantity::kElevation);
}

void C2DStationBasedDataTimeSeriesKvf::ReadData(KvfNode* section) {
  CFMSEKvfGroupBase::ReadData(section);
  SetAbbreviatedTitle(NAME);
}

int C2DStationBasedDataTimeSeriesKvf::GetNumberWhatAmI() const {
  const CYbSEKvfBase* parent = GetParent();
  if (!parent) return -1;
  // The other children stand in front of all stations.
  int others = 0;
  for (const CYbSEKvfBase* child = parent->GetFirstChild(); child; child = parent->GetNextChild(child)) {
    if (dynamic_cast<const C2DStationBasedDataTimeSeriesKvf*>(child)) break;
    ++others;
  }
  return parent->GetNumberWhatIs(this) - others;
}

// ---- The forcing

ForcingKind C2DStationBasedDataKvf::PlainKind(int itemType) {
  return {.itemTypes = {itemType, quantity::kRainfall},
          .valueTypes = kMeansOrSums,
          .stationTitle = "2D Station Based Data",
          .page = &kStationBasedDataPage,
          .stationPage = &kStationPage};
}

C2DStationBasedDataKvf::C2DStationBasedDataKvf(ForcingKind kind, std::string title, std::string section,
                                               CYbSEKvfBase* parent)
    : CFMSEKvfBase(std::move(title), std::move(section), parent),
      kind_(std::move(kind)),
      global_(NewChild<CGlobalKvf>("Global", "GLOBAL", kind_.itemTypes)) {
  auto stations = std::make_shared<CStationBasedKvf>(this);
  stations_ = stations.get();
  AddChild(std::move(stations));
  fully_ = NewChild<CFullyDistributedKvf>(GetItemType());
  SetClassName(kind_.className);
  SetAbbreviatedTitle(kind_.shortTitle);
  SetPage(*kind_.page);
  const Condition isStationBased = Is(DistributionType, kStationBased);
  global_->SeriesFile().UsedWhen(Is(DistributionType, kUniform) && Is(global_->TYPE, CGlobalKvf::kTimeVarying));
  stations_->GridFile().UsedWhen(isStationBased && Is(stations_->TYPE, CStationBasedKvf::kGridCodes));
  stations_->ShapeFile().UsedWhen(isStationBased && Is(stations_->TYPE, CStationBasedKvf::kPolygons));
  fully_->GridFile().UsedWhen(Is(DistributionType, kFullyDistributed));
}

void C2DStationBasedDataKvf::ExchangeKeys(KeyExchange& keys) {
  keys.FromOne("DistributionType", DistributionType).OneOf(kDistributions);
  if (HasElevation()) keys("Elevation", Elevation).Quantity(quantity::kElevation);
}

std::shared_ptr<CFMSEKvfGroupBase> C2DStationBasedDataKvf::CreateStationItem() {
  return std::make_shared<C2DStationBasedDataTimeSeriesKvf>(kind_, this);
}

ZoneFinder C2DStationBasedDataKvf::Finder() const {
  if (UsesPolygons()) return PolygonFinder(stations_->ShapeFile(), stations_->ShapeAxisUnit);
  if (UsesGridCodes()) return CodeFinder(stations_->GridFile());
  return [](ProgressPart) { return FoundZones(); };
}

SyncResult C2DStationBasedDataKvf::SyncStations(const FoundZones& found) {
  const std::vector<CFMSEKvfGroupBase*> before = ZoneItems(*this);
  const std::unordered_set<const CFMSEKvfGroupBase*> known(before.begin(), before.end());
  const SyncResult result = SyncItems(*this, found);
  for (CFMSEKvfGroupBase* station : ZoneItems(*this))
    if (!known.contains(station)) station->SetTitle(GetTitle());
  const bool isWithoutFile = (UsesPolygons() && stations_->ShapeFile().File.IsEmpty()) ||
                             (UsesGridCodes() && stations_->GridFile().File.IsEmpty());
  return isWithoutFile ? kRemoved : result;
}

CFMSEKvfGroupBase* C2DStationBasedDataKvf::SelectStationByCode(int code) const {
  for (CFMSEKvfGroupBase* station : ZoneItems(*this)) {
    if (station->StationCode() < 1) return nullptr;
    if (station->StationCode() == code) return station;
  }
  return nullptr;
}

CFMSEKvfGroupBase* C2DStationBasedDataKvf::SelectStationByName(const std::string& name) const {
  for (CFMSEKvfGroupBase* station : ZoneItems(*this))
    if (station->GetStationId() == name) return station;
  return nullptr;
}

Forcing C2DStationBasedDataKvf::CurrentForcing() const {
  Forcing forcing;
  forcing.title = GetTitle();
  forcing.itemType = GetItemType();
  if (DistributionType == kFullyDistributed) {
    forcing.overGrid = SeriesOf(fully_->GridFile());
    return forcing;
  }
  if (DistributionType != kStationBased) {
    forcing.series.push_back(SeriesOf(global_->TYPE, global_->FIXED_VALUE, global_->SeriesFile()));
    return forcing;
  }
  forcing.areas = stations_->CurrentSource();
  for (const CFMSEKvfGroupBase* item : ZoneItems(*this)) {
    const auto* station = dynamic_cast<const C2DStationBasedDataTimeSeriesKvf*>(item);
    if (!station) continue;
    ForcingSeries series = SeriesOf(station->TYPE, station->FIXED_VALUE, station->SeriesFile());
    series.name = station->NAME;
    series.id = station->GRIDCODEID;
    forcing.series.push_back(std::move(series));
  }
  return forcing;
}

int C2DStationBasedDataKvf::IsDlgUsedInSetup() {
  if (TakesPartRule().IsAlways() && GetParent()) return GetParent()->IsDlgUsedInSetup();
  return CFMSEKvfBase::IsDlgUsedInSetup();
}

CTimeseriesConstKvf::CTimeseriesConstKvf(int itemType, CYbSEKvfBase* parent)
    : CTvnKvfBase("Time Constant", "Time Constant", parent),
      itemType_(itemType),
      global_(NewChild<CGlobalKvf>("Global", "GLOBAL", std::vector{itemType})) {
  SetPage(kTimeseriesConstPage);
}

Forcing CTimeseriesConstKvf::CurrentForcing() const {
  Forcing forcing;
  forcing.title = GetTitle();
  forcing.itemType = itemType_;
  forcing.series.push_back(SeriesOf(global_->TYPE, global_->FIXED_VALUE, global_->SeriesFile()));
  return forcing;
}

}  // namespace tervane
