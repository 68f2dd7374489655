// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What is modelled: with which engine, and which compartments of the water cycle by which method. All other nodes ask
// these when they answer whether they take part; nobody keeps the answers.
#pragma once

#include "core/node.h"

namespace tervane {

/// The numeric engine, `ModelType` of the basic parameters.
enum Engine : int {
  kEngineTervane = 0,
  kEngineModflowSurfact = 1,
  kEngineModflow96 = 2,
  kEngineModflow2000 = 3,
};
inline constexpr KeyChoice kEngines[] = {{kEngineTervane, "Tervane"},
                                         {kEngineModflowSurfact, "MODFLOW Surfact"},
                                         {kEngineModflow96, "MODFLOW 96"},
                                         {kEngineModflow2000, "MODFLOW 2000"}};

/// How the own engine models overland flow.
enum OverlandMethod : int { kFiniteDifferenceOverland = 0, kSubcatchmentOverland = 1 };
inline constexpr KeyChoice kOverlandMethods[] = {{kFiniteDifferenceOverland, "Finite Difference"},
                                                 {kSubcatchmentOverland, "Subcatchment based"}};
/// The same of the unsaturated zone.
enum UnsaturatedMethod : int { kRichardsEquation = 0, kGravityFlow = 1, kTwoLayer = 2 };
inline constexpr KeyChoice kUnsaturatedMethods[] = {
    {kRichardsEquation, "Richards equation"}, {kGravityFlow, "Gravity Flow"}, {kTwoLayer, "2 Layer UZ"}};
/// The same of the saturated zone.
enum SaturatedMethod : int { kFiniteDifferenceSaturated = 0, kLinearReservoir = 1 };
inline constexpr KeyChoice kSaturatedMethods[] = {{kFiniteDifferenceSaturated, "Finite Difference"},
                                                  {kLinearReservoir, "Linear Reservoir"}};

/// How recharge is modelled with Modflow; only Surfact knows the latter.
enum RechargeMethod : int { kModflowRecharge = 0, kRechargeSeepageFace = 1 };
inline constexpr KeyChoice kRechargeMethods[] = {{kModflowRecharge, "MODFLOW Recharge"},
                                                 {kRechargeSeepageFace, "Recharge-Seepage Face"}};
/// `Subsurface_ModelType` with Modflow.
enum SubsurfaceMethod : int {
  kWithoutRewetting = 0,
  kWithRewetting = 1,
  kVariablySaturated = 2,
  kVariablySaturatedWithAir = 3,
};
inline constexpr KeyChoice kSubsurfaceMethods[] = {
    {kWithoutRewetting, "Block Centered Flow (BCF)"},
    {kWithRewetting, "Block Centered Flow (BCF) with cell rewetting"},
    {kVariablySaturated, "Variably Saturated Flow"},
    {kVariablySaturatedWithAir, "Variably Saturated Flow with air flow"}};
inline constexpr KeyChoice kModflow2000FlowPackages[] = {{0, "Block Centered Flow (BCF)"},
                                                         {1, "Layer Property Flow (LPF)"}};

/// How water quality is modelled.
enum WaterQualityMethod : int { kAdvectionDispersion = 0, kParticleTracking = 1 };
inline constexpr KeyChoice kWaterQualityMethods[] = {
    {kAdvectionDispersion, "Calculate WQ using the finite difference, Advection-Dispersion (AD) method"},
    {kParticleTracking, "Calculate WQ using random walk particle tracking (SZ only)"}};
/// Which processes change species.
enum ProcessKind : int { kSorptionAndDecay = 0, kKinetra = 1, kColloids = 2 };
inline constexpr KeyChoice kProcessKinds[] = {{kSorptionAndDecay, "Sorption and Decay"},
                                              {kKinetra, "Kinetra"},
                                              {kColloids, "Sorption and Decay with colloids", false}};

/// The components with the own engine. Flags are 0 or 1.
class CModelCompKvf : public CTvnKvfBase {
 public:
  explicit CModelCompKvf(CYbSEKvfBase* parent);

