// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/reservoirs.h"

#include "simspec/conditions.h"
#include "subsurface/pages.h"
#include "subsurface/wells.h"

namespace tervane {

namespace {

constexpr CodedZonesKind kInterflowZones{.className = "CSZShallowGWRoutingKvf",
                                         .title = "Interflow Reservoirs",
                                         .section = "SZShallowGWRoutingZones",
                                         .source = {.countKey = "NO_ZONES"},
                                         .makeZone = MakeZone<CSZShallowGWRoutingPropKvf>,
                                         .page = &kInterflowZonesPage};
constexpr CodedZonesKind kBaseflowZones{.className = "CSZDeepGWRoutingKvf",
                                        .title = "Baseflow Reservoirs",
                                        .section = "SZDeepGWRoutingZones",
                                        .source = {.countKey = "NO_ZONES"},
                                        .makeZone = MakeZone<CSZDeepGWRoutingPropKvf>,
                                        .page = &kBaseflowZonesPage};

Condition ByReservoirs() {
  return Component(&CModelCompKvf::SZ) && Method(&CModelCompKvf::SZ_ModelType, kLinearReservoir);
}

}  // namespace

// ---- Interflow

CSZShallowGWRoutingPropKvf::CSZShallowGWRoutingPropKvf(CYbSEKvfBase* parent)
    : CodedZoneProp(kZoneKeys, "Interflow Reservoir", "SZShallowGWRouting", parent) {
  SetPage(kInterflowZonePage);
}

void CSZShallowGWRoutingPropKvf::ExchangeKeys(KeyExchange& keys) {
  CodedZoneProp::ExchangeKeys(keys);
  keys("SpecificYield", SpecificYield).Quantity(quantity::kSpecificYield);
  keys("InitialDepth", InitialDepth).Quantity(quantity::kDepthBelowGround);
  keys("DepthReservoir", DepthReservoir).Quantity(quantity::kDepthBelowGround);
  keys("TimeConstantPercolation", TimeConstantPercolation).Quantity(quantity::kReservoirTimeConstant);
  keys("ThresholdDepthInterflow", ThresholdDepthInterflow).Quantity(quantity::kDepthBelowGround);
  keys("TimeConstantInterflow", TimeConstantInterflow).Quantity(quantity::kReservoirTimeConstant);
}

CSZShallowGWRoutingKvf::CSZShallowGWRoutingKvf(CYbSEKvfBase* parent) : CodedZonesKvf(kInterflowZones, parent) {
  TakesPartWhen(ByReservoirs());
}

// ---- Baseflow

CSZDeepGWRoutingReservoirKvf::CSZDeepGWRoutingReservoirKvf(const char* title, const char* section, Defaults defaults,
                                                           CYbSEKvfBase* parent)
    : CTvnKvfBase(title, section, parent),
      TimeConstHFlow(defaults.timeConstant),
      InitialDepth(defaults.depth),
      ThresholdDepth(defaults.depth),
      ThresholdPumping(defaults.depth),
      DepthReservoir(defaults.depth) {
  SetPage(kBaseflowReservoirPage);
}

void CSZDeepGWRoutingReservoirKvf::ExchangeKeys(KeyExchange& keys) {
  keys("SpecificYield", SpecificYield).Quantity(quantity::kSpecificYield);
  keys("TimeConstHFlow", TimeConstHFlow).Quantity(quantity::kReservoirTimeConstant);
  keys("GWDeadStorageFrac", GWDeadStorageFrac).Quantity(quantity::kFraction);
  keys("UZFeedbackFrac", UZFeedbackFrac).Quantity(quantity::kFraction);
  keys("InitialDepth", InitialDepth).Quantity(quantity::kDepthBelowGround);
  keys("ThresholdDepth", ThresholdDepth).Quantity(quantity::kDepthBelowGround);
  keys("ThresholdPumping", ThresholdPumping).Quantity(quantity::kDepthBelowGround);
  keys("DepthReservoir", DepthReservoir).Quantity(quantity::kDepthBelowGround);
}

CSZDeepGWRoutingPropKvf::CSZDeepGWRoutingPropKvf(CYbSEKvfBase* parent)
    : CodedZoneProp(kZoneKeys, "Baseflow Reservoir", "SZDeepGWRouting", parent) {
  SetPage(kBaseflowZonePage);
  using Defaults = CSZDeepGWRoutingReservoirKvf::Defaults;
  NewChild<CSZDeepGWRoutingReservoirKvf>("Reservoir 1", "Reservoir1", Defaults{.timeConstant = 365, .depth = 20});
  NewChild<CSZDeepGWRoutingReservoirKvf>("Reservoir 2", "Reservoir2", Defaults{.timeConstant = 3650, .depth = 50});
  NewChild<CSubcatchmentRiverlinksListKvf>(DefaultRiverLinks);
}

void CSZDeepGWRoutingPropKvf::ExchangeKeys(KeyExchange& keys) {
  CodedZoneProp::ExchangeKeys(keys);
  keys("FracPerc1", FracPerc1).Quantity(quantity::kFraction);
  keys("FracPump1", FracPump1).Quantity(quantity::kFraction);
  keys("DefaultRiverLinks", DefaultRiverLinks);
}

CSZDeepGWRoutingKvf::CSZDeepGWRoutingKvf(CYbSEKvfBase* parent) : CodedZonesKvf(kBaseflowZones, parent) {
  TakesPartWhen(ByReservoirs());
}

// ---- The zone

CSatZoneSubCatchmentKvf::CSatZoneSubCatchmentKvf(CYbSEKvfBase* parent)
    : CYbSEKvfBase("Saturated Zone", "SaturatedZoneSubCatchment", parent) {
  SetPage(kReservoirZonePage);
  TakesPartWhen(OwnEngine() && ByReservoirs());
  NewImportantChild<CSZShallowGWRoutingKvf>(kInterflowReservoirs);
  NewImportantChild<CSZDeepGWRoutingKvf>(kBaseflowReservoirs);
  NewImportantChild<CSZWellKvf>(kReservoirWells, Wells);
}

void CSatZoneSubCatchmentKvf::ExchangeKeys(KeyExchange& keys) { keys("Wells", Wells); }

}  // namespace tervane
