// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/modflow_solvers.h"

#include <functional>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "simspec/basic_parameters.h"
#include "tests/simspec/test_setup.h"

namespace tervane::modflow_solvers_test {
namespace {

using test::TestSetup;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr const char* kSolver = "SimSpec/CompControlParaModSZ";
const std::string kOfLMG = fmt::format("{}/CompControlParaModLMG", kSolver);

/// A setup with an engine, a solver and values of one of the solvers.
std::string Sections(int engine, int solver, const std::string& section = "CompControlParaModSOR",
                     const std::string& keys = {}) {
  return fmt::format(
      "section SimSpec {{\nModelType = {}\nsection CompControlParaModSZ {{\nSolverOption = {}\nsection {} "
      "{{\n{}\n}}\n}}\n}}",
      engine, solver, section, keys);
}

TEST(ModflowSolvers, ANewSetupHasTheSolversInTheirOrder) {
  const std::pair<const char*, const char*> sections[] = {
      {"CompControlParaModLMG",
       "MXITER=20 MXCYC=50 BCLOSE=0.01f DAMP=1f DUP=1f DLOW=0.2f STOR1=3f STOR2=2.2f STOR3=5.4f ICG=1 UseDefault=1 "
       "IOUTAMG=0"},
      {"CompControlParaModPCG2", "MXITER=100 ITER1=30 HCLOSE=0.001f RCLOSE=0.01f RELAX=1f IPRPCG=1 MUTPCG=0 DAMP=1f"},
      {"CompControlParaModPCG4",
       "MXITER=200 ITERI=50 HCLOSE=0.01f BFACT=0.1f RESRED=1f MNORTH=5 ApplyDampening=1 UseNewtonRaphson=0 INEWT=0 "
       "IDMPBOT=1 MUTPCG=2 OutputFromSolver=0"},
      {"CompControlParaModSIP", "MXITER=500 NPARM=5 ACCL=1f HCLOSE=1e-4f IPRSIP=0 WSEED=0.001f SeedOption=0 IPCALC=1"},
      {"CompControlParaModSOR", "MXITER=500 HCLOSE=0.001f ACCL=1f IPRSOR=999"}};
  TestSetup setup;
  const CYbSEKvfBase* child = setup.At<CYbSEKvfBase>(kSolver).GetFirstChild();
  for (const auto& [section, keys] : sections) {
    EXPECT_EQ(child->GetSectionName(), section);
    EXPECT_EQ(setup.WrittenKeys(fmt::format("{}/{}", kSolver, section)), keys);
    child = setup.At<CYbSEKvfBase>(kSolver).GetNextChild(child);
  }
  EXPECT_EQ(setup.WrittenKeys("SimSpec/CompControlParaModPackage"),
            "WeightingRelPermOption=0 HDRY=0f HDRY2=1f WettingThreshold=0");
}

TEST(ModflowSolvers, WhatTheEngineIsToldFollowsTheChoices) {
  struct Case {
    const char *section, *keys, *written;
  };
  const Case cases[] = {// Read values of these keys count for nothing.
                        {"CompControlParaModPCG2", "IPRPCG = 7", "IPRPCG=1"},
                        {"CompControlParaModPCG4", "MUTPCG = 0\nINEWT = 1\nIDMPBOT = 0", "INEWT=0 IDMPBOT=1 MUTPCG=2"},
                        {"CompControlParaModPCG4", "UseNewtonRaphson = 1\nApplyDampening = 0\nOutputFromSolver = 1",
                         "INEWT=1 IDMPBOT=0 MUTPCG=1"},
                        {"CompControlParaModPCG4", "OutputFromSolver = 2", "MUTPCG=0"},
                        {"CompControlParaModSIP", "SeedOption = 1\nIPCALC = 1", "IPCALC=0"},
                        {"CompControlParaModSIP", "SeedOption = 0\nIPCALC = 0", "IPCALC=1"},
                        // One number tells the kind of damping and its value.
                        {"CompControlParaModLMG", "DAMP = 0.5", "DAMP=0.5f"},
                        {"CompControlParaModLMG", "DAMP = -1.0", "DAMP=-1f"},
                        {"CompControlParaModLMG", "DAMP = -2.0", "DAMP=-2f"},
                        {"CompControlParaModLMG", "DAMP = -3.0", "DAMP=-3f"}};
  for (const Case& c : cases) {
    TestSetup setup(Sections(1, 0, c.section, c.keys));
    EXPECT_THAT(setup.WrittenKeys(fmt::format("{}/{}", kSolver, c.section)), testing::HasSubstr(c.written)) << c.keys;
    EXPECT_THAT(setup.Report().unread, IsEmpty()) << c.keys;
  }
}

TEST(ModflowSolvers, AKindOfDampingIsReadWithTheValueOfNone) {
  for (const auto& [inFile, kind, value] : {std::tuple{-1.0, CCompControlParaModLMGKvf::kCooley, 1.0},
                                            {-2.0, CCompControlParaModLMGKvf::kRelativeReducedResidual, 1.0},
                                            {0.25, CCompControlParaModLMGKvf::kSpecified, 0.25}}) {
    TestSetup setup(Sections(3, 4, "CompControlParaModLMG", fmt::format("DAMP = {:.2f}", inFile)));
    auto& lmg = setup.At<CCompControlParaModLMGKvf>(kOfLMG);
    EXPECT_EQ(lmg.DampingKind, kind);
    EXPECT_EQ(lmg.DAMP, static_cast<float>(value));
    // A kind hides the value and keeps it.
    lmg.DAMP = 0.75F;
    lmg.DampingKind = CCompControlParaModLMGKvf::kCooley;
    EXPECT_EQ(setup.Written(kOfLMG + ":DAMP"), "-1f");
    lmg.DampingKind = CCompControlParaModLMGKvf::kSpecified;
    EXPECT_EQ(setup.Written(kOfLMG + ":DAMP"), "0.75f");
  }
}

TEST(ModflowSolvers, TheDefaultsOfTheStorageComeBack) {
  TestSetup setup;
  auto& lmg = setup.At<CCompControlParaModLMGKvf>(kOfLMG);
  lmg.TakeUseDefault(0);
  lmg.STOR1 = lmg.STOR2 = lmg.STOR3 = 9;
  lmg.TakeUseDefault(1);
  EXPECT_THAT(setup.WrittenKeys(kOfLMG), testing::HasSubstr("STOR1=3f STOR2=2.2f STOR3=5.4f ICG=1 UseDefault=1"));
}

TEST(ModflowSolvers, OnlyTheSolverInUseIsChecked) {
  struct Case {
    int solver;
    const char *section, *keys;
    std::vector<std::string> errors;
  };
  const Case cases[] = {
      {4,
       "CompControlParaModLMG",
       "MXITER = -1\nMXCYC = -1\nBCLOSE = 0.0\nDAMP = 0.0\nDUP = 0.0\nSTOR1 = 0.0\nSTOR2 = -1.0\nSTOR3 = 0.0",
       {"Maximum number of outer iterations must be a positive value",
        "Maximum number of cycles must be a positive value", "Budget closure criterion must be greater than 0",
        "Specified damping value must be greater than 0", "Storage for A and JA matrices must be greater than 0",
        "Storage for U, FRHS and IA matrices must be greater than 0", "Storage for IG matrix must be greater than 0"}},
      {4,
       "CompControlParaModLMG",
       "DAMP = -2.0\nDUP = 0.0\nDLOW = 0.0",
       {"Maximum damping value must be greater than 0", "Minimum damping value must be greater than 0"}},
      {4, "CompControlParaModLMG", "MXITER = 0\nDAMP = -1.0\nDUP = 0.0\nUseDefault = 0\nSTOR1 = 0.0", {}},
      {3,
       "CompControlParaModPCG2",
       "MXITER = -1\nITER1 = -1\nHCLOSE = 0.0\nRCLOSE = 0.0\nRELAX = 0.0",
       {"Maximum number of outer iterations must be a positive value",
        "Maximum number of inner iterations must be a positive value", "Head change must be greater than 0",
        "Residual criterion for convergence must be greater than 0", "Relaxation parameter must be greater than 0"}},
      {3, "CompControlParaModPCG2", "MXITER = 0\nITER1 = 0", {}},
      {2, "CompControlParaModPCG2", "MXITER = -1", {}},
      {1, "CompControlParaModSIP", "MXITER = -1\nHCLOSE = 0.0", {}}};
  for (const Case& c : cases) {
    // The engine does not matter.
    for (int engine = 1; engine <= 3; ++engine) {
      TestSetup setup(Sections(engine, c.solver, c.section, c.keys));
      setup.Root().Validate();
      std::vector<std::string> errors;
      for (const Finding& finding : setup.At<CYbSEKvfBase>(fmt::format("{}/{}", kSolver, c.section)).Findings())
        if (finding.severity == Severity::Error) errors.push_back(finding.text);
      EXPECT_EQ(errors, c.errors) << c.keys;
      EXPECT_EQ(setup.At<CYbSEKvfBase>(kSolver).Valid() != 0, c.errors.empty());
    }
  }
}

TEST(ModflowSolvers, ASolverThatTheEngineDoesNotHaveIsTold) {
  for (int engine = 1; engine <= 3; ++engine)
    for (int solver = 0; solver <= 5; ++solver) {
      TestSetup setup(Sections(engine, solver));
      auto& choice = setup.At<CCompControlParaModKvf>(kSolver);
      choice.Validate();
      const std::vector<int> offered = SolversOfEngine(engine);
      EXPECT_EQ(choice.Findings().size(), std::ranges::count(offered, solver) ? 0U : 1U) << engine << ' ' << solver;
      EXPECT_EQ(choice.SolverOption, solver);
    }
}

}  // namespace
}  // namespace tervane::modflow_solvers_test
