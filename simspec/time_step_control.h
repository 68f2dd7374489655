// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// How the engine steps through time. Time steps are in hours, depths in mm, rates in mm/h.
#pragma once

#include "core/node.h"
#include "simspec/pages.h"

namespace tervane {

class CCompControlParaTimeStepKvf : public CTvnKvfBase {
 public:
  explicit CCompControlParaTimeStepKvf(CYbSEKvfBase* parent);

  float InitialTimeStep = 6;
  float MaxAllowedOLTimeStep = 0.5f;
  float MaxAllowedUZTimeStep = 2;
  float MaxAllowedSZTimeStep = 24;
  float IncrementRate = 0.05f;
  float MaxPrecDepthPerTimeStep = 10;
  float MaxInfiltDepthPerTimeStep = 10;
  float PrecThresholdRate = 0.1f;  ///< Precipitation rate that requires its own time step.

  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// Time steps and limits of transport in the saturated zone, the unsaturated zone and overland flow.
class CCompControlParaTimeStepWQKvf : public CTvnKvfBase {
 public:
  explicit CCompControlParaTimeStepWQKvf(CYbSEKvfBase* parent);

  struct Limits {
    double MaxSimTimeStep = 1e9;
    double MaxAdvectiveCourant = 0.8;
    double MaxDispersiveCourant = 0.5;
    double MaxTransLimit = 0.95;
  };
  Limits SZ, UZ, OL;
  double MaxCourantMP = 0.8;  ///< Macropores.

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// How particles are moved.
class CCompControlParaPTKvf : public CTvnKvfBase {
 public:
  explicit CCompControlParaPTKvf(CYbSEKvfBase* parent);

  int ApplyVerticalCorrection = 1;
  int IgnoreVerticalCourant = 0;
  double MaxSimTimeStepSZ = 1e9;
  double MaxAdvectiveCourantSZ = 0.8;
  double MaxDispersiveCourantSZ = 0.5;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

}  // namespace tervane
