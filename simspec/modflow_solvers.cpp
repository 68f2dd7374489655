// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/modflow_solvers.h"

#include <algorithm>

#include <fmt/format.h>

#include "platform/item_types.h"
#include "simspec/conditions.h"
#include "simspec/pages.h"

namespace tervane {

std::vector<int> SolversOfEngine(int engine) {
  switch (engine) {
    case kEngineModflowSurfact:
      return {kSolverSOR, kSolverSIP, kSolverPCG4, kSolverPCG2};
    case kEngineModflow96:
      return {kSolverSOR, kSolverSIP, kSolverPCG2};
    case kEngineModflow2000:
      return {kSolverSOR, kSolverSIP, kSolverPCG2, kSolverLMG};
    default:
      return {};
  }
}

// ---- The solvers

namespace {

constexpr ModflowSolverKind kLMG{"LMG Link Multi-Grid Parameters", "Link Multi-Grid (LMG)", "CompControlParaModLMG",
                                 kSolverLMG};
constexpr ModflowSolverKind kPCG2{"PCG2 Subsurface Computational Control Parameters",
                                  "Preconditioned Conjugate Gradient Package (PCG2)", "CompControlParaModPCG2",
                                  kSolverPCG2};
constexpr ModflowSolverKind kPCG4{"PCG4 Subsurface Computational Control Parameters",
                                  "Preconditioned Conjugate Gradient Package (PCG4)", "CompControlParaModPCG4",
                                  kSolverPCG4};
constexpr ModflowSolverKind kSIP{"SIP Subsurface Computational Control Parameters", "", "CompControlParaModSIP",
                                 kSolverSIP};
constexpr ModflowSolverKind kSOR{"SOR Subsurface Computational Control Parameters", "", "CompControlParaModSOR",
                                 kSolverSOR};

constexpr std::string_view kOuterIterations = "Maximum number of outer iterations must be a positive value";

// How the file tells a kind of damping in the place of its value.
constexpr float kCooleyInFile = -1, kRelativeReducedResidualInFile = -2;

}  // namespace

CCompControlParaModBase::CCompControlParaModBase(const ModflowSolverKind& kind, CYbSEKvfBase* parent)
    : CTvnKvfBase(std::string(kind.title), std::string(kind.section), parent) {
  SetAbbreviatedTitle(std::string(kind.shortTitle));
  TakesPartWhen(IsInParent(&CCompControlParaModKvf::SolverOption, {kind.solver}));
}

int CCompControlParaModBase::ValidateData() {
  bool isValid = true;
  for (const SolverDemand& demand : Demands()) {
    if (demand.isMet) continue;
    AddError(std::string(demand.error), std::string(demand.key));
    isValid = false;
  }
  return isValid;
}

CCompControlParaModLMGKvf::CCompControlParaModLMGKvf(CYbSEKvfBase* parent) : CCompControlParaModBase(kLMG, parent) {}

void CCompControlParaModLMGKvf::ExchangeKeys(KeyExchange& keys) {
  keys("MXITER", MXITER);
  keys("MXCYC", MXCYC);
  keys("BCLOSE", BCLOSE);
  keys.Custom(
          "DAMP",
          [&] {
            return DampingKind == kCooley                    ? kCooleyInFile
                   : DampingKind == kRelativeReducedResidual ? kRelativeReducedResidualInFile
                                                             : DAMP;
          },
          [&](float damp) {
            DampingKind = damp == kCooleyInFile                    ? kCooley
                          : damp == kRelativeReducedResidualInFile ? kRelativeReducedResidual
                                                                   : kSpecified;
            DAMP = DampingKind == kSpecified ? damp : 1;
          })
      .HeldIn(&DAMP);
  keys("DUP", DUP);
  keys("DLOW", DLOW);
  keys("STOR1", STOR1);
  keys("STOR2", STOR2);
  keys("STOR3", STOR3);
  keys("ICG", ICG);
  keys("UseDefault", UseDefault);
  keys("IOUTAMG", IOUTAMG).OneOf(kOutputs);
}

void CCompControlParaModLMGKvf::ExchangeState(KeyExchange& keys) {
  CCompControlParaModBase::ExchangeState(keys);
  keys("kind of damping", DampingKind);
  keys("value of damping", DAMP);
}

void CCompControlParaModLMGKvf::TakeUseDefault(int use) {
  UseDefault = use;
  if (!use) return;
  STOR1 = kDefaultSTOR1;
  STOR2 = kDefaultSTOR2;
  STOR3 = kDefaultSTOR3;
}

std::vector<SolverDemand> CCompControlParaModLMGKvf::Demands() const {
  const bool isReduced = DampingKind == kRelativeReducedResidual;
  // The storage is asked for where the defaults are used.
  return {{"MXITER", MXITER >= 0, kOuterIterations},
          {"MXCYC", MXCYC >= 0, "Maximum number of cycles must be a positive value"},
          {"BCLOSE", BCLOSE > 0, "Budget closure criterion must be greater than 0"},
          {"DAMP", DampingKind != kSpecified || DAMP > 0, "Specified damping value must be greater than 0"},
          {"DUP", !isReduced || DUP > 0, "Maximum damping value must be greater than 0"},
          {"DLOW", !isReduced || DLOW > 0, "Minimum damping value must be greater than 0"},
          {"STOR1", !UseDefault || STOR1 > 0, "Storage for A and JA matrices must be greater than 0"},
          {"STOR2", !UseDefault || STOR2 > 0, "Storage for U, FRHS and IA matrices must be greater than 0"},
          {"STOR3", !UseDefault || STOR3 > 0, "Storage for IG matrix must be greater than 0"}};
}

CCompControlParaModPCG2Kvf::CCompControlParaModPCG2Kvf(CYbSEKvfBase* parent) : CCompControlParaModBase(kPCG2, parent) {}

void CCompControlParaModPCG2Kvf::ExchangeKeys(KeyExchange& keys) {
  keys("MXITER", MXITER);
  keys("ITER1", ITER1);
  keys("HCLOSE", HCLOSE);
  keys("RCLOSE", RCLOSE);
  keys("RELAX", RELAX);
  keys.WriteOnly("IPRPCG", 1);
  keys("MUTPCG", MUTPCG).OneOf(kSolverOutputs);
  keys("DAMP", DAMP);
}

std::vector<SolverDemand> CCompControlParaModPCG2Kvf::Demands() const {
  return {{"MXITER", MXITER >= 0, kOuterIterations},
          {"ITER1", ITER1 >= 0, "Maximum number of inner iterations must be a positive value"},
          {"HCLOSE", HCLOSE > 0, "Head change must be greater than 0"},
          {"RCLOSE", RCLOSE > 0, "Residual criterion for convergence must be greater than 0"},
          {"RELAX", RELAX > 0, "Relaxation parameter must be greater than 0"}};
}

CCompControlParaModPCG4Kvf::CCompControlParaModPCG4Kvf(CYbSEKvfBase* parent) : CCompControlParaModBase(kPCG4, parent) {}

void CCompControlParaModPCG4Kvf::ExchangeKeys(KeyExchange& keys) {
  keys("MXITER", MXITER);
  keys("ITERI", ITERI);
  keys("HCLOSE", HCLOSE);
  keys("BFACT", BFACT);
  keys("RESRED", RESRED);
  keys("MNORTH", MNORTH);
  keys("ApplyDampening", ApplyDampening);
  keys("UseNewtonRaphson", UseNewtonRaphson);
  // The engine's own forms of the choices above and below.
  keys.WriteOnly("INEWT", UseNewtonRaphson ? 1 : 0);
  keys.WriteOnly("IDMPBOT", ApplyDampening ? 1 : 0);
  keys.WriteOnly("MUTPCG", OutputFromSolver == kNoSolverOutput          ? 2
                           : OutputFromSolver == kConvergenceAndSummary ? 0
                                                                        : 1);
  keys("OutputFromSolver", OutputFromSolver).OneOf(kSolverOutputs);
}

CCompControlParaModSIPKvf::CCompControlParaModSIPKvf(CYbSEKvfBase* parent) : CCompControlParaModBase(kSIP, parent) {}

void CCompControlParaModSIPKvf::ExchangeKeys(KeyExchange& keys) {
  keys("MXITER", MXITER);
  keys("NPARM", NPARM);
  keys("ACCL", ACCL);
  keys("HCLOSE", HCLOSE);
  keys("IPRSIP", IPRSIP);
  keys("WSEED", WSEED);
  keys("SeedOption", SeedOption).OneOf(kSeeds);
  keys.WriteOnly("IPCALC", SeedOption == kSpecified ? 0 : 1);
}

CCompControlParaModSORKvf::CCompControlParaModSORKvf(CYbSEKvfBase* parent) : CCompControlParaModBase(kSOR, parent) {}

void CCompControlParaModSORKvf::ExchangeKeys(KeyExchange& keys) {
  keys("MXITER", MXITER);
  keys("HCLOSE", HCLOSE);
  keys("ACCL", ACCL);
  keys("IPRSOR", IPRSOR);
}

// ---- The choice

CCompControlParaModKvf::CCompControlParaModKvf(CYbSEKvfBase* parent)
    : CTvnKvfBase("Subsurface Computational Control Parameters", "CompControlParaModSZ", parent) {
  SetPage(kControlModflowPage);
  TakesPartWhen(AnyModflow());
  NewChild<CCompControlParaModLMGKvf>();
  NewChild<CCompControlParaModPCG2Kvf>();
  NewChild<CCompControlParaModPCG4Kvf>();
  NewChild<CCompControlParaModSIPKvf>();
  NewChild<CCompControlParaModSORKvf>();
}

void CCompControlParaModKvf::ExchangeKeys(KeyExchange& keys) {
  keys("SolverOption", SolverOption).OneOf(kModflowSolvers);
}

int CCompControlParaModKvf::ValidateData() {
  const int engine = EngineOf(*this);
  const std::string_view solver = TextOf(kModflowSolvers, SolverOption);
  if (!solver.empty() && !std::ranges::count(SolversOfEngine(engine), SolverOption))
    AddWarning(fmt::format("{} has no solver {}.", TextOf(kEngines, engine), solver), "SolverOption",
               fmt::format("its page takes {} instead", TextOf(kModflowSolvers, kSolverSOR)));
  return 1;
}

// ---- Packages

namespace {

constexpr KeyChoice kWeightings[] = {{CCompControlParaModPackageKvf::kUpstream, "Use upstream weighting (Recommended)"},
                                     {CCompControlParaModPackageKvf::kMidpoint, "Use midpoint weighting"}};

}  // namespace

CCompControlParaModPackageKvf::CCompControlParaModPackageKvf(CYbSEKvfBase* parent)
    : CTvnKvfBase("Package Control Parameters", "CompControlParaModPackage", parent) {
  SetPage(kModflowPackagePage);
  TakesPartWhen(AnyModflow() && ModflowComponent(&CModModelCompKvf::Subsurface));
}

void CCompControlParaModPackageKvf::ExchangeKeys(KeyExchange& keys) {
  keys("WeightingRelPermOption", WeightingRelPermOption).OneOf(kWeightings);
  keys("HDRY", HDRY).Quantity(quantity::kElevation);
  keys("HDRY2", HDRY2).Quantity(quantity::kFraction);
  keys("WettingThreshold", WettingThreshold);
}

}  // namespace tervane
