// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Groundwater by linear reservoirs: zones of interflow, which take what percolates, and zones of baseflow below them,
// each with two reservoirs in parallel.
#pragma once

#include "spatial/zones.h"

namespace tervane {

/// An interflow reservoir. Depths are below ground.
class CSZShallowGWRoutingPropKvf : public CodedZoneProp {
 public:
  explicit CSZShallowGWRoutingPropKvf(CYbSEKvfBase* parent);

  float SpecificYield = 0.3f;
  float InitialDepth = 5;
  float DepthReservoir = 5;  ///< Of its bottom.
  float TimeConstantPercolation = 14;
  float ThresholdDepthInterflow = 5;
  float TimeConstantInterflow = 14;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// One of the two reservoirs of a baseflow zone. Depths are below ground.
class CSZDeepGWRoutingReservoirKvf : public CTvnKvfBase {
 public:
  /// What the two begin with.
  struct Defaults {
    float timeConstant;
    float depth;
  };
  CSZDeepGWRoutingReservoirKvf(const char* title, const char* section, Defaults defaults, CYbSEKvfBase* parent);

  float SpecificYield = 0.3f;
  float TimeConstHFlow;
  float GWDeadStorageFrac = 0;
  float UZFeedbackFrac = 0.1f;
  float InitialDepth;
  float ThresholdDepth;
  float ThresholdPumping;
  float DepthReservoir;  ///< Of its bottom.

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// A pair of baseflow reservoirs.
class CSZDeepGWRoutingPropKvf : public CodedZoneProp {
 public:
  explicit CSZDeepGWRoutingPropKvf(CYbSEKvfBase* parent);

  float FracPerc1 = 0.5f;
  float FracPump1 = 0.5f;
  bool DefaultRiverLinks = true;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// The zones of interflow, and those of baseflow.
class CSZShallowGWRoutingKvf : public CodedZonesKvf {
 public:
  explicit CSZShallowGWRoutingKvf(CYbSEKvfBase* parent);
};
class CSZDeepGWRoutingKvf : public CodedZonesKvf {
 public:
  explicit CSZDeepGWRoutingKvf(CYbSEKvfBase* parent);
};
inline constexpr ImportantName<CSZShallowGWRoutingKvf> kInterflowReservoirs{"SZ_SHALLOW_GW_ROUTING"};
inline constexpr ImportantName<CSZDeepGWRoutingKvf> kBaseflowReservoirs{"SZ_DEEP_GW_ROUTING"};

/// The saturated zone with linear reservoirs, in the place of that on a grid.
class CSatZoneSubCatchmentKvf : public CYbSEKvfBase {
 public:
  explicit CSatZoneSubCatchmentKvf(CYbSEKvfBase* parent);

  int Wells = 0;  ///< 0 or 1.

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};
inline constexpr ImportantName<CSatZoneSubCatchmentKvf> kReservoirZone{"SATZONESUBCATCHMENT"};

}  // namespace tervane
