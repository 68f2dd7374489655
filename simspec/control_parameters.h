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
  explicit CCompControlParaOLKvf(CYbSEKvfBase* parent)
      : CTvnKvfBase("OL Computational Control Parameters", "CompControlParaOL", parent) {
    SetPage(kControlOLPage);
  }

  int SolverOption = 0;  ///< 0 successive overrelaxation, 1 explicit.
  int MaxNoOfIter = 200;
  float MaxHeadChange = 0.0001f;     ///< m
  float MaxResidualError = 0.0001f;  ///< m/d
  float RelaxFactor = 0.9f;
  float MaxCourant_Explicit = 0.8f;
  float WaterDepthThreshold = 0.0001f;  ///< m
  float OLFlowReductionGradientThreshold = 0.0001f;
  int OLRiverExchangeOption = 0;                 ///< 0 Manning equation, 1 weir formula.
  float WeirFlowReductionDepthThreshold = 0.1f;  ///< m
  int Multicell = 0;
  float MulticellFactor = 2;

  int IsDlgUsedInSetup() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// Unsaturated zone.
class CCompControlParaUZKvf : public CTvnKvfBase {
 public:
  explicit CCompControlParaUZKvf(CYbSEKvfBase* parent)
      : CTvnKvfBase("UZ Computational Control Parameters", "CompControlParaUZ", parent) {
    SetPage(kControlUZPage);
  }

  float MaxWaterBalanceError = 0.03f;  ///< Fraction, in one node.
  int MaxNoOfIter = 50;
  float IterStopCriteria = 0.002f;  ///< Fraction of the pressure head.
  float CouplingCriteria = 0.001f;  ///< Water balance error of a profile.

  int IsDlgUsedInSetup() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// Saturated zone: the choice of solver. The parameters of each solver are children, and all are written.
class CCompControlParaSZKvf : public CTvnKvfBase {
 public:
  explicit CCompControlParaSZKvf(CYbSEKvfBase* parent);

  /// Values of `SolverOption`.
  enum Solver : int { kTransient = 0, kSteadyState = 1, kSuccessiveOverrelaxation = 2 };
  int SolverOption = kTransient;

  int IsDlgUsedInSetup() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys("SolverOption", SolverOption); }
};

/// Parameters of one solver of the saturated zone, which takes part when its parent has chosen that solver.
class CCompControlParaSZSolverBase : public CTvnKvfBase {
 public:
  CCompControlParaSZSolverBase(std::string title, std::string section, int solver, CYbSEKvfBase* parent)
      : CTvnKvfBase(std::move(title), std::move(section), parent), solver_(solver) {}

  int IsDlgUsedInSetup() override;

 private:
  int solver_;
};

/// Preconditioned conjugate gradient.
class CCompControlParaSZPCGBase : public CCompControlParaSZSolverBase {
 public:
  using CCompControlParaSZSolverBase::CCompControlParaSZSolverBase;

  int MaxNoOfIter = 0;
  int GradualDrainActivation = 1;
  float MaxHeadChange = 0;  ///< m
  int HorizontalConductanceAveraging = 1;
  float MaxResidualError = 0;           ///< m/d
  float SatThicknessThreshold = 0.05f;  ///< m
  float UnderRelaxFactor = 0;
  int UnderRelaxation = 0;  ///< 0 none, 1 with dynamic, 2 with constant factor.

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

class CCompControlParaSZPCGTransKvf : public CCompControlParaSZPCGBase {
 public:
  explicit CCompControlParaSZPCGTransKvf(CYbSEKvfBase* parent);
};

class CCompControlParaSZPCGSteadyKvf : public CCompControlParaSZPCGBase {
 public:
  explicit CCompControlParaSZPCGSteadyKvf(CYbSEKvfBase* parent);
};

/// Successive overrelaxation.
class CCompControlParaSZSORKvf : public CCompControlParaSZSolverBase {
 public:
  explicit CCompControlParaSZSORKvf(CYbSEKvfBase* parent);

  int MaxNoOfIter = 200;
  float MaxHeadChange = 0.001f;         ///< m
  float MaxResidualError = 0.0001f;     ///< m/d
  float SatThicknessThreshold = 0.05f;  ///< m
  float OverRelaxFactor = 1.3f;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// Exchange between river and aquifer in transient simulations.
class CCompControlParaRivExKvf : public CTvnKvfBase {
 public:
  explicit CCompControlParaRivExKvf(CYbSEKvfBase* parent)
      : CTvnKvfBase("River-Aquifer Exchange Computational Control Parameters (transient simulations)",
                    "CompControlParaRivEx", parent) {}

  float MaxFractionHPointVolume = 0.9f;

  int IsDlgUsedInSetup() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys("MaxFractionHPointVolume", MaxFractionHPointVolume); }
};

/// Transport on colloids in a water quality simulation.
class CCompControlParaColloidWQKvf : public CTvnKvfBase {
 public:
  explicit CCompControlParaColloidWQKvf(CYbSEKvfBase* parent)
      : CTvnKvfBase("Colloid Control Parameters", "ColloidControlPara", parent) {
    SetPage(kColloidWQPage);
  }

  double ConversionFactor = 0.7;       ///< g metabolite / g pesticide
  double MaxPrecDepthPerTimeStep = 1;  ///< mm
  double PrecThresholdRate = 0.1;      ///< mm/hour
  double FractionTransportedParticle = 1;
  double WaterDepthCorr = 1;  ///< 1/mm
  int DetachmentModel = 2;    ///< 0 kinetic energy, 1 rainfall momentum, 2 MACRO.
  int ErosionModel = 2;       ///< 0 Parks, 1 Rose, 2 Eurosem.
  int IncludeSorption = 0;

  int IsDlgUsedInSetup() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

}  // namespace tervane
