// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "forms/page_form.h"

#include <gmock/gmock.h>

#include "tests/support/page_driver.h"
#include "tests/support/setup.h"

namespace tervane::page_form_test {
namespace {

using test::PageDriver;
using test::SetupText;
using test::ValueOf;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

TEST(PageForm, ATypedValueReachesTheNodeOrIsRefusedAndChangesNothing) {
  struct Case {
    const char *path, *label, *typed, *key, *value, *expected;
  };
  const Case cases[] = {
      {"SimSpec/SimTitle", "Simulation Title:", "Karup \"2\"", "SimSpec/SimTitle:Title", "Karup \"2\"", ""},
      {"SimSpec/CompControlParaOL", "Maximum number of iterations:", " 77 ", "SimSpec/CompControlParaOL:MaxNoOfIter",
       "77", ""},
      {"SimSpec/CompControlParaOL", "Maximum number of iterations:", "7.5", "SimSpec/CompControlParaOL:MaxNoOfIter",
       "200", "a whole number"},
      {"SimSpec/CompControlParaTimeStep", "Initial time step", "1e-2",
       "SimSpec/CompControlParaTimeStep:InitialTimeStep", "0.01", ""},
      {"SimSpec/CompControlParaTimeStep", "Initial time step", "0,5", "SimSpec/CompControlParaTimeStep:InitialTimeStep",
       "6", "use a point"},
      {"SimSpec/CompControlParaTimeStep", "Initial time step", "1e39",
       "SimSpec/CompControlParaTimeStep:InitialTimeStep", "6", "a number"},
      {"SimSpec/SimulationPeriod", "End Date:", "2001-12-31", "SimSpec/SimulationPeriod:SIMEND", "2001, 12, 31, 0, 0",
       ""},
      {"SimSpec/SimulationPeriod", "End Date:", "2001/02/28  06:30", "SimSpec/SimulationPeriod:SIMEND",
       "2001, 2, 28, 6, 30", ""},
      {"SimSpec/SimulationPeriod", "End Date:", "2001/02/29", "SimSpec/SimulationPeriod:SIMEND", "2000, 2, 1, 0, 0",
       "a date as"},
      {"SimSpec", "Numeric Engine", "3", "SimSpec:ModelType", "3", ""},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(std::string(c.label) + " " + c.typed);
    CFlowModelDoc document;
    PageDriver page(document, c.path);
    EXPECT_THAT(page.Enter(c.label, c.typed), HasSubstr(c.expected));
    EXPECT_EQ(ValueOf(document, c.key), c.value);
    EXPECT_EQ(page.Changes().empty(), *c.expected != '\0');
  }
}

TEST(PageForm, APickedFileIsStoredRelativeToTheSetup) {
  CFlowModelDoc document;
  ASSERT_TRUE(document.OpenText(
      SetupText(14, "section SimSpec {\nsection ModelComp {\nWQ = 1\nUseCurrentWmSimulation = 0\n}\n}"),
      "/data/karup/a.tvd"));
  PageDriver page(document, "SimSpec");
  const struct {
    const char *typed, *stored;
  } cases[] = {{"/data/karup/results/x.tvdres", "results/x.tvdres"},
               {"/data/other/x.tvdres", "/data/other/x.tvdres"},
               {"C:\\x.tvdres", "C:/x.tvdres"},
               {"results\\y.tvdres", "results\\y.tvdres"},
               {"", ""}};
  for (const auto& c : cases) {
    EXPECT_EQ(page.Enter("Flow result catalogue file:", c.typed), "");
    EXPECT_EQ(ValueOf(document, "SimSpec/ModelComp:FilenameTvdRes"), c.stored);
  }
}

TEST(PageForm, ChangesAreNamedAfterTheirControlAndGiveTheirHint) {
  CFlowModelDoc document;
  PageDriver period(document, "SimSpec/SimulationPeriod");
  period.Enter("End Date:", "2001-01-01");
  period.Enter("End Date:", "2001/01/01  00:00");  // what stands there already
  EXPECT_THAT(period.Changes(), ElementsAre("1 Change End Date"));
  EXPECT_TRUE(document.Root().TakeRevalidateAll());
  PageDriver engine(document, "SimSpec");
  engine.Enter("Numeric Engine", "1");
  EXPECT_THAT(engine.Changes(), ElementsAre("8 Change Numeric Engine"));
}

TEST(PageForm, ADisabledControlRefusesWhatIsTyped) {
  CFlowModelDoc document;
  PageDriver page(document, "SimSpec/CompControlParaOL");
  EXPECT_THAT(page.Enter("Maximum courant number: [0.1 - 0.9]", "0.5"), testing::Not(IsEmpty()));
  EXPECT_EQ(ValueOf(document, "SimSpec/CompControlParaOL:MaxCourant_Explicit"), "0.8");
}

TEST(PageForm, AValueOutsideItsListIsShownAsItIs) {
  CFlowModelDoc document;
  ASSERT_TRUE(document.OpenText(SetupText(14, "section SimSpec {\nModelType = 7\n}"), "a.tvd"));
  PageDriver page(document, "SimSpec");
  EXPECT_THAT(page.Text(), HasSubstr("choice \"Numeric Engine\" = 7 (not in the list) of [Tervane | "));
}

TEST(PageForm, ANumberInAFixedUnitTakesUnitsThatConvertToIt) {
  struct Case {
    const char *page, *label, *typed, *shown, *expected;
  };
  const char *step = "SimSpec/CompControlParaTimeStep", *overland = "SimSpec/CompControlParaOL",
             *colloid = "ModelCompWQ/ColloidControlPara";
  const Case cases[] = {
      {step, "Initial time step", "1 day", "24", ""},
      {step, "Initial time step", "90min", "1.5", ""},
      {step, "Initial time step", "12 hours", "12", ""},
      {step, "Initial time step", "5 km", "6", "a number in hours or in a unit that converts to it was expected"},
      {step, "Initial time step", "5 parsnips", "6", "a number in hours or"},
      {step, "Initial time step", "nan", "6", "a number was expected"},
      {step, "Initial time step", "1e30 years", "8.76e33", ""},
      {step, "Initial time step", "1e36 years", "6", "at most 3e+38"},
      {step, "Input precipitation rate requiring its own time step", "24 mm/day", "1", ""},
      {overland, "Maximum head change per iteration:", "5 mm", "0.005", ""},
      {overland, "Maximum residual error:", "2 mm/d", "0.002", ""},
      {overland, "Maximum residual error:", "3 [m/d]", "3", ""},
      {overland, "Under-relaxation factor: [0.01 - 1.0]", "0.5 m", "", "a number with a point"},
      {colloid, "Precipitation threshold rate:", "1 mm/s", "3600", ""},
      {colloid, "Water Depth Correction:", "2 1/m", "0.002", ""},
      {colloid, "Fraction of detached particles that are transported:", "1 m", "", "without a unit"},
      {colloid, "Conversion factor:", "1 m", "", "a number in g metabolite/ g pesticide was expected"},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(std::string(c.label) + " " + c.typed);
    CFlowModelDoc document;
    PageDriver page(document, c.page);
    const std::string before = page.Find(c.label).Text();
    EXPECT_THAT(page.Enter(c.label, c.typed), HasSubstr(c.expected));
    EXPECT_EQ(page.Find(c.label).Text(), *c.shown ? c.shown : before);
    EXPECT_EQ(page.Changes().empty(), *c.expected != '\0');
  }
}

TEST(PageForm, AQuantityIsShownAndTypedInTheUsersUnit) {
  constexpr int kThickness = 100367, kFoot = 1003, kMillimeter = 1002;
  CTvnKvfBase node("", "", nullptr);
  DisplayUnits units;
  float small = 0.005f;
  double value = 0.3 * 0.3048;
  PageForm form(node);
  PageForm& group = form.Group("");
  Control& control = group.Number("Thickness", value).Quantity(kThickness);
  Control& rough = group.Number("Thickness", small, "%.1e").Quantity(kThickness);
  form.SetDisplayUnits(&units);
  EXPECT_EQ(control.UnitText(), "m");
  // The choice is asked each time, also in a group.
  ASSERT_TRUE(units.Choose(kThickness, kFoot));
  EXPECT_EQ(control.UnitText(), "ft");
  EXPECT_EQ(control.Text(), "0.3");
  EXPECT_EQ(control.enter("2"), "");
  EXPECT_EQ(value, 0.6096);
  EXPECT_EQ(control.enter("5 km"), "");
  EXPECT_EQ(value, 5000);
  EXPECT_THAT(control.enter("5 kg"), HasSubstr("is no unit of"));
  EXPECT_EQ(value, 5000);
  ASSERT_TRUE(units.Choose(kThickness, kMillimeter));
  EXPECT_EQ(rough.Text(), "5.0e+00");
  EXPECT_THAT(FormText(form), HasSubstr("number \"Thickness\" = 5000000 mm\n"));
  const std::vector<UnitChoice> choices = control.UnitChoices();
  ASSERT_GT(choices.size(), 1u);
  EXPECT_EQ(choices.front().text, "meter");
  EXPECT_THAT(form.Number("", value).Unit("[m]").UnitChoices(), IsEmpty());
}

}  // namespace
}  // namespace tervane::page_form_test
