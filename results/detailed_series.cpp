// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/detailed_series.h"

#include "platform/item_types.h"
#include "results/grid_series.h"
#include "results/pages.h"
#include "simspec/river_branches.h"
#include "spatial/domain.h"

namespace tervane {

namespace {

constexpr KeyChoice kRiverQuantities[] = {{CDetailedFvrTSOutputItemKvf::kWaterLevel, "Water Level"},
                                          {CDetailedFvrTSOutputItemKvf::kDischarge, "Discharge"}};

constexpr std::string_view kPointFormat =
    "Import file must be a tab delimited text file with 9 "
    "columns:\nName<TAB>Datatypenumber<TAB>Group<TAB>X<TAB>Y<TAB>Depth<TAB>InclObserved<TAB>Filename<TAB>Itemnumber";
constexpr std::string_view kRiverFormat =
    "Import file must be a tab delimited text file with 7 "
    "columns:\nName<TAB>Datatypenumber<TAB>Branchname<TAB>Chainagenumber<TAB>InclObserved<TAB>Filename<TAB>Itemnumber";

}  // namespace

// ---- Points

std::optional<FileUse> ObservedFile::UsedFile() const {
  std::optional<FileUse> use = CTvnData0DFile::UsedFile();
  if (use) use->isOverTime = true;
  return use;
}

DetailedSeriesItem::DetailedSeriesItem(std::string title, CYbSEKvfBase* list)
    : NamedItemKvf(std::move(title), "Item_%d", {}, list), observed_(NewChild<ObservedFile>("TIME_SERIES_FILE")) {
  observed_->UsedWhen(On(InclObserved));
}

void DetailedSeriesItem::ExchangeKeys(KeyExchange& keys) {
  NamedItemKvf::ExchangeKeys(keys);
  ExchangePlace(keys);
  keys("InclObserved", InclObserved);
}

bool CDetailedTSOutputItemKvf::IsDepthActive() const { return ResultCatalogue::Own().IsDataType3D(HydrComp).value; }

int CDetailedTSOutputItemKvf::ValidateData() {
  if (HydrComp != 0) return 1;
  AddError("Select a hydraulic component i combobox", "HydrComp");
  return 0;
}

void CDetailedTSOutputItemKvf::ExchangePlace(KeyExchange& keys) {
  keys("HydrComp", HydrComp);
  keys("Group", Group);
  keys("X", X).Quantity(quantity::kMapCoordinate);
  keys("Y", Y).Quantity(quantity::kMapCoordinate);
  keys("Z", Z).Quantity(quantity::kDepthBelowGround);
}

int CDetailedFvrTSOutputItemKvf::ValidateData() {
  // The network may still be made, so that what it lacks is no error.
  const RiverBranches branches = RiverBranches::Of(*this);
  if (const std::string why = branches.WhyNoBranch(BranchName); !why.empty())
    AddWarning("The point lies on no branch", "BranchName", why);
  else if (const std::string outside = branches.WhyOutside(BranchName, static_cast<double>(Chainage)); !outside.empty())
    AddWarning("The point lies outside its branch", "Chainage", outside);
  return 1;
}

void CDetailedFvrTSOutputItemKvf::ExchangePlace(KeyExchange& keys) {
  keys("DataType", DataType).OneOf(kRiverQuantities);
  keys("BranchName", BranchName);
  keys("Chainage", Chainage).Quantity(quantity::kChainage);
}

// ---- Lists

CDetailedTSOutputListKvf::CDetailedTSOutputListKvf(CYbSEKvfBase* storing)
    : DetailedSeriesList("Detailed Time Series Output", "DetailedTimeseriesOutput", storing) {
  SetPage(kDetailedSeriesPage);
}

void CDetailedTSOutputListKvf::ExchangeKeys(KeyExchange& keys) {
  keys.Count("NumberOfItems", *this);
  keys.OrZero("MinimumOutputTimestep", MinimumOutputTimestep).Unit("hrs").AtLeast(0);
}

std::string CDetailedTSOutputListKvf::GetChoiceText() const {
  auto* types = Important(kOutputGridSeries);
  return types ? types->GetChoiceText() : std::string();
}

CCatchmentKvf* CDetailedTSOutputListKvf::GetCatchmentGrid() const { return Important(kDomain); }

bool CDetailedTSOutputListKvf::StartFirstPlot() {
  CDetailedTSOutputItemKvf* first = GetItem(1);
  if (!first || first->Group == 1) return false;
  first->Group = 1;
  return true;
}

DetailedImport CDetailedTSOutputListKvf::ImportFile(const std::string& path, const std::string& setupPath) {
  return ImportDetailedPoints(*this, path, setupPath, kPointFormat);
}

CDetailedFvrTSOutputListKvf::CDetailedFvrTSOutputListKvf(CYbSEKvfBase* storing)
    : DetailedSeriesList("Detailed River Time Series Output", "DetailedFvrTimeseriesOutput", storing) {
  SetPage(kDetailedRiverSeriesPage);
}

void CDetailedFvrTSOutputListKvf::ExchangeKeys(KeyExchange& keys) {
  keys.Count("NumberOfItems", *this);
  keys("MinimumOutputTimestep", MinimumOutputTimestep).Unit("hrs").AtLeast(0);
}

DetailedImport CDetailedFvrTSOutputListKvf::ImportFile(const std::string& path, const std::string& setupPath) {
  return ImportDetailedPoints(*this, path, setupPath, kRiverFormat);
}

}  // namespace tervane
