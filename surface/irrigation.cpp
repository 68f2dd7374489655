// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "surface/irrigation.h"

#include <fmt/format.h>

#include "platform/item_types.h"
#include "simspec/conditions.h"
#include "simspec/river_branches.h"
#include "spatial/stations.h"
#include "surface/land_use.h"
#include "surface/pages.h"

namespace tervane {

namespace {

constexpr int kLastVersionWithOneThreshold = 6;
constexpr int kFirstVersionWithLicenses = 9;

constexpr KeyChoice kApplications[] = {{CIrrCommandAreasPropSourceItemKvf::kSprinkler, "Sprinkler"},
                                       {CIrrCommandAreasPropSourceItemKvf::kDrip, "Drip"}};
constexpr KeyChoice kDirectness[] = {{CIrrCommandAreasPropSourceItemKvf::kDirect, "Direct"},
                                     {CIrrCommandAreasPropSourceItemKvf::kOnSheet, "Sheet"}};

constexpr KeyChoice kDemandTypes[] = {{CIrrDemandPropKvf::kUserSpecified, "User specified"},
                                      {CIrrDemandPropKvf::kMaxAllowedDeficit, "Maximum allowed deficit"},
                                      {CIrrDemandPropKvf::kCropStressFactor, "Crop stress factor"},
                                      {CIrrDemandPropKvf::kPondingDepth, "Ponding depth"}};
constexpr KeyChoice kMoistureContents[] = {{CIrrDemandPropKvf::kSaturated, "Saturated"},
                                           {CIrrDemandPropKvf::kFieldCapacity, "Field capacity"}};
constexpr KeyChoice kDemandsInTime[] = {{CIrrDemandPropKvf::kConstant, "Constant"},
                                        {CIrrDemandPropKvf::kSeries, "Timeseries file"},
                                        {CIrrDemandPropKvf::kVegetationProperties, "Vegetation property file (.etv)"}};

const Data2DKind kSheetArea{.className = "CIrrCommandAreas2DKvf",
                            .section = "INDIRECT_APPLICATION_AREA",
                            .title = "Sheet application area",
                            .itemType = quantity::kCode,
                            .mayBeScattered = false,
                            .mayLeaveCells = true};

// The name of these zones stands before their code.
constexpr ZoneKey kAreaKeys[] = {
    {ZonePart::Name, "AreaName"}, {ZonePart::Id, "AreaCodeID"}, {ZonePart::Code, "AreaCode"}};
constexpr ZoneKey kDemandKeys[] = {
    {ZonePart::Name, "DemandName"}, {ZonePart::Id, "DemandCodeID"}, {ZonePart::Code, "DemandCode"}};

constexpr CodedZonesKind kCommandAreas{.className = "CIrrCommandAreasKvf",
                                       .title = "Irrigation command areas",
                                       .section = "CommandAreas",
                                       .source = {.hasGapFill = false, .countKey = "NO_AREAS", .mayLeaveCells = true},
                                       .makeZone = MakeZone<CIrrCommandAreasPropKvf>,
                                       .page = &kCommandAreasPage};
constexpr CodedZonesKind kDemands{.className = "CIrrDemandKvf",
                                  .title = "Irrigation demand",
                                  .section = "Demands",
                                  .source = {.countKey = "NO_DEMANDS", .mayLeaveCells = true},
                                  .makeZone = MakeZone<CIrrDemandPropKvf>,
                                  .page = &kDemandsPage};

constexpr KeyChoice kPrioritySources[] = {{ZoneSource::kGridCodes, "Grid codes (.nds2)"},
                                          {ZoneSource::kPolygons, "Polygons (.shp)", false}};
constexpr CodedZonesKind kPriorities{.className = "CIrrPrioritiesKvf",
                                     .title = "Irrigation priorities",
                                     .section = "Priorities",
                                     .source = {.types = kPrioritySources, .hasGapFill = false, .mayLeaveCells = true},
                                     .makeZone = nullptr,
                                     .page = &kPrioritiesPage};

Condition Irrigates() { return OnInParent(&CLandUseKvf::Irrigation) && IrrigationPossible(); }

}  // namespace

// ---- Sources

void CIrrCommandAreaData0DFile::ExchangeKeys(KeyExchange& keys) {
  if (!keys.Section() || keys.DocVersion() >= kFirstVersionWithLicenses) return CFMData0DFile::ExchangeKeys(keys);
  for (const char* key : {"FILE_NAME", "ITEM_COUNT", "ITEM_NUMBERS"}) kvfMarkKnown(keys.Section(), key);
}

CIrrCommandAreasPropSourceItemKvf::CIrrCommandAreasPropSourceItemKvf(CYbSEKvfBase* parent)
    : CYbSEKvfBase("Irrigation command area item", "Source%d", parent),
      licenseFile_(NewChild<CIrrCommandAreaData0DFile>("TIME_SERIES_FILE")) {
  licenseFile_->SetItemType(quantity::kWaterVolume);
  licenseFile_->UsedWhen(On(IrrigationLicenseIncluded));
}

void CIrrCommandAreasPropSourceItemKvf::SetShownApplication(int application) {
  DirectApplication = application == kSheet ? kOnSheet : kDirect;
  WaterApplication = application == kSheet ? kDrip : application;
}

int CIrrCommandAreasPropSourceItemKvf::ValidateData() {
  if (SourceTypeCode != kRiver) return 1;
  const RiverBranches branches = RiverBranches::Of(*this);
  if (const std::string why = branches.WhyNoBranch(RiverNameRS); !why.empty()) {
    AddWarning("The river source leads to no branch", "RiverNameRS", why);
    return 1;
  }
  const std::pair<const char*, float> ends[] = {{"UpstreamChainageRS", UpstreamChainageRS},
                                                {"DownstreamChainageRS", DownstreamChainageRS}};
  for (const auto& [key, chainage] : ends)
    if (const std::string why = branches.WhyOutside(RiverNameRS, static_cast<double>(chainage)); !why.empty())
      AddWarning("The river source leaves its branch", key, why);
  return 1;
}

void CIrrCommandAreasPropSourceItemKvf::ExchangeKeys(KeyExchange& keys) {
  using namespace quantity;
  keys("SourceTypeCode", SourceTypeCode).OneOf(kSourceKinds);
  keys("WaterApplication", WaterApplication).OneOf(kApplications);
  keys("DirectApplication", DirectApplication).OneOf(kDirectness);
  keys("RiverNameRS", RiverNameRS);
  keys("UpstreamChainageRS", UpstreamChainageRS).Quantity(kHorizontalLength);
  keys("DownstreamChainageRS", DownstreamChainageRS).Quantity(kHorizontalLength);
  // A place in the stead of a reach, wherever a setup holds it.
  float chainage = 0;
  if (keys.Until(KeyInfo::kNoLimit, "RiverChainageRS", chainage)) UpstreamChainageRS = DownstreamChainageRS = chainage;
  keys("CapacityRS", CapacityRS).Quantity(kDischarge);
  float threshold = 0;
  if (keys.Until(kLastVersionWithOneThreshold, "ThresholdDischargeRateRS", threshold)) {
    ThresholdDischargeRateStopRS = threshold;
    ThresholdDischargeRateRestartRS = threshold * 1.01F;
  }
  const auto sinceThresholds = keys.Since(kLastVersionWithOneThreshold + 1);
  sinceThresholds("UseThresholdDischargeRateRS", UseThresholdDischargeRateRS);
  sinceThresholds("ThresholdDischargeRateStopRS", ThresholdDischargeRateStopRS).Quantity(kDischarge);
  sinceThresholds("ThresholdDischargeRateRestartRS", ThresholdDischargeRateRestartRS).Quantity(kDischarge);
  sinceThresholds("UseThresholdStageRS", UseThresholdStageRS);
  sinceThresholds("ThresholdStageStopRS", ThresholdStageStopRS).Quantity(kElevation);
  sinceThresholds("ThresholdStageRestartRS", ThresholdStageRestartRS).Quantity(kElevation);
  keys("WellXposSIWS", WellXposSIWS).Quantity(kHorizontalLength);
  keys("WellYposSIWS", WellYposSIWS).Quantity(kHorizontalLength);
  keys("ScreenTopDepthSIWS", ScreenTopDepthSIWS).Quantity(kDepthBelowGround);
  keys("CapacitySIWS", CapacitySIWS).Quantity(kDischarge);
  keys("ThresholdDepthSIWS", ThresholdDepthSIWS).Quantity(kDepthBelowGround);
  keys("ScreenBottomDepthSIWS", ScreenBottomDepthSIWS).Quantity(kDepthBelowGround);
  keys("ScreenTopDepthSWS", ScreenTopDepthSWS).Quantity(kDepthBelowGround);
  keys("ThresholdDepthSWS", ThresholdDepthSWS).Quantity(kDepthBelowGround);
  keys("CapacitySWS", CapacitySWS).Quantity(kDischarge);
  keys("ScreenBottomDepthSWS", ScreenBottomDepthSWS).Quantity(kDepthBelowGround);
  keys("CapacityES", CapacityES).Quantity(kDischarge);
  keys.WriteOnly("RS_6", ThresholdDischargeRateRestartRS);
  keys.WriteOnly("RS_7", ThresholdStageRestartRS);
  keys.Since(kFirstVersionWithLicenses)("IrrigationLicenseIncluded", IrrigationLicenseIncluded);
  keys.WriteOnly("TYPE", 2);
}

CIrrCommandAreasPropSourceListKvf::CIrrCommandAreasPropSourceListKvf(CYbSEKvfBase* parent)
    : CYbSEKvfListBase("CIrrCommandAreasPropSourceListKvf", "Sources", parent) {
  SetItemCount(1, 1);
}

// ---- Command areas

CIrrCommandAreasPropKvf::CIrrCommandAreasPropKvf(CYbSEKvfBase* parent)
    : CodedZoneProp(kAreaKeys, "Irrigation command area", "CommandArea", parent) {
  SetPage(kCommandAreaPage);
  NewChild<CData2DKvf>(
      kSheetArea,
      Condition::Sentence("a source of the command area is applied as a sheet", [](const CYbSEKvfBase& node) {
        const auto* area = dynamic_cast<const CIrrCommandAreasPropKvf*>(node.GetParent());
        return area && area->HasSheetApplication();
      }));
  sources_ = NewChild<CIrrCommandAreasPropSourceListKvf>();
}

bool CIrrCommandAreasPropKvf::HasSheetApplication() const {
  for (int number = 1; number <= sources_->GetItemCount(); ++number)
    if (sources_->GetItem(number)->DirectApplication == CIrrCommandAreasPropSourceItemKvf::kOnSheet) return true;
  return false;
}

CIrrCommandAreasKvf::CIrrCommandAreasKvf(CYbSEKvfBase* parent) : CodedZonesKvf(kCommandAreas, parent) {
  TakesPartWhen(Irrigates());
}

std::vector<Forcing> CIrrCommandAreasKvf::CurrentForcings() const {
  Forcing licenses;
  licenses.title = "License Limited Irrigation";
  licenses.itemType = quantity::kWaterVolume;
  for (const CFMSEKvfGroupBase* item : ZoneItems(*this)) {
    const auto* area = dynamic_cast<const CIrrCommandAreasPropKvf*>(item);
    if (!area) continue;
    for (int number = 1; number <= area->Sources().GetItemCount(); ++number) {
      const CIrrCommandAreasPropSourceItemKvf& source = *area->Sources().GetItem(number);
      if (!source.LicenseFile().IsFileUsed()) continue;
      ForcingSeries& series = licenses.series.emplace_back(ForcingSeriesOf(source.LicenseFile()));
      series.name = fmt::format("{}, source {}", area->GetStationName(), number);
    }
  }
  if (licenses.series.empty()) return {};
  return {std::move(licenses)};
}

// ---- Demands

namespace {

using Demand = CIrrDemandPropKvf;
constexpr DemandValue kDemandValues[] = {
    {Demand::kUserSpecified, "DemandConstValue", &Demand::DemandConstValue, quantity::kIrrigationDemand,
     "TIME_SERIES_FILE_1", "Demand constant value:", "Demand time series file:", "Demand"},
    {Demand::kMaxAllowedDeficit, "DemandMoistureDeficitStartConst", &Demand::DemandMoistureDeficitStartConst,
     quantity::kFraction, "TIME_SERIES_FILE_2",
     "Moisture deficit start:", "Moisture deficit start:", "Moisture Deficit Start"},
    {Demand::kMaxAllowedDeficit, "DemandMoistureDeficitEndConst", &Demand::DemandMoistureDeficitEndConst,
     quantity::kFraction, "TIME_SERIES_FILE_3",
     "Moisture deficit end:", "Moisture deficit end:", "Moisture Deficit End"},
    {Demand::kCropStressFactor, "CropStressFactorConstValue", &Demand::CropStressFactorConstValue, quantity::kFraction,
     "TIME_SERIES_FILE_4", "Crop stress factor constant value:", "Crop stress factor file:", "Stress Factor"},
    {Demand::kPondingDepth, "PondingDepthConstValue", &Demand::PondingDepthConstValue, quantity::kWaterDepth,
     "TIME_SERIES_FILE_5", "Ponding depth constant value:", "Ponding depth file:", "Ponding Depth"},
};

/// The constants in the order of the file, which is not that of the series.
constexpr std::size_t kOrderOfConstants[] = {1, 2, 0, 3, 4};

}  // namespace

CIrrDemandPropKvf::CIrrDemandPropKvf(CYbSEKvfBase* parent)
    : CodedZoneProp(kDemandKeys, "Irrigation demand", "Demand", parent) {
  SetPage(kDemandPage);
  for (const DemandValue& value : kDemandValues) {
    auto* file = NewChild<CFMData0DFile>(value.fileSection);
    file->SetItemType(value.itemType);
    file->UsedWhen(Is(TYPE, kSeries) && Is(DemandType, value.demandType));
  }
}

std::span<const DemandValue> CIrrDemandPropKvf::Values() { return kDemandValues; }

CFMData0DFile* CIrrDemandPropKvf::DemandFile(std::size_t place) const {
  std::size_t count = 0;
  for (const DemandValue& value : kDemandValues)
    if (value.demandType == DemandType && count++ == place) return &FileOf(value);
  return nullptr;
}

CFMData0DFile& CIrrDemandPropKvf::FileOf(const DemandValue& value) const {
  return dynamic_cast<CFMData0DFile&>(*GetChild(static_cast<int>(&value - kDemandValues) + 1));
}

CFMData0DFile* CIrrDemandPropKvf::GetDemandFile() const { return DemandFile(0); }

CFMData0DFile* CIrrDemandPropKvf::GetDemandEndFile() const { return DemandFile(1); }

void CIrrDemandPropKvf::ExchangeKeys(KeyExchange& keys) {
  CodedZoneProp::ExchangeKeys(keys);
  keys("DemandType", DemandType).OneOf(kDemandTypes);
  keys("DemandReferenceMoistureContent", DemandReferenceMoistureContent).OneOf(kMoistureContents);
  keys("TYPE", TYPE).OneOf(kDemandsInTime);
  for (const std::size_t place : kOrderOfConstants) {
    const DemandValue& value = kDemandValues[place];
    keys(value.key, this->*value.constant).Quantity(value.itemType);
  }
}

CIrrDemandKvf::CIrrDemandKvf(CYbSEKvfBase* parent) : CodedZonesKvf(kDemands, parent) { TakesPartWhen(Irrigates()); }

std::vector<Forcing> CIrrDemandKvf::CurrentForcings() const {
  std::vector<Forcing> forcings;
  for (const DemandValue& value : kDemandValues) {
    Forcing forcing;
    forcing.title = fmt::format("Irrigation: {}", value.chartTitle);
    forcing.itemType = value.itemType;
    for (const CFMSEKvfGroupBase* item : ZoneItems(*this)) {
      const auto* zone = dynamic_cast<const CIrrDemandPropKvf*>(item);
      if (!zone || zone->DemandType != value.demandType) continue;
      // What the vegetation property file wants is known to the engine alone.
      if (zone->TYPE != CIrrDemandPropKvf::kConstant && zone->TYPE != CIrrDemandPropKvf::kSeries) continue;
      ForcingSeries& series = forcing.series.emplace_back(
          ForcingSeriesOf(zone->TYPE == CIrrDemandPropKvf::kSeries, zone->*value.constant, zone->FileOf(value)));
      series.name = zone->GetStationName();
    }
    if (!forcing.series.empty()) forcings.push_back(std::move(forcing));
  }
  return forcings;
}

// ---- Priorities

CIrrPrioritiesKvf::CIrrPrioritiesKvf(CYbSEKvfBase* parent) : CodedZonesKvf(kPriorities, parent) {
  TakesPartWhen(Irrigates() &&
                IsInParent(&CLandUseKvf::Priorities, {CLandUseKvf::kEqualShortage, CLandUseKvf::kEqualVolume}));
}

}  // namespace tervane
