// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "surface/vegetation.h"

#include <cmath>

#include "platform/item_types.h"
#include "simspec/conditions.h"
#include "spatial/stations.h"
#include "surface/pages.h"

namespace tervane {

namespace {

constexpr int kLastVersionOfOneSectionName = 4;

/// A series of one quantity. Both had one section name until version 4.
CFMData0DFile* NewSeriesFile(CYbSEKvfBase& node, const char* section, const char* title, int itemType) {
  auto* file = node.NewChild<CFMData0DFile>(section);
  file->SetTitle(title);
  file->SetItemType(itemType);
  file->SetOldSectionName(kLastVersionOfOneSectionName, "TIME_SERIES_FILE");
  return file;
}

/// One of the two quantities.
struct Quantity {
  const char* title;
  int itemType;
  float VegetationCourse::*constant;
  CFMData0DFile& (VegetationCourse::*seriesFile)() const;
  std::vector<double> CropCourse::*ofCrops;
  CFMData2DNdsFile& (CVegetationFullyDistKvf::*gridFile)() const;
};
constexpr Quantity kQuantities[] = {
    {"Leaf Area Index", quantity::kLeafAreaIndex, &VegetationCourse::FIXED_VALUE_LAI, &VegetationCourse::LaiFile,
     &CropCourse::lai, &CVegetationFullyDistKvf::LaiFile},
    {"Root Depth", quantity::kRootDepth, &VegetationCourse::FIXED_VALUE_RD, &VegetationCourse::RootDepthFile,
     &CropCourse::rootDepth, &CVegetationFullyDistKvf::RootDepthFile}};

ForcingSeries SeriesOfCrops(const CVegetationListKvf& crops, const Quantity& quantity) {
  ForcingSeries series;
  const CropDevelopment development = crops.Development();
  series.problem = development.problem;
  if (!series.problem.empty()) return series;
  const std::vector<std::int64_t>& times = development.course.times;
  const std::vector<double>& values = development.course.*quantity.ofCrops;
  series.lines.emplace();
  for (std::size_t i = 1; i < times.size(); ++i)
    if (times[i] > times[i - 1] && !std::isnan(values[i]) && !std::isnan(values[i - 1]))
      series.lines->push_back({times[i - 1], times[i], values[i - 1], values[i]});
  return series;
}

ForcingSeries SeriesOf(const VegetationCourse& course, const Quantity& quantity) {
  if (course.TYPE == VegetationCourse::kCrops) return SeriesOfCrops(course.Crops(), quantity);
  return ForcingSeriesOf(course.TYPE == VegetationCourse::kTimeVarying, course.*quantity.constant,
                         (course.*quantity.seriesFile)());
}

/// A grid of one quantity.
class VegetationGridFile : public CFMData2DNdsFile {
 public:
  VegetationGridFile(const int& temporal, const char* title, int itemType, CYbSEKvfBase* parent)
      : CFMData2DNdsFile(itemType, parent), temporal_(temporal) {
    SetTitle(title);
    SetClassName("CFMData2DNdsFile");
  }

  DataFileRequest SelectionRequest() const override {
    DataFileRequest request = CFMData2DNdsFile::SelectionRequest();
    if (temporal_ == CVegetationFullyDistKvf::kConstant) request.steps = 1;
    return request;
  }

