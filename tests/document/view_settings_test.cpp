// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/view_settings.h"

#include <fmt/format.h>
#include <gtest/gtest.h>

#include "tests/support/setup.h"

namespace tervane::view_settings_test {
namespace {

using test::SetupText;
using test::ValueOf;

TEST(ViewSettings, AnAreaIsReadOnlyWhenItsFlagSaysThatItIsDefined) {
  const struct {
    const char* flag;
    DataArea area;
  } cases[] = {{"DefaultZoomDataAreaUndefined = 0", {1, 2, 3, 4}},
               {"DefaultZoomDataAreaUndefined = 1", {9, 9, 9, 9}},
               {"", {9, 9, 9, 9}}};
  for (const auto& c : cases) {
    SCOPED_TRACE(c.flag);
    CFlowModelDoc document;
    document.Global().SetDefaultDataArea({9, 9, 9, 9});
    ASSERT_TRUE(
        document.OpenText(SetupText(14, fmt::format("section ViewSettings {{\n{}\nDefaultZoomDataArea_X0 = 1.0\n"
                                                    "DefaultZoomDataArea_Y0 = 2.0\nDefaultZoomDataArea_X1 = 3.0\n"
                                                    "DefaultZoomDataArea_Y1 = 4.0\n}}",
                                                    c.flag)),
                          "a.tvd"));
    EXPECT_EQ(document.Global().GetDefaultDataArea(), c.area);
    EXPECT_TRUE(document.Report().IsEmpty());
  }
}

TEST(ViewSettings, AnUndefinedAreaIsWrittenWithoutTheSignsOfItsZeros) {
  CFlowModelDoc document;
  document.Global().SetDefaultDataArea({0, -0.0, 0, -0.0});
  EXPECT_EQ(ValueOf(document, "ViewSettings:DefaultZoomDataAreaUndefined"), "1");
  EXPECT_EQ(ValueOf(document, "ViewSettings:DefaultZoomDataArea_Y0"), "0");
  EXPECT_EQ(ValueOf(document, "ViewSettings:DefaultZoomDataArea_Y1"), "0");
}

TEST(ViewSettings, WritesTheAreasOfTheRoot) {
  CFlowModelDoc document;
  EXPECT_EQ(document.Global().SetMaxDataArea({0, 0, 100, 50}), 1);
  EXPECT_EQ(document.Global().SetMaxDataArea({0, 0, 100, 50}), 0);
  EXPECT_EQ(ValueOf(document, "ViewSettings:MaxZoomDataAreaUndefined"), "0");
  EXPECT_EQ(ValueOf(document, "ViewSettings:MaxZoomDataArea_X1"), "100");
  // A domain without a file has 50 cells of 1000 m each way.
  EXPECT_EQ(ValueOf(document, "ViewSettings:DefaultZoomDataAreaUndefined"), "0");
  EXPECT_EQ(ValueOf(document, "ViewSettings:DefaultZoomDataArea_X1"), "50000");
}

}  // namespace
}  // namespace tervane::view_settings_test
