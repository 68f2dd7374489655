// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/time_step_control.h"

#include "simspec/model_components.h"
#include "simspec/pages.h"

namespace tervane {

int CCompControlParaTimeStepKvf::IsDlgUsedInSetup() { return EngineOf(*this) == kEngineTervane; }

void CCompControlParaTimeStepKvf::ExchangeKeys(KeyExchange& keys) {
  keys("InitialTimeStep", InitialTimeStep);
  keys.Since(10)("MaxAllowedOLTimeStep", MaxAllowedOLTimeStep);
  keys.Since(10)("MaxAllowedUZTimeStep", MaxAllowedUZTimeStep);
  // One limit served both until version 9.
  float both = 0;
  if (keys.Until(9, "MaxAllowedTimeStep", both)) MaxAllowedOLTimeStep = MaxAllowedUZTimeStep = both;
  keys("MaxAllowedSZTimeStep", MaxAllowedSZTimeStep);
  keys("IncrementRate", IncrementRate);
  keys("MaxPrecDepthPerTimeStep", MaxPrecDepthPerTimeStep);
  // The engine knows this key with a blank behind its name.
  keys.Since(7)("MaxInfiltDepthPerTimeStep ", MaxInfiltDepthPerTimeStep);
  if (keys.IsReading() && keys.DocVersion() < 7) MaxInfiltDepthPerTimeStep = MaxPrecDepthPerTimeStep;
  keys("PrecThresholdRate", PrecThresholdRate);
}

CCompControlParaTimeStepWQKvf::CCompControlParaTimeStepWQKvf(CYbSEKvfBase* parent)
    : CTvnKvfBase("Water Quality Time Step Control", "WQTSC", parent) {
  SetAbbreviatedTitle("WQ Time Step Control");
  SetPage(kTimeStepWQPage);
}

void CCompControlParaTimeStepWQKvf::ExchangeKeys(KeyExchange& keys) {
  const auto exchange = [&](const std::string& key, double Limits::*limit) {
    keys(key + "SZ", SZ.*limit);
    keys(key + "UZ", UZ.*limit);
    keys(key + "OL", OL.*limit);
  };
  exchange("MaxSimTimeStep", &Limits::MaxSimTimeStep);
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
  keys("MaxSimTimeStepSZ", MaxSimTimeStepSZ);
  keys("MaxAdvectiveCourantSZ", MaxAdvectiveCourantSZ);
  keys("MaxDispersiveCourantSZ", MaxDispersiveCourantSZ);
}

}  // namespace tervane
