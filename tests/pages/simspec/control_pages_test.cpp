// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/simspec/control_pages.h"

#include <gmock/gmock.h>

#include "tests/support/page_driver.h"
#include "tests/support/setup.h"

namespace tervane::control_pages_test {
namespace {

using test::PageDriver;
using test::SetupText;
using testing::HasSubstr;
using testing::Not;

TEST(ControlPages, WhatTheSolverDoesNotUseIsDisabled) {
  CFlowModelDoc document;
  PageDriver page(document, "SimSpec/CompControlParaOL");
  const char* ofSor[] = {"Maximum number of iterations:", "Maximum head change per iteration:",
                         "Maximum residual error:", "Under-relaxation factor: [0.01 - 1.0]"};
  const char* ofExplicit[] = {"Maximum courant number: [0.1 - 0.9]",
                              "Sub-divide overland flow cells for multi-cell OL method"};
  for (const bool isExplicit : {false, true}) {
    page.Enter("SolverOption", isExplicit ? "1" : "0");
    for (const char* label : ofSor) EXPECT_EQ(page.IsEnabled(label), !isExplicit) << label;
    for (const char* label : ofExplicit) EXPECT_EQ(page.IsEnabled(label), isExplicit) << label;
  }
  EXPECT_FALSE(page.IsEnabled("Coarse cell sub-division factor:"));
  page.Enter("Sub-divide overland flow cells for multi-cell OL method", "1");
  EXPECT_TRUE(page.IsEnabled("Coarse cell sub-division factor:"));
}

TEST(ControlPages, TheRiverExchangeStandsWhereTheSolverPutsIt) {
  const struct {
    const char *river, *solver;
    bool shown;
  } cases[] = {{"0", "0", false}, {"1", "0", true}, {"1", "1", false}, {"1", "2", true}, {"0", "2", false}};
  for (const auto& c : cases) {
    SCOPED_TRACE(std::string("river ") + c.river + " solver " + c.solver);
    CFlowModelDoc document;
    ASSERT_TRUE(
        document.OpenText(SetupText(14, std::string("section SimSpec {\nsection ModelComp {\nRiver = ") + c.river +
                                            "\n}\nsection CompControlParaSZ {\nSolverOption = " + c.solver + "\n}\n}"),
                          "a.tvd"));
    PageDriver page(document, "SimSpec/CompControlParaSZ");
    const auto shows = HasSubstr("Max. fraction of H-point volume");
    if (c.shown)
      EXPECT_THAT(page.Text(), shows);
    else
      EXPECT_THAT(page.Text(), Not(shows));
  }
}

TEST(ControlPages, TheWaterQualityTimeStepShowsItsOrderOfMagnitude) {
  CFlowModelDoc document;
  PageDriver page(document, "ModelCompWQ/WQTSC");
  EXPECT_EQ(page.Find("Max. Simulation time step:").Text(), "1.0e+09");
}

TEST(ControlPages, OnlyRichardsEquationHasIterations) {
  CFlowModelDoc document;
  for (const char* type : {"0", "1", "2"}) {
    PageDriver(document, "SimSpec").Enter("UZ_ModelType", type);
    PageDriver page(document, "SimSpec/CompControlParaUZ");
    EXPECT_EQ(page.IsEnabled("Maximum no. of iterations"), *type == '0');
    EXPECT_TRUE(page.IsEnabled("Max. profile water balance error"));
  }
}

}  // namespace
}  // namespace tervane::control_pages_test
