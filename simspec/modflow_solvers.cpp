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

// What several solvers have.
constexpr std::string_view kIterationsLabel = "Maximum number of iterations",
                           kOuterIterationsLabel = "Maximum number of outer iterations",
                           kInnerIterationsLabel = "Maximum number of inner iterations",
                           kHeadChangeLabel = "Head change criterion for convergence",
                           kAccelerationLabel = "Acceleration parameter",
                           kPrintoutLabel = "Printout interval for maximum head change", kOutput = "Output";

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
  std::vector<KeyInfo> keys;
  DescribeKeys(keys);
  bool isValid = true;
  for (const SolverField& field : Fields()) {
    const auto isMet = [&](const auto* value) { return field.demand->allowsZero ? *value >= 0 : *value > 0; };
    if (!field.demand || !field.demand->when.Holds(*this) || std::visit(isMet, field.value)) continue;
    const void* const member = std::visit([](const void* value) { return value; }, field.value);
    const auto key = std::ranges::find(keys, member, &KeyInfo::member);
    AddError(std::string(field.demand->error), key == keys.end() ? std::string() : key->key);
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

std::vector<SolverField> CCompControlParaModLMGKvf::Fields() {
  constexpr std::string_view kDamping = "Damping", kStorage = "Storage";
  const Condition isReduced = Is(DampingKind, kRelativeReducedResidual), isSpecified = Is(DampingKind, kSpecified);
  // Storage that the user tells is not checked; that of the defaults is.
  const Condition usesDefault = On(UseDefault);
  const auto storage = [&](float& value, std::string_view label, std::string_view error) {
    return SolverField{.value = &value,
                       .label = label,
                       .frame = kStorage,
                       .enabled = !usesDefault,
                       .demand = SolverField::Demand{error, false, usesDefault}};
  };
  return {{.value = &MXITER, .label = kIterationsLabel, .demand = SolverField::Demand{kOuterIterations, true}},
          {.value = &MXCYC,
           .label = "Maximum number of cycles per iteration",
           .demand = SolverField::Demand{"Maximum number of cycles must be a positive value", true}},
          {.value = &BCLOSE,
           .label = "Budget closure criterion",
           .demand = SolverField::Demand{"Budget closure criterion must be greater than 0"}},
          {.value = &ICG, .label = "Use Conjugate gradient iterations (recommended)", .kind = SolverField::Kind::Check},
          {.value = &DampingKind,
           .kind = SolverField::Kind::Options,
           .frame = kDamping,
           .choices = kDampings,
           .key = "DAMP"},
          {.value = &DUP,
           .label = "Maximum damping value",
           .frame = kDamping,
           .enabled = isReduced,
           .demand = SolverField::Demand{"Maximum damping value must be greater than 0", false, isReduced}},
          {.value = &DLOW,
           .label = "Minimum damping value",
           .frame = kDamping,
           .enabled = isReduced,
           .demand = SolverField::Demand{"Minimum damping value must be greater than 0", false, isReduced}},
          {.value = &DAMP,
           .label = "Damping value (1.0 = no damping)",
           .frame = kDamping,
           .enabled = isSpecified,
           .demand = SolverField::Demand{"Specified damping value must be greater than 0", false, isSpecified}},
          {.value = &UseDefault,
           .label = "Use defaults (recommended)",
           .kind = SolverField::Kind::Check,
           .frame = kStorage,
           .then = [this] { TakeUseDefault(UseDefault); }},
          storage(STOR1, "Storage for A and JA matrices", "Storage for A and JA matrices must be greater than 0"),
          storage(STOR2, "Storage for U, FRHS and IA matrices",
                  "Storage for U, FRHS and IA matrices must be greater than 0"),
          storage(STOR3, "Storage for IG matrix", "Storage for IG matrix must be greater than 0"),
          {.value = &IOUTAMG, .kind = SolverField::Kind::Options, .frame = kOutput}};
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

std::vector<SolverField> CCompControlParaModPCG2Kvf::Fields() {
  return {{.value = &MXITER, .label = kOuterIterationsLabel, .demand = SolverField::Demand{kOuterIterations, true}},
          {.value = &ITER1,
           .label = kInnerIterationsLabel,
           .demand = SolverField::Demand{"Maximum number of inner iterations must be a positive value", true}},
          {.value = &HCLOSE,
           .label = kHeadChangeLabel,
           .demand = SolverField::Demand{"Head change must be greater than 0"}},
          {.value = &RCLOSE,
           .label = "Residual criterion for convergence",
           .demand = SolverField::Demand{"Residual criterion for convergence must be greater than 0"}},
          {.value = &RELAX,
           .label = "Relaxation Parameter",
           .demand = SolverField::Demand{"Relaxation parameter must be greater than 0"}},
          {.value = &DAMP, .label = "Damping Factor"},
          {.value = &MUTPCG, .kind = SolverField::Kind::Options, .frame = kOutput}};
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

std::vector<SolverField> CCompControlParaModPCG4Kvf::Fields() {
  constexpr std::string_view kBacktracking = "Additional parameters for Newton-Raphson backtracking scheme";
  const Condition isNewton = On(UseNewtonRaphson);
  return {{.value = &MXITER, .label = kOuterIterationsLabel},
          {.value = &ITERI, .label = kInnerIterationsLabel},
          {.value = &HCLOSE, .label = kHeadChangeLabel},
          {.value = &MNORTH, .label = "Maximum number of orthogonalizations"},
          {.value = &ApplyDampening, .label = "Apply dampening", .kind = SolverField::Kind::Check},
          {.value = &UseNewtonRaphson,
           .label = "Use Newton-Raphson linearization with backtracking",
           .kind = SolverField::Kind::Check},
          {.value = &BFACT, .label = "Backtracking factor", .frame = kBacktracking, .enabled = isNewton},
          {.value = &RESRED, .label = "Residual reduction factor", .frame = kBacktracking, .enabled = isNewton},
          {.value = &OutputFromSolver, .kind = SolverField::Kind::Options, .frame = kOutput}};
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

std::vector<SolverField> CCompControlParaModSIPKvf::Fields() {
  return {{.value = &MXITER, .label = kIterationsLabel},
          {.value = &NPARM, .label = "Number of iteration parameters"},
          {.value = &ACCL, .label = kAccelerationLabel},
          {.value = &HCLOSE, .label = kHeadChangeLabel},
          {.value = &IPRSIP, .label = kPrintoutLabel},
          {.value = &SeedOption, .kind = SolverField::Kind::Options, .frame = "Seed"},
          {.value = &WSEED, .label = "Seed", .frame = "Seed", .enabled = Is(SeedOption, kSpecified)}};
}

CCompControlParaModSORKvf::CCompControlParaModSORKvf(CYbSEKvfBase* parent) : CCompControlParaModBase(kSOR, parent) {}

void CCompControlParaModSORKvf::ExchangeKeys(KeyExchange& keys) {
  keys("MXITER", MXITER);
  keys("HCLOSE", HCLOSE);
  keys("ACCL", ACCL);
  keys("IPRSOR", IPRSOR);
}

std::vector<SolverField> CCompControlParaModSORKvf::Fields() {
  return {{.value = &MXITER, .label = kIterationsLabel},
          {.value = &HCLOSE, .label = kHeadChangeLabel},
          {.value = &ACCL, .label = kAccelerationLabel},
          {.value = &IPRSOR, .label = kPrintoutLabel}};
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