  int ET = 1;
  int OL = 1;
  int SZ = 1;
  int UZ = 1;
  int WM = 1;  ///< Water movement as a whole.
  int River = 0;
  int WQ = 0;
  int ADPTRadio = kAdvectionDispersion;
  int UZ_ModelType = kTwoLayer;
  int SZ_ModelType = kFiniteDifferenceSaturated;
  int OL_ModelType = kFiniteDifferenceOverland;
  int UseCurrentWmSimulation = 1;
  FileName FilenameTvdRes;  ///< Catalogue of the simulation whose flow the water quality uses.

  int AddToOverview(std::vector<OverviewLine>& lines, int level) override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};
inline constexpr ImportantName<CModelCompKvf> kModelComponents{"MODELCOMP"};

/// The components with a Modflow engine.
class CModModelCompKvf : public CTvnKvfBase {
 public:
  explicit CModModelCompKvf(CYbSEKvfBase* parent);

  int OL = 0;
  int River = 0;
  int RiverModelType = 0;
  int Recharge = 0;
  int Recharge_ModelType = kModflowRecharge;
  int Subsurface = 1;
  int Modflow2000_BCFType = 1;  ///< One of `kModflow2000FlowPackages`.
  int ET = 0;

  // Held in the file only through `Subsurface_ModelType`.
  int WithCellRewetting = 1;
  int WithAirFlow = 0;
  int VariablySaturated = 0;

  /// 0 without and 1 with cell rewetting, 2 variably saturated, 3 the same with air flow; made from the engine and the
  /// three flags, which follow it.
  int GetSubsurfaceModelType();
  /// The same without making the flags follow.
  int SubsurfaceModelType() const;
  /// Takes the choice between block centered (0) and variably saturated flow (1) with the engine that knows both.
  void ChooseVariablySaturated(int choice);

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
  void ExchangeState(KeyExchange& keys) override;

 private:
  friend Condition SubsurfaceIs(std::vector<int> methods);
  void TakeSubsurfaceModelType(int type);

  int subsurfaceModelType_ = 1;
};
inline constexpr ImportantName<CModModelCompKvf> kModflowComponents{"MODMODELCOMP"};

/// What takes part in a water quality simulation.
class CModelCompWQKvf : public CTvnKvfBase {
 public:
  explicit CModelCompWQKvf(CYbSEKvfBase* parent);

  int OL = 0;
  int River = 0;
  int UZ = 0;
  int PlantUptake = 0;
  int SZ = 0;
  int IncludeProcesses = 0;
  int ProcessType = kSorptionAndDecay;

  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};
inline constexpr ImportantName<CModelCompWQKvf> kWaterQualityComponents{"MODEL_COMP_WQ"};

/// How particles are placed and registered in a particle tracking simulation.
class CModelCompPTKvf : public CTvnKvfBase {
 public:
  explicit CModelCompPTKvf(CYbSEKvfBase* parent);

  enum Density : int { kByConcentration = 0, kByNumber = 1 };
  enum Location : int { kRandom = 0, kOnPlane = 1, kUniform = 2 };
  enum RegistrationZones : int { kNoZones = 0, kByLayers = 1, kByLenses = 2 };

  int InitDensityRadio = kByNumber;
  double ParticleMass = 100;  ///< Quantity 100452.
  int InitLocationRadio = kRandom;
  double DistanceFracFromBottom = 0.5;
  int AvoidInitParticlesInFixedCells = 0;
  int AvoidInitParticlesAboveWaterTable = 1;
  int RegistrationZoneRadio = kNoZones;
  int AutomaticWellRegistration = 1;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};
inline constexpr ImportantName<CModelCompPTKvf> kParticleTrackingComponents{"MODEL_COMP_PT"};

// ---- What other nodes ask

/// The engine of the node's tree.
int EngineOf(const CYbSEKvfBase& node);
/// The components of the node's tree; those of a new setup where the tree holds none.
const CModelCompKvf& ModelCompOf(const CYbSEKvfBase& node);
CModModelCompKvf& ModModelCompOf(const CYbSEKvfBase& node);
/// True with one of the three Modflow engines.
bool UsesModflow(const CYbSEKvfBase& node);

}  // namespace tervane
