// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/model_components.h"

#include <array>
#include <utility>

#include <fmt/format.h>

#include "simspec/basic_parameters.h"
#include "simspec/conditions.h"
#include "simspec/control_parameters.h"
#include "simspec/pages.h"
#include "simspec/periods.h"
#include "simspec/time_step_control.h"
#include "simspec/titles.h"

namespace tervane {

int EngineOf(const CYbSEKvfBase& node) {
  const auto* basics = node.Important(kBasicParameters);
  return basics ? basics->ModelType : kEngineTervane;
}

const CModelCompKvf& ModelCompOf(const CYbSEKvfBase& node) {
  static const CModelCompKvf ofNewSetup(nullptr);
  const auto* components = node.Important(kModelComponents);
  return components ? *components : ofNewSetup;
}

CModModelCompKvf& ModModelCompOf(const CYbSEKvfBase& node) {
  static CModModelCompKvf ofNewSetup(nullptr);
  auto* components = node.Important(kModflowComponents);
  return components ? *components : ofNewSetup;
}

bool UsesModflow(const CYbSEKvfBase& node) {
  const int engine = EngineOf(node);
  return engine >= kEngineModflowSurfact && engine <= kEngineModflow2000;
}

// ---- CModelCompKvf

CModelCompKvf::CModelCompKvf(CYbSEKvfBase* parent) : CTvnKvfBase("Simulation specification", "ModelComp", parent) {
  TakesPartWhen(OwnEngine());
}

void CModelCompKvf::ExchangeKeys(KeyExchange& keys) {
  keys("ET", ET);
  keys("OL", OL);
  keys("SZ", SZ);
  keys("UZ", UZ);
  keys("WM", WM).Label("Water Movement (WM)");
  keys("River", River);
  keys("WQ", WQ);
  keys("ADPTRadio", ADPTRadio).OneOf(kWaterQualityMethods);
  keys("UZ_ModelType", UZ_ModelType).OneOf(kUnsaturatedMethods);
  keys("SZ_ModelType", SZ_ModelType).OneOf(kSaturatedMethods);
  keys("OL_ModelType", OL_ModelType).OneOf(kOverlandMethods);
  keys("UseCurrentWmSimulation", UseCurrentWmSimulation);
  keys("FilenameTvdRes", FilenameTvdRes);
}

int CModelCompKvf::AddToOverview(std::vector<OverviewLine>& lines, int level) {
  const std::array<std::pair<const char*, int>, 10> values{{{"ET", ET},
                                                            {"OL", OL},
                                                            {"SZ", SZ},
                                                            {"UZ", UZ},
                                                            {"WM", WM},
                                                            {"River", River},
                                                            {"WQ", WQ},
                                                            {"UZ_ModelType", UZ_ModelType},
                                                            {"SZ_ModelType", SZ_ModelType},
                                                            {"OL_ModelType", OL_ModelType}}};
  for (const auto& [name, value] : values) lines.push_back({GetTitle(), level, fmt::format("{} = {}", name, value)});
  return 1;
}

// ---- CModModelCompKvf

CModModelCompKvf::CModModelCompKvf(CYbSEKvfBase* parent) : CTvnKvfBase("Model Components", "ModModelComp", parent) {
  TakesPartWhen(WithEngine({kEngineModflowSurfact}));
}

int CModModelCompKvf::SubsurfaceModelType() const {
  if (EngineOf(*this) == kEngineModflowSurfact && subsurfaceModelType_ > kWithRewetting)
    return WithAirFlow ? kVariablySaturatedWithAir : kVariablySaturated;
  if (UsesModflow(*this)) return WithCellRewetting ? kWithRewetting : kWithoutRewetting;
  return subsurfaceModelType_;
}

int CModModelCompKvf::GetSubsurfaceModelType() {
  VariablySaturated = subsurfaceModelType_ > kWithRewetting;
  subsurfaceModelType_ = SubsurfaceModelType();
  return subsurfaceModelType_;
}

Condition SubsurfaceIs(std::vector<int> methods) {
  return Condition::OfKey(
      [](const CYbSEKvfBase& node) {
        const CModModelCompKvf& components = ModModelCompOf(node);
        return Condition::KeyOfNode{&components, &components.subsurfaceModelType_, components.SubsurfaceModelType()};
      },
      std::move(methods), false);
}

void CModModelCompKvf::ChooseVariablySaturated(int choice) {
  VariablySaturated = choice != 0;
  subsurfaceModelType_ = choice != 0 ? (WithAirFlow ? 3 : 2) : (WithCellRewetting ? 1 : 0);
}

void CModModelCompKvf::TakeSubsurfaceModelType(int type) {
  if (type == 0 || type == 1) WithCellRewetting = type;
  if (type == 2 || type == 3) WithAirFlow = type == 3;
  subsurfaceModelType_ = type;
}

void CModModelCompKvf::ExchangeKeys(KeyExchange& keys) {
  const int engine = keys.IsWriting() ? EngineOf(*this) : kEngineTervane;
  const bool knowsRechargeType = engine != kEngineModflow96 && engine != kEngineModflow2000;

  keys("OL", OL);
  keys("River", River);
  keys("RiverModelType", RiverModelType);
  keys("Recharge", Recharge);
  // The held value stays for a return to the engine that knows it.
  keys.Custom(
          "Recharge_ModelType", [&] { return knowsRechargeType ? Recharge_ModelType : 0; },
          [&](int type) { Recharge_ModelType = type; })
      .OneOf(kRechargeMethods)
      .HeldIn(&Recharge_ModelType);
  keys("Subsurface", Subsurface);
  int subsurfaceModelType = keys.IsReading() ? 1 : GetSubsurfaceModelType();  // An absent key reads as 1.
  keys("Subsurface_ModelType", subsurfaceModelType).OneOf(kSubsurfaceMethods).HeldIn(&subsurfaceModelType_);
  if (keys.IsReading()) TakeSubsurfaceModelType(subsurfaceModelType);
  keys("Modflow2000_BCFType", Modflow2000_BCFType).OneOf(kModflow2000FlowPackages);
  keys("ET", ET);
}

void CModModelCompKvf::ExchangeState(KeyExchange& keys) {
  CTvnKvfBase::ExchangeState(keys);
  keys("own recharge type", Recharge_ModelType);
  keys("own subsurface type", subsurfaceModelType_);
  keys("cell rewetting", WithCellRewetting);
  keys("air flow", WithAirFlow);
  keys("variably saturated", VariablySaturated);
}

// ---- CModelCompWQKvf

namespace {

/// Both kinds of water quality simulation need the own engine and a compartment with water in it.
Condition HasWaterQuality(int method) {
  return OwnEngine() && Component(&CModelCompKvf::WQ) && Method(&CModelCompKvf::ADPTRadio, method) &&
         (Component(&CModelCompKvf::OL) || Component(&CModelCompKvf::UZ) || Component(&CModelCompKvf::SZ));
}

constexpr KeyChoice kParticleDensities[] = {
    {CModelCompPTKvf::kByConcentration, "Define initial particle density using initial concentration"},
    {CModelCompPTKvf::kByNumber, "Define initial particle density as number of particles"}};
constexpr KeyChoice kParticleLocations[] = {
    {CModelCompPTKvf::kRandom, "Distribute particles randomly in the cell"},
    {CModelCompPTKvf::kOnPlane, "Distribute particles evenly on a plane above the bottom of the cell"},
    {CModelCompPTKvf::kUniform, "Place particles uniformly in the cell"}};
constexpr KeyChoice kRegistrationZones[] = {
    {CModelCompPTKvf::kNoZones, "No registration zones"},
    {CModelCompPTKvf::kByLayers, "Define registration zones by layers"},
    {CModelCompPTKvf::kByLenses, "Define registration zones by lenses (slower)"}};

}  // namespace

CModelCompWQKvf::CModelCompWQKvf(CYbSEKvfBase* parent)
    : CTvnKvfBase("Water Quality Simulation Specification", "ModelCompWQ", parent) {
  SetAbbreviatedTitle("WQ Simulation Specification");
  SetPage(kModelCompWQPage);
  TakesPartWhen(HasWaterQuality(kAdvectionDispersion));
  NewChild<CSimTitleWQKvf>();
  NewChild<CSimPeriodWQKvf>();
  NewChild<CCompControlParaTimeStepWQKvf>();
  NewChild<CCompControlParaColloidWQKvf>();
}

int CModelCompWQKvf::ValidateData() {
  const CModelCompKvf& components = ModelCompOf(*this);
  if (components.UZ && components.UZ_ModelType == kTwoLayer && UZ)
    AddError("UZ Water Quality is only allowed for the Richards Equation and Gravity flow methods.", "UZ");
  return 1;
}

void CModelCompWQKvf::ExchangeKeys(KeyExchange& keys) {
  keys("OL", OL);
  keys("River", River);
  keys("UZ", UZ);
  keys("PlantUptake", PlantUptake);
  keys("SZ", SZ);
  keys("IncludeProcesses", IncludeProcesses);
  keys("ProcessType", ProcessType).OneOf(kProcessKinds);
}

// ---- CModelCompPTKvf

CModelCompPTKvf::CModelCompPTKvf(CYbSEKvfBase* parent)
    : CTvnKvfBase("Particle Tracking Specification", "ModelCompPT", parent) {
  SetAbbreviatedTitle("PT Simulation Specification");
  SetPage(kModelCompPTPage);
  TakesPartWhen(HasWaterQuality(kParticleTracking));
  NewChild<CSimTitlePTKvf>();
  NewImportantChild<CSimPeriodPTKvf>(kParticleTrackingPeriod);
  NewChild<CCompControlParaPTKvf>();
}

void CModelCompPTKvf::ExchangeKeys(KeyExchange& keys) {
  keys("InitDensityRadio", InitDensityRadio).OneOf(kParticleDensities);
  keys("ParticleMass", ParticleMass);
  keys("InitLocationRadio", InitLocationRadio).OneOf(kParticleLocations);
  keys("DistanceFracFromBottom", DistanceFracFromBottom).Range(0, 1);
  keys("AvoidInitParticlesInFixedCells", AvoidInitParticlesInFixedCells);
  keys("AvoidInitParticlesAboveWaterTable", AvoidInitParticlesAboveWaterTable);
  keys("RegistrationZoneRadio", RegistrationZoneRadio).OneOf(kRegistrationZones);
  keys("AutomaticWellRegistration", AutomaticWellRegistration);
}

}  // namespace tervane
