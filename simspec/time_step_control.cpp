// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/time_step_control.h"

#include <algorithm>
#include <limits>
#include <optional>

#include <fmt/format.h>

#include "platform/text.h"
#include "simspec/conditions.h"
#include "simspec/model_components.h"
#include "simspec/pages.h"

namespace tervane {

CCompControlParaTimeStepKvf::CCompControlParaTimeStepKvf(CYbSEKvfBase* parent)
    : CTvnKvfBase("Time step control", "CompControlParaTimeStep", parent) {
  SetPage(kTimeStepPage);
  TakesPartWhen(OwnEngine());
}

void CCompControlParaTimeStepKvf::ExchangeKeys(KeyExchange& keys) {
  keys("InitialTimeStep", InitialTimeStep).Unit("hours").Above(0);
  keys.Since(10)("MaxAllowedOLTimeStep", MaxAllowedOLTimeStep).Unit("hours").Above(0);
  keys.Since(10)("MaxAllowedUZTimeStep", MaxAllowedUZTimeStep).Unit("hours").Above(0);
  // One limit served both until version 9.
  float both = 0;
  if (keys.Until(9, "MaxAllowedTimeStep", both)) MaxAllowedOLTimeStep = MaxAllowedUZTimeStep = both;
  keys("MaxAllowedSZTimeStep", MaxAllowedSZTimeStep).Unit("hours").Above(0);
  keys("IncrementRate", IncrementRate).Range(0, 1);
  keys("MaxPrecDepthPerTimeStep", MaxPrecDepthPerTimeStep).Unit("mm").Above(0);
  // The engine knows this key with a blank behind its name.
  keys.Since(7)("MaxInfiltDepthPerTimeStep ", MaxInfiltDepthPerTimeStep).Unit("mm").Above(0);
  if (keys.IsReading() && keys.DocVersion() < 7) MaxInfiltDepthPerTimeStep = MaxPrecDepthPerTimeStep;
  keys("PrecThresholdRate", PrecThresholdRate).Unit("mm/hr").AtLeast(0);
}

int CCompControlParaTimeStepKvf::ValidateData() {
  const CModelCompKvf& components = ModelCompOf(*this);
  const struct {
    int isOn;
    float longest;
  } limits[] = {{components.OL, MaxAllowedOLTimeStep},
                {components.UZ, MaxAllowedUZTimeStep},
                {components.SZ, MaxAllowedSZTimeStep}};
  std::optional<float> longest;
  for (const auto& limit : limits)
    if (limit.isOn) longest = std::max(limit.longest, longest.value_or(limit.longest));
  if (longest && InitialTimeStep > *longest)
    AddWarning("The initial time step is longer than any that is allowed", "InitialTimeStep",
               fmt::format("{} hours, and at most {}", ShortestNumber(InitialTimeStep), ShortestNumber(*longest)));
  return 1;
}

CCompControlParaTimeStepWQKvf::CCompControlParaTimeStepWQKvf(CYbSEKvfBase* parent)
    : CTvnKvfBase("Water Quality Time Step Control", "WQTSC", parent) {
  SetAbbreviatedTitle("WQ Time Step Control");
  SetPage(kTimeStepWQPage);
}

void CCompControlParaTimeStepWQKvf::ExchangeKeys(KeyExchange& keys) {
  const auto exchange = [&](const std::string& key, double Limits::*limit, std::string_view unit = {},
                            double above = -std::numeric_limits<double>::infinity()) {
    keys(key + "SZ", SZ.*limit).Unit(unit).Above(above);
    keys(key + "UZ", UZ.*limit).Unit(unit).Above(above);
    keys(key + "OL", OL.*limit).Unit(unit).Above(above);
  };
  exchange("MaxSimTimeStep", &Limits::MaxSimTimeStep, "hours", 0);
  exchange("MaxAdvectiveCourant", &Limits::MaxAdvectiveCourant);
  exchange("MaxDispersiveCourant", &Limits::MaxDispersiveCourant);
  exchange("MaxTransLimit", &Limits::MaxTransLimit);
  keys("MaxCourantMP", MaxCourantMP);
}

CCompControlParaPTKvf::CCompControlParaPTKvf(CYbSEKvfBase* parent)
    : CTvnKvfBase("Particle Tracking Control", "PTControl", parent) {
  SetAbbreviatedTitle("PT Control");
  SetPage(kControlPTPage);
}

void CCompControlParaPTKvf::ExchangeKeys(KeyExchange& keys) {
  keys("ApplyVerticalCorrection", ApplyVerticalCorrection);
  keys("IgnoreVerticalCourant", IgnoreVerticalCourant);
  keys("MaxSimTimeStepSZ", MaxSimTimeStepSZ).Unit("hours").Above(0);
  keys("MaxAdvectiveCourantSZ", MaxAdvectiveCourantSZ);
  keys("MaxDispersiveCourantSZ", MaxDispersiveCourantSZ);
}

}  // namespace tervane
