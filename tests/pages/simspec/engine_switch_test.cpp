// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/simspec/engine_switch.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "tests/support/page_driver.h"
#include "tests/support/setup.h"

namespace tervane::engine_switch_test {
namespace {

using test::PageDriver;
using test::SetupText;
using testing::IsEmpty;
using testing::UnorderedElementsAre;

/// A setup with an engine and further keys of the section `SimSpec`.
std::string Sections(int engine, const std::string& keys) {
  return SetupText(14, fmt::format("section SimSpec {{\nModelType = {}\n{}\n}}", engine, keys));
}

TEST(EngineSwitch, ValuesThatTheOtherEngineDoesNotKnowAreTold) {
  struct Case {
    int from, to;
    const char* keys;
    std::vector<std::string> told;
  };
  const Case cases[] = {
      {1, 2, "", {}},
      {0, 1, "", {}},
      {1, 0, "", {}},
      {1,
       2,
       "section CompControlParaModSZ {\nSolverOption = 2\n}",
       {"the solver Preconditioned Conjugate Gradient with Newton-Raphson (PCG4)"}},
      {3, 1, "section CompControlParaModSZ {\nSolverOption = 4\n}", {"the solver Link Multi-Grid (LMG)"}},
      {1, 3, "section CompControlParaModSZ {\nSolverOption = 3\n}", {}},
      {1,
       3,
       "section ModModelComp {\nSubsurface_ModelType = 2\nRecharge = 1\nRecharge_ModelType = 1\n}",
       {"recharge as Recharge-Seepage Face", "Variably Saturated Flow"}},
      {1, 0, "section STRESSPERIODS {\nStressPeriodRadio = 1\n}", {"Stress Periods"}},
      {1, 2, "section STRESSPERIODS {\nStressPeriodRadio = 1\n}", {}},
      {0, 2, "section CompControlParaOL {\nMaxNoOfIter = 7\n}", {"OL Computational Control Parameters"}},
      {0, 2, "section ModelComp {\nRiver = 1\n}", {"the components of Tervane"}}};
  for (const Case& c : cases) {
    CFlowModelDoc document;
    ASSERT_TRUE(document.OpenText(Sections(c.from, c.keys), "a.tvd"));
    auto& basics = *document.Root().Important(kBasicParameters);
    EXPECT_THAT(UnknownToEngine(basics, c.to), testing::UnorderedElementsAreArray(c.told)) << c.from << c.keys;
    EXPECT_EQ(basics.ModelType, c.from);
  }
}

TEST(EngineSwitch, TheUserIsAskedFirst) {
  CFlowModelDoc document;
  ASSERT_TRUE(document.OpenText(Sections(1, "section CompControlParaModSZ {\nSolverOption = 2\n}"), "a.tvd"));
  PageDriver page(document, "SimSpec");
  page.Outside().Expect("MODFLOW 96 does not know:", Host::Answer::No);
  EXPECT_EQ(page.Enter("Numeric Engine", "2"), "the engine stays MODFLOW Surfact");
  EXPECT_EQ(test::ValueOf(document, "SimSpec:ModelType"), "1");
  EXPECT_THAT(page.Changes(), IsEmpty());
  page.Outside().Expect("PCG4", Host::Answer::Yes);
  EXPECT_EQ(page.Enter("Numeric Engine", "2"), "");
  EXPECT_EQ(test::ValueOf(document, "SimSpec:ModelType"), "2");
  // What nothing is lost of is not asked.
  EXPECT_EQ(page.Enter("Numeric Engine", "1"), "");
  EXPECT_TRUE(page.Outside().IsDone());
}

}  // namespace
}  // namespace tervane::engine_switch_test
