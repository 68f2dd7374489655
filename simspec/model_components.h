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

/// The components with the own engine. Flags are 0 or 1.
class CModelCompKvf : public CTvnKvfBase {
 public:
  explicit CModelCompKvf(CYbSEKvfBase* parent) : CTvnKvfBase("Simulation specification", "ModelComp", parent) {}

  int ET = 1;
  int OL = 1;
  int SZ = 1;
  int UZ = 1;
  int WM = 1;  ///< Water movement as a whole.
  int River = 0;
  int WQ = 0;
  int ADPTRadio = 0;     ///< 0 advection-dispersion, 1 random walk particle tracking.
  int UZ_ModelType = 2;  ///< 0 Richards equation, 1 gravity flow, 2 two-layer.
  int SZ_ModelType = 0;  ///< 0 finite difference, 1 linear reservoir.
  int OL_ModelType = 0;  ///< 0 finite difference, 1 subcatchment based.
  int UseCurrentWmSimulation = 1;
  FileName FilenameTvdRes;  ///< Catalogue of the simulation whose flow the water quality uses.

  int IsDlgUsedInSetup() override;
  int AddToOverview(std::vector<OverviewLine>& lines, int level) override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// The components with a Modflow engine.
class CModModelCompKvf : public CTvnKvfBase {
 public:
  explicit CModModelCompKvf(CYbSEKvfBase* parent) : CTvnKvfBase("Model Components", "ModModelComp", parent) {}

  int OL = 0;
  int River = 0;
  int RiverModelType = 0;
  int Recharge = 0;
  int Recharge_ModelType = 0;  ///< 0 Modflow recharge, 1 recharge-seepage face; only Surfact knows the latter.
  int Subsurface = 1;
  int Modflow2000_BCFType = 1;  ///< 0 block centered flow, 1 layer property flow.
  int ET = 0;

  // Held in the file only through `Subsurface_ModelType`.
  int WithCellRewetting = 1;
  int WithAirFlow = 0;
  int VariablySaturated = 0;

  /// 0 without and 1 with cell rewetting, 2 variably saturated, 3 the same with air flow; made from the engine and the
  /// three flags, which follow it.
  int GetSubsurfaceModelType();
  /// Takes the choice between block centered (0) and variably saturated flow (1) with the engine that knows both.
  void ChooseVariablySaturated(int choice);

  int IsDlgUsedInSetup() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
  void ExchangeState(KeyExchange& keys) override;

 private:
  void TakeSubsurfaceModelType(int type);

  int subsurfaceModelType_ = 1;
};

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
  int ProcessType = 0;  ///< 0 sorption and decay, 1 Kinetra, 2 sorption and decay with colloids.

  int IsDlgUsedInSetup() override;
  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// How particles are placed and registered in a particle tracking simulation.
class CModelCompPTKvf : public CTvnKvfBase {
 public:
  explicit CModelCompPTKvf(CYbSEKvfBase* parent);

  int InitDensityRadio = 1;   ///< 0 by initial concentration, 1 by number of particles.
  double ParticleMass = 100;  ///< Quantity 100452.
  int InitLocationRadio = 0;  ///< 0 randomly, 1 on a plane above the cell's bottom, 2 uniformly.
  double DistanceFracFromBottom = 0.5;
  int AvoidInitParticlesInFixedCells = 0;
  int AvoidInitParticlesAboveWaterTable = 1;
  int RegistrationZoneRadio = 0;  ///< 0 none, 1 by layers, 2 by lenses.
  int AutomaticWellRegistration = 1;

  int IsDlgUsedInSetup() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

// ---- What other nodes ask

/// The engine of the node's tree.
int EngineOf(const CYbSEKvfBase& node);
/// The components of the node's tree; those of a new setup where the tree holds none.
const CModelCompKvf& ModelCompOf(const CYbSEKvfBase& node);
CModModelCompKvf& ModModelCompOf(const CYbSEKvfBase& node);
/// True with one of the three Modflow engines.
bool UsesModflow(const CYbSEKvfBase& node);

}  // namespace tervane