 private:
  const int& temporal_;
};

}  // namespace

// ---- How it develops

VegetationCourse::VegetationCourse(Form form, Condition isInForce, CYbSEKvfBase& node)
    : TYPE(form),
      node_(node),
      isInForce_(std::move(isInForce)),
      laiFile_(NewSeriesFile(node, "TIME_SERIES_FILE_1", "LAI time series file", quantity::kLeafAreaIndex)),
      rootDepthFile_(NewSeriesFile(node, "TIME_SERIES_FILE_2", "RD time series file", quantity::kRootDepth)),
      crops_(node.NewChild<CVegetationListKvf>(IsOfForm(kCrops))) {
  laiFile_->UsedWhen(IsOfForm(kTimeVarying));
  rootDepthFile_->UsedWhen(IsOfForm(kTimeVarying));
}

void VegetationCourse::ExchangeCourseKeys(KeyExchange& keys) {
  keys("FIXED_VALUE_LAI", FIXED_VALUE_LAI).Quantity(quantity::kLeafAreaIndex).AtLeast(0);
  keys("FIXED_VALUE_RD", FIXED_VALUE_RD).Quantity(quantity::kRootDepth).AtLeast(0);
  keys.FromOne("TYPE", TYPE).OneOf(kVegetationForms);
}

CVegetationGlobalKvf::CVegetationGlobalKvf(const int& distribution, CYbSEKvfBase* parent)
    : CTvnKvfBase("Global", "GLOBAL", parent),
      VegetationCourse(kConstant, Is(distribution, StationOwnerKvf::kUniform), *this) {}

CVegetationTimeSeriesKvf::CVegetationTimeSeriesKvf(CYbSEKvfBase* parent)
    : StationKvf("Station Data - Vegetation", parent), VegetationCourse(kTimeVarying, {}, *this) {
  SetPage(kVegetationStationPage);
}

void CVegetationTimeSeriesKvf::ExchangeKeys(KeyExchange& keys) {
  StationKvf::ExchangeKeys(keys);
  ExchangeCourseKeys(keys);
}

CVegetationFullyDistKvf::CVegetationFullyDistKvf(const int& distribution, CYbSEKvfBase* parent)
    : CTvnKvfBase("Fully Distributed", "FULLY_DISTRIBUTED", parent),
      files_{NewChild<VegetationGridFile>(TYPE, "LAI grid file", quantity::kLeafAreaIndex),
             NewChild<VegetationGridFile>(TYPE, "RD grid file", quantity::kRootDepth)} {
  for (CFMData2DNdsFile* file : files_) file->UsedWhen(Is(distribution, StationOwnerKvf::kFullyDistributed));
}

void CVegetationFullyDistKvf::ExchangeKeys(KeyExchange& keys) {
  keys.FromOne("TYPE", TYPE).OneOf(kTemporalDistributions);
}

// ---- The whole

CVegetationKvf::CVegetationKvf(CYbSEKvfBase* parent)
    : StationOwnerKvf("Vegetation", "Vegetation", parent), global_(NewChild<CVegetationGlobalKvf>(DistributionType)) {
  SetPage(kVegetationPage);
  TakesPartWhen(OwnEngine() && Component(&CModelCompKvf::ET));
  NewStations();
  fully_ = NewChild<CVegetationFullyDistKvf>(DistributionType);
}

std::shared_ptr<CFMSEKvfGroupBase> CVegetationKvf::CreateStationItem() {
  return std::make_shared<CVegetationTimeSeriesKvf>(this);
}

std::vector<Forcing> CVegetationKvf::CurrentForcings() const {
  std::vector<Forcing> forcings;
  if (DistributionType == kFullyDistributed && fully_->TYPE == CVegetationFullyDistKvf::kConstant) return forcings;
  for (const Quantity& quantity : kQuantities) {
    Forcing& forcing = forcings.emplace_back();
    forcing.title = quantity.title;
    forcing.itemType = quantity.itemType;
    if (DistributionType == kFullyDistributed) {
      forcing.overGrid = ForcingSeriesOf((*fully_.*quantity.gridFile)());
      continue;
    }
    if (DistributionType != kStationBased) {
      forcing.series.push_back(SeriesOf(*global_, quantity));
      continue;
    }
    forcing.areas = Stations().CurrentSource();
    for (const CFMSEKvfGroupBase* item : ZoneItems(*this)) {
      const auto* station = dynamic_cast<const CVegetationTimeSeriesKvf*>(item);
      if (!station) continue;
      ForcingSeries series = SeriesOf(*station, quantity);
      series.name = station->NAME;
      series.id = station->GRIDCODEID;
      forcing.series.push_back(std::move(series));
    }
  }
  return forcings;
}

void CVegetationKvf::ExchangeKeys(KeyExchange& keys) {
  StationOwnerKvf::ExchangeKeys(keys);
  keys("C1", C1).Quantity(quantity::kTranspirationParameterC1);
  keys("C2", C2).Quantity(quantity::kTranspirationParameterC2);
  keys("C3", C3).Quantity(quantity::kTranspirationParameterC3);
  keys("C_INT", C_INT).Quantity(quantity::kInterceptionStorage);
  keys("A_ROOT", A_ROOT).Quantity(quantity::kRootMassDistribution);
  keys("ETReduced", ETReduced).Quantity(quantity::kFactor);
}

}  // namespace tervane
