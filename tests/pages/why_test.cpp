// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/why.h"

#include <gmock/gmock.h>

#include "core/path.h"
#include "tests/support/page_driver.h"
#include "tests/support/setup.h"

namespace tervane::why_test {
namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::Field;

std::vector<std::string> Texts(const Explanation& why) {
  std::vector<std::string> texts;
  for (const Reason& reason : why.reasons) texts.push_back(reason.text);
  return texts;
}

struct OpenedSetup {
  explicit OpenedSetup(const char* sections) {
    EXPECT_TRUE(document.OpenText(test::SetupText(14, sections), "/data/a.tvd")) << document.Error();
  }
  CYbSEKvfBase& Node(const char* path) { return *FindNode(document.Root(), ParseSetupPath(path).steps); }
  CFlowModelDoc document;
};

TEST(Why, ANodeTakesPartIsToldInTheWordsOfThePages) {
  const struct {
    const char* sections;
    const char* path;
    bool takesPart;
    std::vector<std::string> reasons;
  } cases[] = {
      {"",
       "SimSpec/CompControlParaOL",
       true,
       {"Numeric Engine is Tervane", "Water Movement (WM) is on", "Overland Flow (OL) is on",
        "The method of Overland Flow (OL) is Finite Difference"}},
      {"section SimSpec {\nModelType = 2\n}", "SimSpec/CompControlParaOL", false, {"Numeric Engine must be Tervane"}},
      {"section SimSpec {\nsection ModelComp {\nOL = 0\n}\n}",
       "SimSpec/CompControlParaOL",
       false,
       {"Overland Flow (OL) must be on"}},
      {"", "Climate/NetRainfallFraction", false, {"Evapotranspiration (ET) must be off"}},
      // Of a node below one that takes no part only what is missing counts.
      {"", "Climate/SNOWMELTCONST/DegreeDayFactor", false, {"Include snow melt must be on"}},
      {"section SimSpec {\nsection CompControlParaSZ {\nSolverOption = 1\n}\n}",
       "SimSpec/CompControlParaSZ/CompControlParaSZPCGTrans",
       false,
       {"Preconditioned Conjugate Gradient, Transient must be chosen"}},
      {"",
       "Subcatchments",
       false,
       {"The method of Saturated Flow (SZ) must be Linear Reservoir",
        "or The method of Overland Flow (OL) must be Subcatchment based"}},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.path);
    OpenedSetup setup(c.sections);
    const Explanation why = WhyTakesPart(setup.document, setup.Node(c.path));
    EXPECT_EQ(why.holds, c.takesPart);
    EXPECT_EQ(Texts(why), c.reasons);
    for (const Reason& reason : why.reasons) EXPECT_NE(reason.serial, 0U) << reason.text << " leads to no page";
  }
}

TEST(Why, AControlIsGreyIsToldWithWhatWouldChangeIt) {
  OpenedSetup setup("section SimSpec {\nsection ModelComp {\nUZ = 0\n}\n}");
  test::PageDriver driver(setup.document, "SimSpec/CompControlParaTimeStep");
  const Control& control = driver.Find("Max allowed UZ time step");
  const Explanation why = WhyEnabled(setup.document, driver.Page().Form(), control);
  EXPECT_FALSE(why.holds);
  EXPECT_EQ(why.subject, "Max allowed UZ time step");
  ASSERT_EQ(Texts(why), std::vector<std::string>{"Unsaturated Flow (UZ) must be on"});
  EXPECT_EQ(why.reasons.front().path, "SimSpec/ModelComp");
  EXPECT_EQ(why.reasons.front().key, "UZ");
  EXPECT_EQ(why.reasons.front().serial, setup.Node("SimSpec").Serial()) << "the page that has the control";

  // Of the page's own values.
  test::PageDriver period(setup.document, "ModelCompWQ/SimulationPeriodWQ");
  EXPECT_EQ(Texts(WhyEnabled(setup.document, period.Page().Form(), period.Find("Cycle End Date:"))),
            std::vector<std::string>{"Recycling on flow results must be chosen"});
}

TEST(Why, WhatIsMissingTellsEachBranchOnce) {
  OpenedSetup setup("");
  const std::vector<MissingNode> missing = WhatIsMissing(setup.document);
  std::vector<std::string> paths;
  for (const MissingNode& node : missing) {
    paths.push_back(node.path);
    EXPECT_FALSE(node.why.reasons.empty()) << node.path;
  }
  EXPECT_THAT(paths, Contains("Climate/SNOWMELTCONST"));
  EXPECT_THAT(paths, testing::Not(Contains("Climate/SNOWMELTCONST/DegreeDayFactor")));
  EXPECT_THAT(paths, Contains("ModelCompWQ"));
}

}  // namespace
}  // namespace tervane::why_test
