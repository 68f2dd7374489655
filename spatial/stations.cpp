// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/stations.h"

#include "platform/file_cache.h"
#include "platform/item_types.h"
#include "spatial/pages.h"

namespace tervane {

ForcingSeries ForcingSeriesOf(const DataFileNode& file) {
  ForcingSeries series;
  series.path = file.File.IsEmpty() ? std::string() : file.File.Absolute();
  series.stamps = StampsOf(series.path);
  series.item = file.SelectedItem();
  return series;
}

ForcingSeries ForcingSeriesOf(bool isOverTime, float value, const DataFileNode& file) {
  if (isOverTime) return ForcingSeriesOf(file);
  ForcingSeries series;
  series.constant = static_cast<double>(value);
  return series;
}

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

CFullyDistributedKvf::CFullyDistributedKvf(int itemType, CYbSEKvfBase* parent)
    : CTvnKvfBase("Fully Distributed", "FULLY_DISTRIBUTED", parent), gridFile_(NewChild<CFMData2DNdsFile>(itemType)) {}

void CFullyDistributedKvf::ReadData(KvfNode* section) {
  CTvnKvfBase::ReadData(section);
  gridFile_->PeriodCheck = TYPE == 1;
}

// ---- Stations

C2DStationBasedDataTimeSeriesKvf::C2DStationBasedDataTimeSeriesKvf(const ForcingKind& kind, CYbSEKvfBase* parent)
    : StationKvf(kind.stationTitle, parent),
      hasElevation_(!kind.correctable.empty()),
      file_(NewChild<CFMData0DFile>("TIME_SERIES_FILE")) {
  SetPage(*kind.stationPage);
  SetClassName(kind.stationClassName);
  file_->SetMultiItemTypes(kind.itemTypes);
  file_->UsedWhen(Is(TYPE, kTimeVarying));
}

void C2DStationBasedDataTimeSeriesKvf::ExchangeKeys(KeyExchange& keys) {
  StationKvf::ExchangeKeys(keys);
  keys("FIXED_VALUE", FIXED_VALUE).Quantity(file_->ItemTypes.front());
  keys.FromOne("TYPE", TYPE).OneOf(kTemporalDistributions);
  if (hasElevation_) keys("Elevation", Elevation).Quantity(quantity::kElevation);
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
    : StationOwnerKvf(std::move(title), std::move(section), parent),
      kind_(std::move(kind)),
      global_(NewChild<CGlobalKvf>("Global", "GLOBAL", kind_.itemTypes)) {
  NewStations();
  fully_ = NewChild<CFullyDistributedKvf>(GetItemType());
  SetClassName(kind_.className);
  SetAbbreviatedTitle(kind_.shortTitle);
  SetPage(*kind_.page);
  global_->SeriesFile().UsedWhen(Is(DistributionType, kUniform) && Is(global_->TYPE, CGlobalKvf::kTimeVarying));
  fully_->GridFile().UsedWhen(Is(DistributionType, kFullyDistributed));
}

void C2DStationBasedDataKvf::ExchangeKeys(KeyExchange& keys) {
  StationOwnerKvf::ExchangeKeys(keys);
  if (HasElevation()) keys("Elevation", Elevation).Quantity(quantity::kElevation);
}

void C2DStationBasedDataKvf::SetItemTypes(const std::vector<int>& itemTypes, const std::vector<int>& valueTypes) {
  kind_.itemTypes = itemTypes;
  kind_.valueTypes = valueTypes;
  global_->SeriesFile().SetMultiItemTypes(itemTypes);
  fully_->GridFile().SetItemType(GetItemType());
  for (CFMSEKvfGroupBase* item : ZoneItems(*this))
    if (auto* station = dynamic_cast<C2DStationBasedDataTimeSeriesKvf*>(item))
      station->SeriesFile().SetMultiItemTypes(itemTypes);
}

std::shared_ptr<CFMSEKvfGroupBase> C2DStationBasedDataKvf::CreateStationItem() {
  return std::make_shared<C2DStationBasedDataTimeSeriesKvf>(kind_, this);
}

std::vector<Forcing> C2DStationBasedDataKvf::CurrentForcings() const {
  Forcing forcing;
  forcing.title = GetTitle();
  forcing.itemType = GetItemType();
  if (DistributionType == kFullyDistributed) {
    forcing.overGrid = ForcingSeriesOf(fully_->GridFile());
    return {std::move(forcing)};
  }
  if (DistributionType != kStationBased) {
    forcing.series.push_back(
        ForcingSeriesOf(global_->TYPE == CGlobalKvf::kTimeVarying, global_->FIXED_VALUE, global_->SeriesFile()));
    return {std::move(forcing)};
  }
  forcing.areas = Stations().CurrentSource();
  for (const CFMSEKvfGroupBase* item : ZoneItems(*this)) {
    const auto* station = dynamic_cast<const C2DStationBasedDataTimeSeriesKvf*>(item);
    if (!station) continue;
    ForcingSeries series =
        ForcingSeriesOf(station->TYPE == CGlobalKvf::kTimeVarying, station->FIXED_VALUE, station->SeriesFile());
    series.name = station->NAME;
    series.id = station->GRIDCODEID;
    forcing.series.push_back(std::move(series));
  }
  return {std::move(forcing)};
}

int C2DStationBasedDataKvf::IsDlgUsedInSetup() {
  if (TakesPartRule().IsAlways() && GetParent()) return GetParent()->IsDlgUsedInSetup();
  return StationOwnerKvf::IsDlgUsedInSetup();
}

CTimeseriesConstKvf::CTimeseriesConstKvf(int itemType, CYbSEKvfBase* parent)
    : CTvnKvfBase("Time Constant", "Time Constant", parent),
      itemType_(itemType),
      global_(NewChild<CGlobalKvf>("Global", "GLOBAL", std::vector{itemType})) {
  SetPage(kTimeseriesConstPage);
}

std::vector<Forcing> CTimeseriesConstKvf::CurrentForcings() const {
  Forcing forcing;
  forcing.title = GetTitle();
  forcing.itemType = itemType_;
  forcing.series.push_back(
      ForcingSeriesOf(global_->TYPE == CGlobalKvf::kTimeVarying, global_->FIXED_VALUE, global_->SeriesFile()));
  return {std::move(forcing)};
}

}  // namespace tervane
