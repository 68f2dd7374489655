// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/control_parameters.h"

#include "simspec/model_components.h"
#include "simspec/pages.h"

namespace tervane {

// ---- Overland flow

int CCompControlParaOLKvf::IsDlgUsedInSetup() {
  const CModelCompKvf& components = ModelCompOf(*this);
  return EngineOf(*this) == kEngineTervane && components.WM && components.OL && components.OL_ModelType == 0;
}

void CCompControlParaOLKvf::ExchangeKeys(KeyExchange& keys) {
  // Before version 10 there was one solver with three parameters.
  keys.Since(10)("SolverOption", SolverOption);
  keys("MaxNoOfIter", MaxNoOfIter);
  keys.Since(10)("MaxHeadChange", MaxHeadChange);
  keys.Until(9, "IterStopCriteria", MaxHeadChange);
  keys.Since(10)("MaxResidualError", MaxResidualError);
  keys.Since(10)("RelaxFactor", RelaxFactor);
  keys.Since(10)("MaxCourant_Explicit", MaxCourant_Explicit);
  keys("WaterDepthThreshold", WaterDepthThreshold);
  keys.Since(10)("OLFlowReductionGradientThreshold", OLFlowReductionGradientThreshold);
  keys.Since(10)("OLRiverExchangeOption", OLRiverExchangeOption);
  keys.Since(10)("WeirFlowReductionDepthThreshold", WeirFlowReductionDepthThreshold);
  keys.Since(10)("Multicell", Multicell);
  keys.Since(10)("MulticellFactor", MulticellFactor);
}

// ---- Unsaturated zone

int CCompControlParaUZKvf::IsDlgUsedInSetup() {
  const CModelCompKvf& components = ModelCompOf(*this);
  return EngineOf(*this) == kEngineTervane && components.WM && components.UZ;
}

void CCompControlParaUZKvf::ExchangeKeys(KeyExchange& keys) {
  keys("MaxWaterBalanceError", MaxWaterBalanceError);
  keys("MaxNoOfIter", MaxNoOfIter);
  keys("IterStopCriteria", IterStopCriteria);
  keys("CouplingCriteria", CouplingCriteria);
}

// ---- Saturated zone

CCompControlParaSZKvf::CCompControlParaSZKvf(CYbSEKvfBase* parent)
    : CTvnKvfBase("SZ Computational Control Parameters", "CompControlParaSZ", parent) {
  SetPage(kControlSZPage);
  NewChild<CCompControlParaSZPCGTransKvf>();
  NewChild<CCompControlParaSZPCGSteadyKvf>();
  NewChild<CCompControlParaSZSORKvf>();
  NewChild<CCompControlParaRivExKvf>();
}

int CCompControlParaSZKvf::IsDlgUsedInSetup() {
  const CModelCompKvf& components = ModelCompOf(*this);
  return EngineOf(*this) == kEngineTervane && components.WM && components.SZ && components.SZ_ModelType == 0;
}

namespace {

int SolverOf(const CYbSEKvfBase& child) {
  const auto* saturatedZone = dynamic_cast<const CCompControlParaSZKvf*>(child.GetParent());
  return saturatedZone ? saturatedZone->SolverOption : -1;
}

}  // namespace

int CCompControlParaSZSolverBase::IsDlgUsedInSetup() { return SolverOf(*this) == solver_; }

void CCompControlParaSZPCGBase::ExchangeKeys(KeyExchange& keys) {
  keys("MaxNoOfIter", MaxNoOfIter);
  keys("GradualDrainActivation", GradualDrainActivation);
  keys("MaxHeadChange", MaxHeadChange);
  keys("HorizontalConductanceAveraging", HorizontalConductanceAveraging);
  keys("MaxResidualError", MaxResidualError);
  keys("SatThicknessThreshold", SatThicknessThreshold);
  keys("UnderRelaxFactor", UnderRelaxFactor);
  keys("UnderRelaxation", UnderRelaxation);
}

CCompControlParaSZPCGTransKvf::CCompControlParaSZPCGTransKvf(CYbSEKvfBase* parent)
    : CCompControlParaSZPCGBase("SZ Computational Control Parameters, Transient", "CompControlParaSZPCGTrans",
                                CCompControlParaSZKvf::kTransient, parent) {
  MaxNoOfIter = 50;
  MaxHeadChange = 0.005f;
  MaxResidualError = 0.0005f;
  UnderRelaxFactor = 0.99f;
  UnderRelaxation = 0;
}

CCompControlParaSZPCGSteadyKvf::CCompControlParaSZPCGSteadyKvf(CYbSEKvfBase* parent)
    : CCompControlParaSZPCGBase("SZ Computational Control Parameters, Steady State", "CompControlParaSZPCGSteady",
                                CCompControlParaSZKvf::kSteadyState, parent) {
  MaxNoOfIter = 1000;
  MaxHeadChange = 0.001f;
  MaxResidualError = 1e-5f;
  UnderRelaxFactor = 0.2f;
  UnderRelaxation = 1;
}

CCompControlParaSZSORKvf::CCompControlParaSZSORKvf(CYbSEKvfBase* parent)
    : CCompControlParaSZSolverBase("SZ Computational Control Parameters, SOR", "CompControlParaSZSOR",
                                   CCompControlParaSZKvf::kSuccessiveOverrelaxation, parent) {}

void CCompControlParaSZSORKvf::ExchangeKeys(KeyExchange& keys) {
  keys("MaxNoOfIter", MaxNoOfIter);
  keys("MaxHeadChange", MaxHeadChange);
  keys("MaxResidualError", MaxResidualError);
  keys("SatThicknessThreshold", SatThicknessThreshold);
  keys("OverRelaxFactor", OverRelaxFactor);
}

int CCompControlParaRivExKvf::IsDlgUsedInSetup() {
  return SolverOf(*this) != CCompControlParaSZKvf::kSteadyState && ModelCompOf(*this).River;
}

// ---- Colloids

int CCompControlParaColloidWQKvf::IsDlgUsedInSetup() {
  const auto* waterQuality = dynamic_cast<const CModelCompWQKvf*>(GetParent());
  return waterQuality && waterQuality->IncludeProcesses && waterQuality->ProcessType == 2;
}

void CCompControlParaColloidWQKvf::ExchangeKeys(KeyExchange& keys) {
  keys("ConversionFactor", ConversionFactor);
  keys("MaxPrecDepthPerTimeStep", MaxPrecDepthPerTimeStep);
  keys("PrecThresholdRate", PrecThresholdRate);
  keys("FractionTransportedParticle", FractionTransportedParticle);
  keys("WaterDepthCorr", WaterDepthCorr);
  keys("DetachmentModel", DetachmentModel);
  keys("ErosionModel", ErosionModel);
  keys("IncludeSorption", IncludeSorption);
}

}  // namespace tervane
