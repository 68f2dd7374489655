// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/simspec/components_pages.h"

#include <gmock/gmock.h>

#include "tests/support/page_driver.h"
#include "tests/support/setup.h"

namespace tervane::components_pages_test {
namespace {

using test::PageDriver;
using test::SetupText;
using test::ValueOf;
using testing::HasSubstr;
using testing::Not;

TEST(ComponentsPages, TheFormBelowTheEngineFollowsIt) {
  CFlowModelDoc document;
  PageDriver page(document, "SimSpec");
  EXPECT_THAT(page.Text(), HasSubstr("Saturated Flow (SZ)"));
  const struct {
    const char *engine, *shown, *list;
  } cases[] = {{"1", "Recharge", "[Block Centered Flow (BCF) | Variably Saturated Flow]"},
               {"2", "Recharge", "[Block Centered Flow (BCF)]"},
               {"3", "Recharge", "[Block Centered Flow (BCF) | Layer Property Flow (LPF)]"},
               {"0", "Saturated Flow (SZ)", "[Finite Difference | Linear Reservoir]"}};
  for (const auto& c : cases) {
    ASSERT_EQ(page.Enter("Numeric Engine", c.engine), "");
    EXPECT_THAT(page.Text(), HasSubstr(c.shown));
    EXPECT_THAT(page.Text(), HasSubstr(c.list));
  }
  // An engine that the list does not have keeps the form that was shown.
  page.Enter("Numeric Engine", "2");
  page.Enter("Numeric Engine", "9");
  EXPECT_THAT(page.Text(), HasSubstr("[Block Centered Flow (BCF)]"));
}

TEST(ComponentsPages, ChoosingVariablySaturatedFlowKeepsBothOptions) {
  CFlowModelDoc document;
  ASSERT_TRUE(document.OpenText(SetupText(14, "section SimSpec {\nModelType = 1\n}"), "a.tvd"));
  PageDriver page(document, "SimSpec");
  const std::string type = "SimSpec/ModModelComp:Subsurface_ModelType";
  const auto isShown = [&](const char* text) { return page.Text().find(text) != std::string::npos; };
  EXPECT_TRUE(isShown("check \"With air flow\" off hidden"));
  page.Enter("Subsurface_ModelType", "1");
  EXPECT_EQ(ValueOf(document, type), "2");
  EXPECT_TRUE(isShown("check \"With air flow\" off\n"));
  EXPECT_TRUE(isShown("check \"With cell rewetting\" on disabled"));
  page.Enter("With air flow", "1");
  EXPECT_EQ(ValueOf(document, type), "3");
  page.Enter("Subsurface_ModelType", "0");
  EXPECT_EQ(ValueOf(document, type), "1");
  page.Enter("Subsurface_ModelType", "1");
  EXPECT_EQ(ValueOf(document, type), "3");
}

TEST(ComponentsPages, AChangeOfAComponentRenewsTheFindings) {
  CFlowModelDoc document;
  ASSERT_TRUE(document.OpenText(
      SetupText(14, "section SimSpec {\nsection ModelComp {\nWQ = 1\n}\n}\nsection ModelCompWQ {\nUZ = 1\n}"),
      "a.tvd"));
  const CYbSEKvfBase* waterQuality = document.Root().GetImportantNode("MODEL_COMP_WQ");
  EXPECT_FALSE(waterQuality->Findings().empty());
  PageDriver page(document, "SimSpec");
  page.Enter("UZ_ModelType", "1");
  EXPECT_TRUE(waterQuality->Findings().empty());
  page.Enter("UZ_ModelType", "2");
  EXPECT_FALSE(waterQuality->Findings().empty());
}

TEST(ComponentsPages, WithoutWaterMovementTheComponentsAreDisabledAndKeepTheirValues) {
  CFlowModelDoc document;
  ASSERT_TRUE(document.OpenText(SetupText(14, "section SimSpec {\nsection ModelComp {\nWM = 0\n}\n}"), "a.tvd"));
  PageDriver page(document, "SimSpec");
  for (const char* label : {"Overland Flow (OL)", "Rivers and Lakes (OC)", "Unsaturated Flow (UZ)",
                            "Saturated Flow (SZ)", "Evapotranspiration (ET)"})
    EXPECT_FALSE(page.IsEnabled(label)) << label;
  EXPECT_THAT(page.Text(), HasSubstr("check \"Overland Flow (OL)\" on disabled"));
}

}  // namespace
}  // namespace tervane::components_pages_test
