// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/storing.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>

#include <fmt/format.h>

#include "platform/text.h"
#include "results/pages.h"
#include "simspec/conditions.h"
#include "surface/climate.h"

namespace tervane {

namespace {

constexpr float kIntervalTolerance = 0.0001f;

constexpr KeyChoice kResultUnitChoices[] = {{CStoringResultsKvf::kInternalUnits, "Internal Tervane units"},
                                            {CStoringResultsKvf::kUserUnits, "User selected units"}};
constexpr KeyChoice kFlowChoices[] = {{CStoringResultsKvf::kSaturatedFlow, "Store SZ flow data only"},
                                      {CStoringResultsKvf::kAllFlow, "Store all flow data"}};

/// What components decide of the rules.
struct StoringComponents {
  explicit StoringComponents(const CYbSEKvfBase& node) {
    const CModelCompKvf& components = ModelCompOf(node);
    overland = components.OL != 0;
    unsaturated = components.UZ != 0;
    saturated = components.SZ != 0;
    quality = components.WQ != 0;
    const auto* parts = node.Important(kWaterQualityComponents);
    qualityOverland = parts && parts->OL;
    qualityUnsaturated = parts && parts->UZ;
    qualitySaturated = parts && parts->SZ;
  }

  bool overland, unsaturated, saturated, quality, qualityOverland, qualityUnsaturated, qualitySaturated;
};

/// An interval that must be a multiple of another one, or equal to it.
struct IntervalRule {
  std::string_view key;
  float CStoringResultsKvf::*interval;
  float CStoringResultsKvf::*of;
  bool isEquality;
  bool (*holdsFor)(const StoringComponents& on);
  const char* name;  ///< Of the interval.
  const char* error;
};

/// In the order in which they are told.
constexpr IntervalRule kIntervalRules[] = {
    {"WM_PrecFrequency", &CStoringResultsKvf::WM_PrecFrequency, &CStoringResultsKvf::WM_OverlandFrequency, false,
     [](const StoringComponents& on) { return on.overland; }, "Prec",
     "The storing interval for Prec must be an integer multiple of the OL interval (e.g. if the OL interval is 6 hrs, "
     "then the Prec interval must be 6, 12, 18, etc.)"},
    {"WM_FHeadsFrequency", &CStoringResultsKvf::WM_FHeadsFrequency, &CStoringResultsKvf::WM_PrecFrequency, false,
     [](const StoringComponents& on) { return on.saturated; }, "SZ Heads",
     "The storing interval for SZ Heads must be an integer multiple of the Prec interval (e.g. if the Prec interval is "
     "12 hrs, then the SZ Heads interval must be 12, 24, 36, etc.)"},
    {"WM_FluxesFrequency", &CStoringResultsKvf::WM_FluxesFrequency, &CStoringResultsKvf::WM_FHeadsFrequency, false,
     [](const StoringComponents& on) { return on.saturated; }, "SZ Fluxes",
     "The storing interval for SZ Fluxes must be an integer multiple of the SZ Heads interval (e.g. if the SZ Heads "
     "interval is 24 hrs, then the Prec interval must be 24, 48, 72, etc.)"},
    {"WQ_UnsaturatedZoneFrequency", &CStoringResultsKvf::WQ_UnsaturatedZoneFrequency,
     &CStoringResultsKvf::WQ_OverlandFrequency, false,
     [](const StoringComponents& on) {
       return on.quality && on.unsaturated && on.overland && on.qualityUnsaturated && on.qualityOverland;
     },
     "WQ UZ",
     "The storing interval for WQ UZ must be an integer multiple of the WQ OL interval (e.g. if the WQ OL interval is "
     "24 hrs, then the WQ UZ interval must be 24, 48, 72, etc.)"},
    {"WQ_SaturatedZoneFrequency", &CStoringResultsKvf::WQ_SaturatedZoneFrequency,
     &CStoringResultsKvf::WQ_UnsaturatedZoneFrequency, false,
     [](const StoringComponents& on) {
       return on.quality && on.saturated && on.unsaturated && on.qualitySaturated && on.qualityUnsaturated;
     },
     "WQ SZ",
     "The storing interval for WQ SZ must be an integer multiple of the WQ UZ interval (e.g. if the WQ UZ interval is "
     "24 hrs, then the WQ SZ interval must be 24, 48, 72, etc.)"},
    {"WM_FluxesFrequency", &CStoringResultsKvf::WM_FluxesFrequency, &CStoringResultsKvf::WM_FHeadsFrequency, true,
     [](const StoringComponents& on) { return on.quality && on.saturated && on.qualitySaturated; }, "SZ Fluxes",
     "When Water quality is enabled, the storing interval for SZ Heads must equal the storing interval for SZ Fluxes"},
};

/// The interval nearest above that fulfils the rule; 0 where there is none.
float MendedInterval(const IntervalRule& rule, const CStoringResultsKvf& node) {
  const float of = std::fabs(node.*rule.of);
  if (rule.isEquality || !(of > 0)) return of;
  return std::max(1.0f, std::ceil(std::fabs(node.*rule.interval) / of)) * of;
}

}  // namespace

bool IsMultiple(float interval, float of) {
  const float a = std::fabs(interval), b = std::fabs(of);
  if (!(a > 0) || !(b > 0)) return false;
  // Cut as a float: the ratio may be larger than any whole number of a processor.
  const float n = std::trunc(a / b + 0.5f);
  return kIntervalTolerance * a > std::fabs(n * b - a);
}

bool IsEqual(float interval, float other) {
  return kIntervalTolerance * std::fabs(interval) > std::fabs(interval - other);
}

CStoringResultsKvf::CStoringResultsKvf(CYbSEKvfBase* parent)
    : CTvnKvfBase("Storing of results", "StoringOfResults", parent),
      detailed_(NewChild<CDetailedTSOutputListKvf>()),
      detailedRiver_(NewChild<CDetailedFvrTSOutputListKvf>()),
      gridSeries_(NewImportantChild<COutputGridSeriesListKvf>(kOutputGridSeries)) {
  SetPage(kStoringResultsPage);
  TakesPartWhen(OwnEngine());
}

std::string CStoringResultsKvf::GetWaterMovementLabel() const {
  if (EngineOf(*this) != kEngineTervane) return {};
  const CModelCompKvf& components = ModelCompOf(*this);
  const auto* climate = Important(kClimate);
  std::string label = "Prec";
  if (climate && climate->SM) label += ", SM";
  if (components.ET) label += ", ET";
  if (components.UZ) label += ", UZ";
  return label;
}

int CStoringResultsKvf::ValidateData() {
  const StoringComponents on(*this);
  int isValid = 1;
  for (const IntervalRule& rule : kIntervalRules) {
    const float interval = this->*rule.interval, of = this->*rule.of;
    if (!rule.holdsFor(on) || (rule.isEquality ? IsEqual(of, interval) : IsMultiple(interval, of))) continue;
    AddError(rule.error, std::string(rule.key));
    isValid = 0;
  }
  return isValid;
}

std::vector<Mend> CStoringResultsKvf::MendsOf(const Finding& finding) const {
  std::vector<Mend> mends;
  for (const IntervalRule& rule : kIntervalRules) {
    const float mended = finding.text == rule.error ? MendedInterval(rule, *this) : 0;
    if (!(mended > 0) || !std::isfinite(mended)) continue;
    const std::string value = ShortestNumber(mended);
    mends.push_back({fmt::format("Change the storing interval for {} to {} hours", rule.name, value),
                     std::string(rule.key), value});
  }
  return mends;
}

void CStoringResultsKvf::TakeMend(const Mend& mend) {
  for (const IntervalRule& rule : kIntervalRules)
    if (mend.key == rule.key) this->*rule.interval = std::strtof(mend.value.c_str(), nullptr);
}

void CStoringResultsKvf::ExchangeKeys(KeyExchange& keys) {
  constexpr std::string_view kHours = "hrs";
  keys("ResultUnitRadio", ResultUnitRadio).OneOf(kResultUnitChoices);
  keys("ADInputData", ADInputData);
  keys("WaterBalance", WaterBalance);
  keys("AdRadio", AdRadio).OneOf(kFlowChoices);
  keys("HotStartData", HotStartData);
  keys("OnlyStoreHotDataAtEndOfSimulation", OnlyStoreHotDataAtEndOfSimulation);
  keys("HotstartStoringTimestep_Hrs", HotstartStoringTimestep_Hrs).Unit(kHours).Above(0);
  keys("WM_OverlandFrequency", WM_OverlandFrequency).Unit(kHours).Above(0);
  keys("WM_PrecFrequency", WM_PrecFrequency).Unit(kHours).Above(0);
  keys("WM_FHeadsFrequency", WM_FHeadsFrequency).Unit(kHours).Above(0);
  keys("WM_FluxesFrequency", WM_FluxesFrequency).Unit(kHours).Above(0);
  keys("WQ_OverlandFrequency", WQ_OverlandFrequency).Unit(kHours).Above(0);
  keys("WQ_UnsaturatedZoneFrequency", WQ_UnsaturatedZoneFrequency).Unit(kHours).Above(0);
  keys("WQ_SaturatedZoneFrequency", WQ_SaturatedZoneFrequency).Unit(kHours).Above(0);
  keys("WQ_TimeSeriesFrequency", WQ_TimeSeriesFrequency).Unit(kHours).Above(0);
  keys("WQ_SummaryFrequency", WQ_SummaryFrequency).Unit(kHours).Above(0);
  keys("PTLocationFile", PTLocationFile);
  keys("PTHistoryShapeFile", PTHistoryShapeFile);
  keys("MinPTLocationFrequency", MinPTLocationFrequency).Unit(kHours).AtLeast(0);
}

}  // namespace tervane
