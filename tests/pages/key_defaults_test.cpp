// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/key_defaults.h"

#include <gmock/gmock.h>

#include "tests/support/page_driver.h"
#include "tests/support/setup.h"

namespace tervane::key_defaults_test {
namespace {

using test::PageDriver;

Control& OfKey(PageDriver& page, std::string_view key) {
  Control* found = nullptr;
  page.Page().Form().ForEach([&](Control& control) {
    if (!found && control.key == key && control.isOfKey) found = &control;
  });
  EXPECT_TRUE(found) << key;
  return *found;
}

TEST(KeyDefaults, GoBackToWhatTheDeclarationTells) {
  CFlowModelDoc document;
  const struct {
    const char *page, *control, *typed;
  } cases[] = {
      {"SimSpec", "ModelType", "2"},                          // a choice
      {"SimSpec/CompControlParaOL", "Multicell", "1"},        // a check
      {"SimSpec/CompControlParaOL", "MaxNoOfIter", "17"},     // a whole number
      {"SimSpec/CompControlParaOL", "MaxHeadChange", "0.5"},  // of single precision
      {"Catchment", "x0Shp", "12.5"},                         // of double precision, in the user's unit
      {"SimSpec/SimulationPeriod", "SIMEND", "2001/01/02 03:00"},
      {"Climate", "SM", "1"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.control);
    PageDriver page(document, c.page);
    KeyDefaults defaults;
    Control& control = OfKey(page, c.control);
    const std::string before = control.Text();
    defaults.Look();
    EXPECT_FALSE(defaults.Reset(control));
    EXPECT_EQ(control.enter(c.typed), "");
    defaults.Look();
    const std::optional<std::string> reset = defaults.Reset(control);
    ASSERT_TRUE(reset);
    EXPECT_EQ(control.enter(*reset), "");
    EXPECT_EQ(control.Text(), before);
    defaults.Look();
    EXPECT_FALSE(defaults.Reset(control));
  }
}

TEST(KeyDefaults, TheToolTipTellsDefaultRangeUnitAndKey) {
  CFlowModelDoc document;
  KeyDefaults defaults;
  PageDriver control(document, "SimSpec/CompControlParaOL");
  EXPECT_EQ(defaults.ToolTip(OfKey(control, "SolverOption")),
            "Default: Successive Overrelaxation (SOR)\nKey: SimSpec/CompControlParaOL:SolverOption");
  EXPECT_EQ(defaults.ToolTip(OfKey(control, "RelaxFactor")),
            "Default: 0.9\nRange: 0.01 to 1\nKey: SimSpec/CompControlParaOL:RelaxFactor");
  PageDriver title(document, "SimSpec/SimTitle");
  EXPECT_EQ(defaults.ToolTip(OfKey(title, "Title")), "Key: SimSpec/SimTitle:Title");
  EXPECT_FALSE(defaults.Reset(OfKey(title, "Title")));
}

}  // namespace
}  // namespace tervane::key_defaults_test
