// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/time_step_control.h"

#include "simspec/conditions.h"
#include "simspec/pages.h"

namespace tervane {

CCompControlParaTimeStepKvf::CCompControlParaTimeStepKvf(CYbSEKvfBase* parent)
    : CTvnKvfBase("Time step control", "CompControlParaTimeStep", parent) {
  SetPage(kTimeStepPage);
  TakesPartWhen(OwnEngine());
}

void CCompControlParaTimeStepKvf::ExchangeKeys(KeyExchange& keys) {
  keys("InitialTimeStep", InitialTimeStep).Unit("hours");
  keys.Since(10)("MaxAllowedOLTimeStep", MaxAllowedOLTimeStep).Unit("hours");
  keys.Since(10)("MaxAllowedUZTimeStep", MaxAllowedUZTimeStep).Unit("hours");
  // One limit served both until version 9.
  float both = 0;
  if (keys.Until(9, "MaxAllowedTimeStep", both)) MaxAllowedOLTimeStep = MaxAllowedUZTimeStep = both;
  keys("MaxAllowedSZTimeStep", MaxAllowedSZTimeStep).Unit("hours");
  keys("IncrementRate", IncrementRate).Range(0, 1);
  keys("MaxPrecDepthPerTimeStep", MaxPrecDepthPerTimeStep).Unit("mm");
  // The engine knows this key with a blank behind its name.
  keys.Since(7)("MaxInfiltDepthPerTimeStep ", MaxInfiltDepthPerTimeStep).Unit("mm");
  if (keys.IsReading() && keys.DocVersion() < 7) MaxInfiltDepthPerTimeStep = MaxPrecDepthPerTimeStep;
  keys("PrecThresholdRate", PrecThresholdRate).Unit("mm/hr");
}

CCompControlParaTimeStepWQKvf::CCompControlParaTimeStepWQKvf(CYbSEKvfBase* parent)
    : CTvnKvfBase("Water Quality Time Step Control", "WQTSC", parent) {
  SetAbbreviatedTitle("WQ Time Step Control");
  SetPage(kTimeStepWQPage);
}

void CCompControlParaTimeStepWQKvf::ExchangeKeys(KeyExchange& keys) {
  const auto exchange = [&](const std::string& key, double Limits::*limit, std::string_view unit = {}) {
    keys(key + "SZ", SZ.*limit).Unit(unit);
    keys(key + "UZ", UZ.*limit).Unit(unit);
    keys(key + "OL", OL.*limit).Unit(unit);
  };
  exchange("MaxSimTimeStep", &Limits::MaxSimTimeStep, "hours");
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
  keys("MaxSimTimeStepSZ", MaxSimTimeStepSZ).Unit("hours");
  keys("MaxAdvectiveCourantSZ", MaxAdvectiveCourantSZ);
  keys("MaxDispersiveCourantSZ", MaxDispersiveCourantSZ);
}

}  // namespace tervane
