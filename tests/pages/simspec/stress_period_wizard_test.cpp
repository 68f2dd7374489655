// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/simspec/stress_period_wizard.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "simspec/periods.h"
#include "tests/support/page_driver.h"

namespace tervane::stress_period_wizard_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::SizeIs;

/// The wizard over a simulation of 40 days, in which a user types into the controls by their labels.
struct Wizard {
  using Typed = std::vector<std::pair<std::string, std::string>>;

  Wizard() { document.Root().Important(kSimulationPeriod)->SIMEND = {2000, 2, 10}; }

  /// What was refused, and at last why the dialog stayed.
  std::vector<std::string> Run(const Typed& typed, bool presses = true) {
    std::vector<std::string> told;
    PageContext context{document, host, {}};
    context.runDialog = [&](const std::string& title, CYbSEDlgBase& form, const std::function<std::string()>& accept) {
      EXPECT_EQ(title, "Make Stress Periods Wizard");
      shown = FormText(form.Form());
      for (const auto& [label, value] : typed)
        form.Form().ForEach([&](Control& control) {
          if (control.label != label) return;
          const std::string expected = form.Enter(control, value);
          if (!expected.empty()) told.push_back(expected);
        });
      shownAtEnd = FormText(form.Form());
      if (!presses) return false;
      const std::string stays = accept();
      if (!stays.empty()) told.push_back(stays);
      return stays.empty();
    };
    CStressPeriodsDefaultDlg(context, periods).Run();
    return told;
  }
  std::vector<std::string> Ends() const {
    std::vector<std::string> ends;
    for (int number = 1; number <= periods.GetItemCount(); ++number) ends.push_back(periods.GetDateText(number));
    return ends;
  }

  CFlowModelDoc document;
  test::ScriptedHost host;
  CStressPeriodsKvf& periods = *document.Root().Important(kStressPeriods);
  std::string shown, shownAtEnd;
};

TEST(StressPeriodWizard, MakesPeriodsOfOneLength) {
  Wizard wizard;
  EXPECT_THAT(wizard.Run({{"Number of Stress Periods:", "4"}, {"First time step size", "2.5"}}), IsEmpty());
  EXPECT_THAT(wizard.shown, HasSubstr("shown \"Simulation Start:\" = 2000-01-01 00:00"));
  EXPECT_THAT(wizard.shown, HasSubstr("integer \"Number of Stress Periods:\" = 1"));
  EXPECT_THAT(wizard.Ends(),
              ElementsAre("2000-01-11 00:00", "2000-01-21 00:00", "2000-01-31 00:00", "2000-02-10 00:00"));
  EXPECT_EQ(wizard.periods.GetItem(4)->DELT, 2.5);
  // The defaults of new periods are as before.
  EXPECT_EQ(wizard.periods.Defaults.DELT, 1);
}

TEST(StressPeriodWizard, GivenUpItChangesNothing) {
  Wizard wizard;
  wizard.Run({{"Number of Stress Periods:", "4"}}, false);
  EXPECT_THAT(wizard.Ends(), SizeIs(1));
}

TEST(StressPeriodWizard, WhatCannotBeIsRefused) {
  struct Case {
    const char *label, *typed, *told;
  };
  const Case cases[] = {{"Reduction factor", "1", "Must be grater than 1"},
                        {"Reduction factor", "1.01", ""},
                        {"Time step multiplier", "0.99", "Must be grater than or equal to 1"},
                        {"Time step multiplier", "1", ""},
                        {"Number of Stress Periods:", "0", "There must be at least 1 stress period."},
                        {"Number of Stress Periods:", "-3", "There must be at least 1 stress period."},
                        {"Number of Stress Periods:", "1000001", "There can be at most 1000000 stress periods."}};
  for (const Case& c : cases) {
    Wizard wizard;
    const auto told = wizard.Run({{c.label, c.typed}});
    ASSERT_THAT(told, SizeIs(*c.told ? 1U : 0U)) << c.typed;
    if (!told.empty()) {
      EXPECT_EQ(told[0], c.told);
    }
    EXPECT_THAT(wizard.Ends(), SizeIs(1));
  }
  Wizard wizard;
  wizard.Run({{"Reduction factor", "0.5"}});
  EXPECT_THAT(wizard.shownAtEnd, HasSubstr("number \"Reduction factor\" = 10"));
  wizard.document.Root().Important(kSimulationPeriod)->SIMEND = {1999, 1, 1};
  EXPECT_THAT(wizard.Run({}), ElementsAre("The simulation needs a start and an end behind it first."));
}

TEST(StressPeriodWizard, MakesPeriodsOfMonthsAndYears) {
  Wizard wizard;
  auto& simulation = *wizard.document.Root().Important(kSimulationPeriod);
  simulation.SIMSTART = {1999, 11, 15};
  simulation.SIMEND = {2000, 2, 1};
  wizard.Run({{"Periods:", "1"}});
  EXPECT_THAT(wizard.shownAtEnd, HasSubstr("3 stress periods"));
  EXPECT_THAT(wizard.Ends(), ElementsAre("1999-12-01 00:00", "2000-01-01 00:00", "2000-02-01 00:00"));
  wizard.Run({{"Periods:", "2"}});
  EXPECT_THAT(wizard.Ends(), ElementsAre("2000-01-01 00:00", "2000-02-01 00:00"));
  simulation.SIMSTART = {2000, 1, 1};
  wizard.Run({{"Periods:", "2"}});
  EXPECT_THAT(wizard.Ends(), ElementsAre("2000-02-01 00:00"));
  EXPECT_THAT(wizard.Run({{"Periods:", "3"}}), ElementsAre(HasSubstr("There is no series")));
}

TEST(StressPeriodWizard, ASeriesChangesWhereItHasAnotherValue) {
  const double gap = std::nan("");
  Series series;
  for (int day = 1; day <= 8; ++day) series.times.push_back({2000, 1, day});
  series.values = {1, 1, 2, 2, gap, gap, 3, 3};
  EXPECT_THAT(ChangesOf(series, {2000, 1, 1}, {2000, 2, 1}),
              ElementsAre(CYbDateTime(2000, 1, 3), CYbDateTime(2000, 1, 5), CYbDateTime(2000, 1, 7)));
  // A value that holds over the interval before its time changes where that interval begins.
  series.isStepped = true;
  EXPECT_THAT(ChangesOf(series, {2000, 1, 2}, {2000, 1, 6}), ElementsAre(CYbDateTime(2000, 1, 4)));
}

}  // namespace
}  // namespace tervane::stress_period_wizard_test
