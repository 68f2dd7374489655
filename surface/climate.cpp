// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "surface/climate.h"

#include <fmt/format.h>

#include "platform/item_types.h"
#include "simspec/conditions.h"
#include "simspec/water_quality_conditions.h"
#include "surface/pages.h"
#include "surface/stress_period_grids.h"

namespace tervane {

namespace {

constexpr int kLastVersionOfOldNames = 10;

/// The switches of the node's tree; those of a new setup where the tree holds none.
const CPrecipitationRelatedKvf& ClimateOf(const CYbSEKvfBase& node) {
  static const CPrecipitationRelatedKvf defaults(nullptr);
  const auto* climate = node.Important(kClimate);
  return climate ? *climate : defaults;
}

Condition Switch(int CPrecipitationRelatedKvf::*flag) {
  return On<CPrecipitationRelatedKvf>([](const CYbSEKvfBase& node) { return &ClimateOf(node); }, flag);
}

Condition HasSnow() { return Switch(&CPrecipitationRelatedKvf::SM); }

// ---- Forcings

ForcingKind Precipitation() {
  return {.className = "CPrecipitationKvf",
          .stationClassName = "CPrecTimeSeriesKvf",
          .itemTypes = {quantity::kPrecipitationRate, quantity::kRainfall},
          .valueTypes = kMeansOrSums,
          .stationTitle = "Station Data - Precipitation Rate",
          .correctable = "precipitation",
          .correctedWhen = Switch(&CPrecipitationRelatedKvf::CorrectPrecipitation),
          .page = &kPrecipitationPage,
          .stationPage = &kPrecipitationStationPage};
}

ForcingKind ReferenceEvapotranspiration() {
  return {.className = "CPotEvapTransKvf",
          .stationClassName = "CPotEvapTransTimeSeriesKvf",
          .itemTypes = {quantity::kEvapotranspirationRate, quantity::kEvapotranspirationDepth},
          .valueTypes = kMeansOrSums,
          .stationTitle = "Station Data - Potential EvapoTranspiration",
          .page = &kPotEvapTransPage,
          .stationPage = &kPotEvapTransStationPage};
}

ForcingKind AirTemperature() {
  return {.className = "CSnowmeltKvf",
          .stationClassName = "CSnowmeltTimeSeriesKvf",
          .itemTypes = {quantity::kTemperature},
          .valueTypes = {},
          .stationTitle = "Station Data - Air Temperature",
          .correctable = "air temperature",
          .correctedWhen = Switch(&CPrecipitationRelatedKvf::CorrectAirTemperature),
          .page = &kAirTemperaturePage,
          .stationPage = &kAirTemperatureStationPage};
}

ForcingKind SolarRadiation() {
  ForcingKind kind = C2DStationBasedDataKvf::PlainKind(quantity::kRadiationAndHeatFlux);
  kind.className = "CSwSolarRadiation";
  kind.shortTitle = "SW Solar Radiation";
  return kind;
}

ForcingKind DegreeDayCoefficient() {
  ForcingKind kind = C2DStationBasedDataKvf::PlainKind(quantity::kDegreeDayCoefficient);
  kind.className = "CDegreeDayFactor";
  kind.shortTitle = "Degree-day coefficient";
  return kind;
}

// ---- Over the model area

const Data2DKind kPrecipitationLapseRate{.className = "CPrecipitationLapseRateKvf",
                                         .section = "PrecipLapseRate",
                                         .title = "Precipitation Correction Lapse Rate",
                                         .itemType = quantity::kPrecipitationLapseRate,
                                         .shortTitle = "Precipitation Lapse Rate"};
const Data2DKind kTemperatureLapseRate{.className = "CTemperatureLapseRateKvf",
                                       .section = "TempLapseRate",
                                       .title = "Temperature Correction Lapse Rate",
                                       .itemType = quantity::kTemperatureLapseRate,
                                       .fixedValue = -0.649F,
                                       .shortTitle = "Temperature Lapse Rate"};
const Data2DKind kWetLapseRate{.className = "CWetLapseRateKvf",
                               .section = "WetLapseRate",
                               .title = "Temperature Correction Lapse Rate When Raining",
                               .itemType = quantity::kTemperatureLapseRate,
                               .fixedValue = -0.3F,
                               .shortTitle = "Wet Lapse Rate"};

const Data2DKind kRechargeFraction{.className = "CRechargeFractionModKvf",
                                   .section = "RechargeFraction",
                                   .title = "Recharge Fraction",
                                   .itemType = quantity::kFraction};

const Data2DKind kThresholdTemperature{.className = "CThreshMeltTempKvf",
                                       .section = "ThreshMeltTemp",
                                       .title = "Threshold Melting Temperature",
                                       .itemType = quantity::kTemperature,
                                       .shortTitle = "Melting temperature"};
const Data2DKind kRadiationMelting{.className = "CRadMeltingCoeffKvf",
                                   .section = "RadMeltingCoeff",
                                   .title = "Melting Coefficient for Adsorption of Solar Radiation",
                                   .itemType = quantity::kRadiationMeltCoefficient,
                                   .shortTitle = "Radiation melting Coeff"};
const Data2DKind kSnowCover[] = {{.className = "CMinSnowStorageKvf",
                                  .section = "MinSnowStorage",
                                  .title = "Minimum Snow Storage for Full Area Coverage",
                                  .itemType = quantity::kStorageDepth,
                                  .shortTitle = "Min snow storage"},
                                 {.className = "CMaxWetSnowFracKvf",
                                  .section = "MaxWetSnowFrac",
                                  .title = "Maximum Wet Snow Fraction in Snow Storage",
                                  .itemType = quantity::kFraction,
                                  .shortTitle = "Max Wet Snow Fraction"},
                                 {.className = "CInitialTotalSnowStorageKvf",
                                  .section = "InitialSnowStorage",
                                  .title = "Initial Total Snow Storage",
                                  .itemType = quantity::kStorageDepth,
                                  .shortTitle = "Initial Total Snow Storage"},
                                 {.className = "CInitialWetSnowFractionKvf",
                                  .section = "InitialWetSnowFrac",
                                  .title = "Initial Wet Snow Fraction",
                                  .itemType = quantity::kFraction,
                                  .shortTitle = "Initial Wet Snow Fraction"}};

constexpr KeyChoice kRechargeOptions[] = {
    {CPrecipitationRelatedKvf::kHighestActiveCell,
     "Apply recharge to the highest active cell in each vertical profile"},
    {CPrecipitationRelatedKvf::kTopLayer, "Apply recharge to the top layer only"},
    {CPrecipitationRelatedKvf::kGivenLayer, "Apply recharge to a specific layer"}};
constexpr KeyChoice kPondingOptions[] = {
    {CPrecipitationRelatedKvf::kAsConfined, "Apply recharge as in the confined case"},
    {CPrecipitationRelatedKvf::kUpToPondingElevation, "Apply recharge untill ponding elevation is reached"}};

}  // namespace

// ---- Snow

CSnowmeltConstKvf::CSnowmeltConstKvf(CYbSEKvfBase* parent)
    : CYbSEKvfBase("Snow Melt", "SNOWMELTCONST", parent),
      threshold_(NewImportantChild<CData2DKvf>(kMeltingTemperature, kThresholdTemperature, HasSnow())),
      degreeDayCoefficient_(NewImportantChild<C2DStationBasedDataKvf>(kDegreeDayCoefficient, DegreeDayCoefficient(),
                                                                      "Degree-day Melting or Freezing Coefficient",
                                                                      "DegreeDayFactor")) {
  SetPage(kSnowMeltPage);
  TakesPartWhen(OwnEngine() && HasSnow());
  degreeDayCoefficient_->Global().FIXED_VALUE = 2;
  degreeDayCoefficient_->TakesPartWhen(HasSnow());
  NewChild<CData2DKvf>(kRadiationMelting, HasSnow() && Switch(&CPrecipitationRelatedKvf::IncludeSolarRadiation));
  for (const Data2DKind& kind : kSnowCover) NewChild<CData2DKvf>(kind, HasSnow());
}

void CSnowmeltConstKvf::ExchangeKeys(KeyExchange& keys) {
  keys("ThermalMelt", ThermalMelt);
  keys("MeltCoefficient", MeltCoefficient).Quantity(quantity::kRainHeatMeltCoefficient);
  keys("SublimationRate", SublimationRate).Quantity(quantity::kFactor);
  // One number each, for the whole area and all times, until both got nodes of their own.
  keys.Until(kLastVersionOfOldNames, "Threshold", threshold_->FixedValue);
  keys.Until(kLastVersionOfOldNames, "DegreeDayFactor", degreeDayCoefficient_->Global().FIXED_VALUE);
}

// ---- The whole

CPrecipitationRelatedKvf::CPrecipitationRelatedKvf(CYbSEKvfBase* parent) : CTvnKvfBase("Climate", "Climate", parent) {
  using Climate = CPrecipitationRelatedKvf;
  SetPage(kClimatePage);
  SetOldSectionName(kLastVersionOfOldNames, "Precipitation");
  TakesPartWhen(OwnEngine() || ModflowMethod(&CModModelCompKvf::Recharge, 1));
  const auto forcing = [this](ImportantName<C2DStationBasedDataKvf> name, ForcingKind kind, const char* title,
                              const char* section) {
    return NewImportantChild<C2DStationBasedDataKvf>(name, std::move(kind), title, section);
  };
  forcing(kPrecipitation, Precipitation(), "Precipitation Rate", "PrecipitationRate");
  NewChild<CData2DKvf>(kPrecipitationLapseRate, Switch(&Climate::CorrectPrecipitation));
  forcing(kReferenceEvapotranspiration, ReferenceEvapotranspiration(), "Reference Evapotranspiration", "POTEVAPTRANS")
      ->TakesPartWhen(OwnEngine() && Component(&CModelCompKvf::ET));
  forcing(kSolarRadiation, SolarRadiation(), "Short Wave Solar Radiation", "SWSolarRadiation")
      ->TakesPartWhen(Switch(&Climate::IncludeSolarRadiation) ||
                      TakenByTemplates("solar radiation", ProcessTemplates::kSolarRadiation));
  auto* temperature = forcing(kAirTemperature, AirTemperature(), "Air Temperature", "AirTemperature");
  temperature->SetOldSectionName(kLastVersionOfOldNames, "SNOWMELT");
  temperature->TakesPartWhen(OwnEngine() && (HasSnow() || AnyDecayDependsOnTemperature() ||
                                             TakenByTemplates("air temperature", ProcessTemplates::kAirTemperature)));
  NewChild<CData2DKvf>(kTemperatureLapseRate, Switch(&Climate::CorrectAirTemperature));
  NewChild<CData2DKvf>(kWetLapseRate, Switch(&Climate::UseWetDryLapseRate) && Switch(&Climate::CorrectAirTemperature));
  NewImportantChild<CSnowmeltConstKvf>(kSnowMelt);
  NewNetRainfallFraction(*this);
  NewInfiltrationFraction(*this);
  NewChild<CData2DKvf>(kRechargeFraction, AnyModflow());
  NewChild<CRechargeAndPondingModListKvf>(kRechargeLayer,
                                          AnyModflow() && IsInParent(&Climate::RechargeOption, {kGivenLayer}));
  NewChild<CRechargeAndPondingModListKvf>(
      kPondingElevation,
      WithEngine({kEngineModflowSurfact}) && IsInParent(&Climate::PondingOption, {kUpToPondingElevation}));
}

int CPrecipitationRelatedKvf::ValidateData() {
  if (EngineOf(*this) != kEngineTervane || ModelCompOf(*this).ET || !SM) return 1;
  AddError("The snowmelt model can only be included if the evapotranspiration model (ET) is included.", "SM");
  return 0;
}

void CPrecipitationRelatedKvf::ExchangeKeys(KeyExchange& keys) {
  keys("SM", SM);
  keys("CorrectPrecipitation", CorrectPrecipitation);
  keys("CorrectAirTemperature", CorrectAirTemperature);
  keys("UseWetDryLapseRate", UseWetDryLapseRate);
  keys("IncludeSolarRadiation", IncludeSolarRadiation);
  keys("RechargeOption", RechargeOption).OneOf(kRechargeOptions);
  keys("PondingOption", PondingOption).OneOf(kPondingOptions);
}

// ---- Evapotranspiration as old files have it

CEvapotransKvf::CEvapotransKvf(CYbSEKvfBase* parent) : CTvnKvfBase("Evapotranspiration", "Evapotrans", parent) {
  NewChild<CRechargeAndPondingModListKvf>(kETSurfaceElevation, AnyModflow());
  NewChild<CRechargeAndPondingModListKvf>(kETExtinctionDepth, AnyModflow());
  NewChild<CRechargeAndPondingModListKvf>(kETLayer, AnyModflow() && OnInParent(&CEvapotransKvf::ETLayer));
}

void CEvapotransKvf::ReadData(KvfNode* section) {
  CTvnKvfBase::ReadData(section);
  NoteWhatIsLost(section);
  if (auto* evapotranspiration = Important(kReferenceEvapotranspiration)) evapotranspiration->Load(section);
}

void CEvapotransKvf::NoteWhatIsLost(KvfNode* section) const {
  if (!UsesModflow(*this)) return;
  bool holdsSome = kvfKeywordByNameNum(section, "ETLayer", 1) != nullptr;
  for (const CYbSEKvfBase* list = GetFirstChild(); list; list = GetNextChild(list))
    holdsSome = holdsSome || kvfSectionByNameNum(section, list->GetSectionName(), 1) != nullptr;
  if (holdsSome)
    kvfAddNote(
        section, {},
        "what Modflow is told of evapotranspiration here will not be saved: a setup has no place for it any more");
}

}  // namespace tervane
