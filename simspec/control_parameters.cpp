// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/control_parameters.h"

#include "simspec/conditions.h"
#include "simspec/pages.h"

namespace tervane {

// ---- Overland flow

namespace {

constexpr KeyChoice kOverlandSolvers[] = {
    {CCompControlParaOLKvf::kSuccessiveOverrelaxation, "Successive Overrelaxation (SOR)"},
    {CCompControlParaOLKvf::kExplicit, "Explicit (Recommended when overbank spilling is allowed)"}};
constexpr KeyChoice kRiverExchanges[] = {
    {CCompControlParaOLKvf::kManning, "Manning equation (using OL flow Manning numbers)"},
    {CCompControlParaOLKvf::kWeir, "Weir formula: (Weir data specified in Fluvane)"}};

}  // namespace

CCompControlParaOLKvf::CCompControlParaOLKvf(CYbSEKvfBase* parent)
    : CTvnKvfBase("OL Computational Control Parameters", "CompControlParaOL", parent) {
  SetPage(kControlOLPage);
  TakesPartWhen(OwnEngine() && Component(&CModelCompKvf::WM) && Component(&CModelCompKvf::OL) &&
                Method(&CModelCompKvf::OL_ModelType, kFiniteDifferenceOverland));
}

void CCompControlParaOLKvf::ExchangeKeys(KeyExchange& keys) {
  // Before version 10 there was one solver with three parameters.
  keys.Since(10)("SolverOption", SolverOption).OneOf(kOverlandSolvers);
  keys("MaxNoOfIter", MaxNoOfIter).AtLeast(1);
  keys.Since(10)("MaxHeadChange", MaxHeadChange).Unit("[m]");
  keys.Until(9, "IterStopCriteria", MaxHeadChange);
  keys.Since(10)("MaxResidualError", MaxResidualError).Unit("[m/d]");
  keys.Since(10)("RelaxFactor", RelaxFactor).Range(0.01, 1);
  keys.Since(10)("MaxCourant_Explicit", MaxCourant_Explicit).Range(0.1, 0.9);
  keys("WaterDepthThreshold", WaterDepthThreshold).Unit("[m]");
  keys.Since(10)("OLFlowReductionGradientThreshold", OLFlowReductionGradientThreshold);
  keys.Since(10)("OLRiverExchangeOption", OLRiverExchangeOption).OneOf(kRiverExchanges);
  keys.Since(10)("WeirFlowReductionDepthThreshold", WeirFlowReductionDepthThreshold).Unit("[m]");
  keys.Since(10)("Multicell", Multicell);
  keys.Since(10)("MulticellFactor", MulticellFactor);
}

// ---- Unsaturated zone

CCompControlParaUZKvf::CCompControlParaUZKvf(CYbSEKvfBase* parent)
    : CTvnKvfBase("UZ Computational Control Parameters", "CompControlParaUZ", parent) {
  SetPage(kControlUZPage);
  TakesPartWhen(OwnEngine() && Component(&CModelCompKvf::WM) && Component(&CModelCompKvf::UZ));
}

void CCompControlParaUZKvf::ExchangeKeys(KeyExchange& keys) {
  keys("MaxWaterBalanceError", MaxWaterBalanceError);
  keys("MaxNoOfIter", MaxNoOfIter).AtLeast(1);
  keys("IterStopCriteria", IterStopCriteria);
  keys("CouplingCriteria", CouplingCriteria);
}

// ---- Saturated zone

namespace {

constexpr KeyChoice kSaturatedSolvers[] = {
    {CCompControlParaSZKvf::kTransient, "Preconditioned Conjugate Gradient, Transient"},
    {CCompControlParaSZKvf::kSteadyState, "Preconditioned Conjugate Gradient, Steady State"},
    {CCompControlParaSZKvf::kSuccessiveOverrelaxation, "Successive Overrelaxation Package (SOR)"}};
constexpr KeyChoice kUnderRelaxations[] = {
    {CCompControlParaSZPCGBase::kNone, "No under-relaxation"},
    {CCompControlParaSZPCGBase::kDynamicFactor, "Under-relaxation with dynamic calculation of factor"},
    {CCompControlParaSZPCGBase::kConstantFactor, "Under-relaxation with constant factor    (0.01-0.99):"}};

Condition Solver(int solver) { return IsInParent(&CCompControlParaSZKvf::SolverOption, {solver}); }

}  // namespace

CCompControlParaSZKvf::CCompControlParaSZKvf(CYbSEKvfBase* parent)
    : CTvnKvfBase("SZ Computational Control Parameters", "CompControlParaSZ", parent) {
  SetPage(kControlSZPage);
  TakesPartWhen(OwnEngine() && Component(&CModelCompKvf::WM) && Component(&CModelCompKvf::SZ) &&
                Method(&CModelCompKvf::SZ_ModelType, kFiniteDifferenceSaturated));
  transient_ = NewChild<CCompControlParaSZPCGBase>(SaturatedSolverKind{"CCompControlParaSZPCGTransKvf",
                                                                       "SZ Computational Control Parameters, Transient",
                                                                       "CompControlParaSZPCGTrans", kTransient});
  transient_->MaxNoOfIter = 50;
  transient_->MaxHeadChange = 0.005f;
  transient_->MaxResidualError = 0.0005f;
  transient_->UnderRelaxFactor = 0.99f;
  transient_->UnderRelaxation = CCompControlParaSZPCGBase::kNone;
  steady_ = NewChild<CCompControlParaSZPCGBase>(SaturatedSolverKind{"CCompControlParaSZPCGSteadyKvf",
                                                                    "SZ Computational Control Parameters, Steady State",
                                                                    "CompControlParaSZPCGSteady", kSteadyState});
  steady_->MaxNoOfIter = 1000;
  steady_->MaxHeadChange = 0.001f;
  steady_->MaxResidualError = 1e-5f;
  steady_->UnderRelaxFactor = 0.2f;
  steady_->UnderRelaxation = CCompControlParaSZPCGBase::kDynamicFactor;
  NewChild<CCompControlParaSZSORKvf>();
  NewChild<CCompControlParaRivExKvf>();
}

void CCompControlParaSZKvf::ExchangeKeys(KeyExchange& keys) {
  keys("SolverOption", SolverOption).OneOf(kSaturatedSolvers);
}

CCompControlParaSZPCGBase::CCompControlParaSZPCGBase(const SaturatedSolverKind& kind, CYbSEKvfBase* parent)
    : CTvnKvfBase(kind.title, kind.section, parent) {
  SetClassName(kind.className);
  TakesPartWhen(Solver(kind.solver));
}

void CCompControlParaSZPCGBase::ExchangeKeys(KeyExchange& keys) {
  keys("MaxNoOfIter", MaxNoOfIter).AtLeast(1);
  keys("GradualDrainActivation", GradualDrainActivation);
  keys("MaxHeadChange", MaxHeadChange).Unit("[m]");
  keys("HorizontalConductanceAveraging", HorizontalConductanceAveraging);
  keys("MaxResidualError", MaxResidualError).Unit("[m/d]");
  keys("SatThicknessThreshold", SatThicknessThreshold).Unit("[m]");
  keys("UnderRelaxFactor", UnderRelaxFactor).Range(0.01, 0.99);
  keys("UnderRelaxation", UnderRelaxation).OneOf(kUnderRelaxations);
}

CCompControlParaSZSORKvf::CCompControlParaSZSORKvf(CYbSEKvfBase* parent)
    : CTvnKvfBase("SZ Computational Control Parameters, SOR", "CompControlParaSZSOR", parent) {
  TakesPartWhen(Solver(CCompControlParaSZKvf::kSuccessiveOverrelaxation));
}

void CCompControlParaSZSORKvf::ExchangeKeys(KeyExchange& keys) {
  keys("MaxNoOfIter", MaxNoOfIter).AtLeast(1);
  keys("MaxHeadChange", MaxHeadChange).Unit("[m]");
  keys("MaxResidualError", MaxResidualError).Unit("[m/d]");
  keys("SatThicknessThreshold", SatThicknessThreshold).Unit("[m]");
  keys("OverRelaxFactor", OverRelaxFactor).Range(1, 2);
}

CCompControlParaRivExKvf::CCompControlParaRivExKvf(CYbSEKvfBase* parent)
    : CTvnKvfBase("River-Aquifer Exchange Computational Control Parameters (transient simulations)",
                  "CompControlParaRivEx", parent) {
  TakesPartWhen(!Solver(CCompControlParaSZKvf::kSteadyState) && Component(&CModelCompKvf::River));
}

// ---- Colloids

namespace {

constexpr KeyChoice kDetachmentModels[] = {{CCompControlParaColloidWQKvf::kKineticEnergy, "Kinetic Energy model"},
                                           {CCompControlParaColloidWQKvf::kRainfallMomentum, "Rainfall momentum model"},
                                           {CCompControlParaColloidWQKvf::kMacro, "MACRO model"}};
constexpr KeyChoice kErosionModels[] = {{CCompControlParaColloidWQKvf::kParks, "Parks"},
                                        {CCompControlParaColloidWQKvf::kRose, "Rose"},
                                        {CCompControlParaColloidWQKvf::kEurosem, "Eurosem"}};

}  // namespace

CCompControlParaColloidWQKvf::CCompControlParaColloidWQKvf(CYbSEKvfBase* parent)
    : CTvnKvfBase("Colloid Control Parameters", "ColloidControlPara", parent) {
  SetPage(kColloidWQPage);
  TakesPartWhen(OnInParent(&CModelCompWQKvf::IncludeProcesses) &&
                IsInParent(&CModelCompWQKvf::ProcessType, {kColloids}));
}

void CCompControlParaColloidWQKvf::ExchangeKeys(KeyExchange& keys) {
  keys("ConversionFactor", ConversionFactor).Unit("[g metabolite/ g pesticide]");
  keys("MaxPrecDepthPerTimeStep", MaxPrecDepthPerTimeStep).Unit("[mm]");
  keys("PrecThresholdRate", PrecThresholdRate).Unit("[mm/hour]");
  keys("FractionTransportedParticle", FractionTransportedParticle).Unit("[-]");
  keys("WaterDepthCorr", WaterDepthCorr).Unit("[1/mm]");
  keys("DetachmentModel", DetachmentModel).OneOf(kDetachmentModels);
  keys("ErosionModel", ErosionModel).OneOf(kErosionModels);
  keys("IncludeSorption", IncludeSorption);
}

}  // namespace tervane
