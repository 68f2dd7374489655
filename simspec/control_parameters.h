// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// How the engine solves each compartment: iteration limits, stop criteria and the choice of solver. Values are taken as
// they are entered.
#pragma once

#include "core/node.h"
#include "simspec/pages.h"

namespace tervane {

/// Overland flow.
class CCompControlParaOLKvf : public CTvnKvfBase {
 public:
  explicit CCompControlParaOLKvf(CYbSEKvfBase* parent);

  enum Solver : int { kSuccessiveOverrelaxation = 0, kExplicit = 1 };
  enum RiverExchange : int { kManning = 0, kWeir = 1 };

  int SolverOption = kSuccessiveOverrelaxation;
  int MaxNoOfIter = 200;
  float MaxHeadChange = 0.0001f;
  float MaxResidualError = 0.0001f;
  float RelaxFactor = 0.9f;
  float MaxCourant_Explicit = 0.8f;
  float WaterDepthThreshold = 0.0001f;
  float OLFlowReductionGradientThreshold = 0.0001f;
  int OLRiverExchangeOption = kManning;
  float WeirFlowReductionDepthThreshold = 0.1f;
  int Multicell = 0;
  float MulticellFactor = 2;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};
inline constexpr ImportantName<CCompControlParaOLKvf> kOverlandControl{"COMPCONTROLPARAOL"};

/// Unsaturated zone.
class CCompControlParaUZKvf : public CTvnKvfBase {
 public:
  explicit CCompControlParaUZKvf(CYbSEKvfBase* parent);

  float MaxWaterBalanceError = 0.03f;  ///< Fraction, in one node.
  int MaxNoOfIter = 50;
  float IterStopCriteria = 0.002f;  ///< Fraction of the pressure head.
  float CouplingCriteria = 0.001f;  ///< Water balance error of a profile.

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

class CCompControlParaSZPCGBase;

/// Saturated zone: the choice of solver. The parameters of each solver are children, and all are written.
class CCompControlParaSZKvf : public CTvnKvfBase {
 public:
  explicit CCompControlParaSZKvf(CYbSEKvfBase* parent);

  /// Values of `SolverOption`.
  enum Solver : int { kTransient = 0, kSteadyState = 1, kSuccessiveOverrelaxation = 2 };
  int SolverOption = kTransient;

  CCompControlParaSZPCGBase& Transient() const { return *transient_; }
  CCompControlParaSZPCGBase& SteadyState() const { return *steady_; }

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  CCompControlParaSZPCGBase* transient_;
  CCompControlParaSZPCGBase* steady_;
};

/// Parameters of one solver of the saturated zone, which takes part when its parent has chosen that solver.
struct SaturatedSolverKind {
  std::string_view className;
  std::string title, section;
  int solver;
};

/// Preconditioned conjugate gradient, in transient and in steady state.
class CCompControlParaSZPCGBase : public CTvnKvfBase {
 public:
  CCompControlParaSZPCGBase(const SaturatedSolverKind& kind, CYbSEKvfBase* parent);

  enum UnderRelaxationKind : int { kNone = 0, kDynamicFactor = 1, kConstantFactor = 2 };

  int MaxNoOfIter = 0;
  int GradualDrainActivation = 1;
  float MaxHeadChange = 0;
  int HorizontalConductanceAveraging = 1;
  float MaxResidualError = 0;
  float SatThicknessThreshold = 0.05f;
  float UnderRelaxFactor = 0;
  int UnderRelaxation = kNone;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// Successive overrelaxation.
class CCompControlParaSZSORKvf : public CTvnKvfBase {
 public:
  explicit CCompControlParaSZSORKvf(CYbSEKvfBase* parent);

  int MaxNoOfIter = 200;
  float MaxHeadChange = 0.001f;
  float MaxResidualError = 0.0001f;
  float SatThicknessThreshold = 0.05f;
  float OverRelaxFactor = 1.3f;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// Exchange between river and aquifer in transient simulations.
class CCompControlParaRivExKvf : public CTvnKvfBase {
 public:
  explicit CCompControlParaRivExKvf(CYbSEKvfBase* parent);

  float MaxFractionHPointVolume = 0.9f;

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys("MaxFractionHPointVolume", MaxFractionHPointVolume); }
};

/// Transport on colloids in a water quality simulation.
class CCompControlParaColloidWQKvf : public CTvnKvfBase {
 public:
  explicit CCompControlParaColloidWQKvf(CYbSEKvfBase* parent);

  enum Detachment : int { kKineticEnergy = 0, kRainfallMomentum = 1, kMacro = 2 };
  enum Erosion : int { kParks = 0, kRose = 1, kEurosem = 2 };

  double ConversionFactor = 0.7;
  double MaxPrecDepthPerTimeStep = 1;
  double PrecThresholdRate = 0.1;
  double FractionTransportedParticle = 1;
  double WaterDepthCorr = 1;
  int DetachmentModel = kMacro;
  int ErosionModel = kEurosem;
  int IncludeSorption = 0;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

}  // namespace tervane
