// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "surface/climate.h"

#include "simspec/model_components.h"
#include "surface/pages.h"

namespace tervane {

namespace {

constexpr int kLastVersionOfOldNames = 10;

constexpr int kPrecipitationDepth = 100004, kEvapotranspirationDepth = 100005;
constexpr int kTemperature = 100006;

/// The switches of the node's tree; those of a new setup where the tree holds none.
const CPrecipitationRelatedKvf& ClimateOf(const CYbSEKvfBase& node) {
  static const CPrecipitationRelatedKvf defaults(nullptr);
  const auto* climate = node.Important<CPrecipitationRelatedKvf>("PRECIPITATIONRELATED");
  return climate ? *climate : defaults;
}

bool HasSnow(const CYbSEKvfBase& node) { return ClimateOf(node).SM != 0; }

/// Whether processes of water quality of that type are modelled.
bool HasProcesses(const CYbSEKvfBase& node, int processType) {
  const auto* quality = node.Important<CModelCompWQKvf>("MODEL_COMP_WQ");
  return ModelCompOf(node).WQ && quality && quality->IncludeProcesses && quality->ProcessType == processType;
}

bool IsAnyDecayTemperatureDependent(const CYbSEKvfBase& node) {
  const auto* decays = node.Important<DecayProcessList>("DECAY_LIST");
  return HasProcesses(node, 0) && decays && decays->IsAnyTemperatureDependent();
}

bool IsTakenByTemplates(const CYbSEKvfBase& node, int code) {
  const auto* templates = node.Important<ProcessTemplates>("KINETRASPEC");
  return HasProcesses(node, 1) && templates && templates->IsBuiltInUsed(code);
}

}  // namespace

// ---- Forcings

CPrecipitationKvf::CPrecipitationKvf(CYbSEKvfBase* parent)
    : ForcingOf({.itemTypes = {100431, kPrecipitationDepth},
                 .valueTypes = kMeansOrSums,
                 .stationTitle = "Station Data - Precipitation Rate",
                 .correctable = "precipitation",
                 .page = &kPrecipitationPage,
                 .stationPage = &kPrecipitationStationPage},
                "Precipitation Rate", "PrecipitationRate", parent) {}

bool CPrecipitationKvf::IsCorrectedForElevation() const { return ClimateOf(*this).CorrectPrecipitation != 0; }

CPotEvapTransKvf::CPotEvapTransKvf(CYbSEKvfBase* parent)
    : ForcingOf({.itemTypes = {100387, kEvapotranspirationDepth},
                 .valueTypes = kMeansOrSums,
                 .stationTitle = "Station Data - Potential EvapoTranspiration",
                 .page = &kPotEvapTransPage,
                 .stationPage = &kPotEvapTransStationPage},
                "Reference Evapotranspiration", "POTEVAPTRANS", parent) {}

int CPotEvapTransKvf::IsDlgUsedInSetup() { return EngineOf(*this) == kEngineTervane && ModelCompOf(*this).ET; }

CSnowmeltKvf::CSnowmeltKvf(int itemType, CYbSEKvfBase* parent)
    : ForcingOf({.itemTypes = {itemType},
                 .valueTypes = {},
                 .stationTitle = "Station Data - Air Temperature",
                 .correctable = "air temperature",
                 .page = &kAirTemperaturePage,
                 .stationPage = &kAirTemperatureStationPage},
                "Air Temperature", "AirTemperature", parent) {}

bool CSnowmeltKvf::IsCorrectedForElevation() const { return ClimateOf(*this).CorrectAirTemperature != 0; }

int CSnowmeltKvf::IsDlgUsedInSetup() {
  return EngineOf(*this) == kEngineTervane && (HasSnow(*this) || IsAnyDecayTemperatureDependent(*this) ||
                                               IsTakenByTemplates(*this, ProcessTemplates::kAirTemperature));
}

void CSnowmeltKvf::Load(KvfNode* parentSection) { LoadRenamed(kLastVersionOfOldNames, "SNOWMELT", parentSection); }

CSwSolarRadiation::CSwSolarRadiation(CYbSEKvfBase* parent)
    : C2DStationBasedDataKvf(100203, "Short Wave Solar Radiation", "SWSolarRadiation", parent) {
  SetAbbreviatedTitle("SW Solar Radiation");
}

int CSwSolarRadiation::IsDlgUsedInSetup() {
  return ClimateOf(*this).IncludeSolarRadiation || IsTakenByTemplates(*this, ProcessTemplates::kSolarRadiation);
}

// ---- Lapse rates

CPrecipitationLapseRateKvf::CPrecipitationLapseRateKvf(CYbSEKvfBase* parent)
    : CData2DKvf({"PrecipLapseRate", "Precipitation Correction Lapse Rate", 100190}, parent) {
  SetAbbreviatedTitle("Precipitation Lapse Rate");
}

int CPrecipitationLapseRateKvf::IsDlgUsedInSetup() { return ClimateOf(*this).CorrectPrecipitation; }

CTemperatureLapseRateKvf::CTemperatureLapseRateKvf(CYbSEKvfBase* parent)
    : CData2DKvf({"TempLapseRate", "Temperature Correction Lapse Rate", 100189, -0.649F}, parent) {
  SetAbbreviatedTitle("Temperature Lapse Rate");
}

int CTemperatureLapseRateKvf::IsDlgUsedInSetup() { return ClimateOf(*this).CorrectAirTemperature; }

CWetLapseRateKvf::CWetLapseRateKvf(CYbSEKvfBase* parent)
    : CData2DKvf({"WetLapseRate", "Temperature Correction Lapse Rate When Raining", 100189, -0.3F}, parent) {
  SetAbbreviatedTitle("Wet Lapse Rate");
}

int CWetLapseRateKvf::IsDlgUsedInSetup() {
  const CPrecipitationRelatedKvf& climate = ClimateOf(*this);
  return climate.UseWetDryLapseRate && climate.CorrectAirTemperature;
}

// ---- Snow

SnowData2D::SnowData2D(Data2DKind kind, std::string abbreviatedTitle, CYbSEKvfBase* parent)
    : CData2DKvf(std::move(kind), parent) {
  SetAbbreviatedTitle(std::move(abbreviatedTitle));
}

int SnowData2D::IsDlgUsedInSetup() { return HasSnow(*this); }

int CRadMeltingCoeffKvf::IsDlgUsedInSetup() { return HasSnow(*this) && ClimateOf(*this).IncludeSolarRadiation; }

CDegreeDayFactor::CDegreeDayFactor(CYbSEKvfBase* parent)
    : C2DStationBasedDataKvf(100178, "Degree-day Melting or Freezing Coefficient", "DegreeDayFactor", parent) {
  SetAbbreviatedTitle("Degree-day coefficient");
  Global().FIXED_VALUE = 2;
}

int CDegreeDayFactor::IsDlgUsedInSetup() { return HasSnow(*this); }

CSnowmeltConstKvf::CSnowmeltConstKvf(CYbSEKvfBase* parent)
    : CYbSEKvfBase("Snow Melt", "SNOWMELTCONST", parent),
      threshold_(NewChild<CThreshMeltTempKvf>()),
      degreeDayFactor_(NewChild<CDegreeDayFactor>()) {
  SetPage(kSnowMeltPage);
  NewChild<CRadMeltingCoeffKvf>();
  NewChild<CMinSnowStorageKvf>();
  NewChild<CMaxWetSnowFracKvf>();
  NewChild<CInitialTotalSnowStorageKvf>();
  NewChild<CInitialWetSnowFractionKvf>();
  if (!GetRoot()) return;
  GetRoot()->RegisterImportantNode(threshold_, "THRESHMELTTEMP");
  GetRoot()->RegisterImportantNode(degreeDayFactor_, "DegreeDayFactor");
}

int CSnowmeltConstKvf::IsDlgUsedInSetup() { return EngineOf(*this) == kEngineTervane && HasSnow(*this); }

void CSnowmeltConstKvf::ExchangeKeys(KeyExchange& keys) {
  keys("ThermalMelt", ThermalMelt);
  keys("MeltCoefficient", MeltCoefficient);
  keys("SublimationRate", SublimationRate);
  // One number each, for the whole area and all times, until both got nodes of their own.
  keys.Until(kLastVersionOfOldNames, "Threshold", threshold_->FixedValue);
  keys.Until(kLastVersionOfOldNames, "DegreeDayFactor", degreeDayFactor_->Global().FIXED_VALUE);
}

// ---- The whole

CPrecipitationRelatedKvf::CPrecipitationRelatedKvf(CYbSEKvfBase* parent) : CTvnKvfBase("Climate", "Climate", parent) {
  SetPage(kClimatePage);
  const auto registered = [this](CYbSEKvfBase* child, std::string_view name) {
    if (GetRoot()) GetRoot()->RegisterImportantNode(child, name);
  };
  registered(NewChild<CPrecipitationKvf>(), "PRECIPITATION");
  NewChild<CPrecipitationLapseRateKvf>();
  registered(NewChild<CPotEvapTransKvf>(), "POTEVAPTRANS");
  registered(NewChild<CSwSolarRadiation>(), "SW Solar Radiation");
  registered(NewChild<CSnowmeltKvf>(kTemperature), "AIR TEMPERATURE");
  NewChild<CTemperatureLapseRateKvf>();
  NewChild<CWetLapseRateKvf>();
  registered(NewChild<CSnowmeltConstKvf>(), "SNOW MELT CONST");
  NewChild<CDummyEvapoTransKvf>();
  NewChild<CDummyUnSatZoneKvf>();
}

int CPrecipitationRelatedKvf::IsDlgUsedInSetup() {
  return EngineOf(*this) == kEngineTervane || ModModelCompOf(*this).Recharge == 1;
}

int CPrecipitationRelatedKvf::ValidateData() {
  if (EngineOf(*this) != kEngineTervane || ModelCompOf(*this).ET || !SM) return 1;
  AddError("The snowmelt model can only be included if the evapotranspiration model (ET) is included.", "SM");
  return 0;
}

void CPrecipitationRelatedKvf::Load(KvfNode* parentSection) {
  LoadRenamed(kLastVersionOfOldNames, "Precipitation", parentSection);
}

void CPrecipitationRelatedKvf::ExchangeKeys(KeyExchange& keys) {
  keys("SM", SM);
  keys("CorrectPrecipitation", CorrectPrecipitation);
  keys("CorrectAirTemperature", CorrectAirTemperature);
  keys("UseWetDryLapseRate", UseWetDryLapseRate);
  keys("IncludeSolarRadiation", IncludeSolarRadiation);
  keys("RechargeOption", RechargeOption);
  keys("PondingOption", PondingOption);
}

void CEvapotransKvf::ReadData(KvfNode* section) {
  CTvnKvfBase::ReadData(section);
  if (auto* evapotranspiration = Important<CPotEvapTransKvf>("POTEVAPTRANS")) evapotranspiration->Load(section);
}

}  // namespace tervane
