// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/stress_periods.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "document/edit_session.h"
#include "simspec/basic_parameters.h"
#include "simspec/periods.h"
#include "tests/simspec/test_setup.h"

namespace tervane::stress_periods_test {
namespace {

using test::TestSetup;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

constexpr const char* kPeriodsPath = "SimSpec/STRESSPERIODS";

/// A setup with Modflow of January 2000 whose periods end at these dates.
std::string Sections(const std::vector<std::string>& ends, const std::string& simulation, int engine) {
  std::string items;
  for (std::size_t i = 0; i < ends.size(); ++i)
    items += fmt::format("section Item_{} {{\nDates = {}\n}}\n", i + 1, ends[i]);
  return fmt::format(
      "section SimSpec {{\nModelType = {}\nsection SimulationPeriod {{\nSIMSTART = 2000, 1, 1, 0, 0\nSIMEND = 2000, 2, "
      "1, "
      "0, 0\n{}\n}}\nsection STRESSPERIODS {{\nYbSEKvfListItemCount = {}\n{}}}\n}}",
      engine, simulation, ends.size(), items);
}

/// Whatever the periods are, their ends as texts.
std::vector<std::string> Ends(const CStressPeriodsKvf& periods) {
  std::vector<std::string> ends;
  for (int number = 1; number <= periods.GetItemCount(); ++number) ends.push_back(periods.GetDateText(number));
  return ends;
}

struct Opened {
  explicit Opened(const std::vector<std::string>& ends, const std::string& keys = {},
                  int engine = kEngineModflowSurfact)
      : setup(Sections(ends, keys, engine)) {}
  TestSetup setup;
  CStressPeriodsKvf& periods = setup.At<CStressPeriodsKvf>(kPeriodsPath);
  CSimPeriodKvf& simulation = setup.At<CSimPeriodKvf>("SimSpec/SimulationPeriod");
};

TEST(StressPeriods, ANewListHasOnePeriodThatEndsWithTheSimulation) {
  TestSetup setup;
  EXPECT_EQ(setup.WrittenKeys(kPeriodsPath), "YbSEKvfListItemCount=1 MfSteadyState=0 StressPeriodRadio=0");
  EXPECT_EQ(setup.WrittenKeys("SimSpec/STRESSPERIODS/Item_1"),
            "Dates=2000, 2, 1, 0, 0 DELT=1.0 TMIN=0.0 TMAX=1000.0 TSMULT=10.0 TSDIV=10.0 NSTP=1.0 SSTR=0.0");
  EXPECT_EQ(setup.At<CYbSEKvfBase>(kPeriodsPath).GetTitle(), "Stress Periods");
}

TEST(StressPeriods, PartIsTakenWithAnyEngineButTheOwn) {
  for (int engine = 0; engine <= 4; ++engine)
    for (const int steady : {0, 1}) {
      TestSetup setup(fmt::format(
          "section SimSpec {{\nModelType = {}\nsection STRESSPERIODS {{\nMfSteadyState = {}\n}}\n}}", engine, steady));
      EXPECT_EQ(setup.IsUsed(kPeriodsPath), engine != 0);
      EXPECT_EQ(setup.IsUsed("SimSpec/STRESSPERIODS/STRESSPERIOD_PROPPAGE"), !steady);
    }
}

TEST(StressPeriods, DatesAreReadAsTheyStandAndClampedWhenTheyAreTyped) {
  // Nothing is checked yet where the periods take no part.
  Opened opened({"1999, 1, 1, 0, 0", "2010, 1, 1, 0, 0"}, {}, kEngineTervane);
  EXPECT_THAT(Ends(opened.periods), ElementsAre("1999-01-01 00:00", "2010-01-01 00:00"));
  auto& period = *opened.periods.GetItem(1);
  const std::pair<CYbDateTime, CYbDateTime> cases[] = {{{1999, 12, 31, 23, 59}, {2000, 1, 1}},
                                                       {{2000, 1, 1}, {2000, 1, 1}},
                                                       {{2000, 1, 15, 6, 7, 8}, {2000, 1, 15, 6, 7}},
                                                       {{2000, 2, 1, 0, 1}, {2000, 2, 1}}};
  for (const auto& [typed, stored] : cases) {
    period.SetEndDate(typed);
    EXPECT_EQ(period.EndDate(), stored) << typed.Format("%Y-%m-%d %H:%M:%S");
  }
}

TEST(StressPeriods, ThePeriodsBeginWithTheEffectiveStart) {
  Opened opened({"2000, 1, 20, 0, 0"},
                "HotStart = 1\nHotStartDate = 2000, 1, 10, 0, 0\nSimStartFromHotStartDate = 1\n");
  EXPECT_EQ(opened.periods.GetDateText(0), "2000-01-10 00:00");
  opened.periods.GetItem(1)->SetEndDate({2000, 1, 5});
  EXPECT_THAT(Ends(opened.periods), ElementsAre("2000-01-10 00:00"));
  EXPECT_EQ(opened.periods.GetDateText(2), "ERROR");
  EXPECT_EQ(opened.periods.GetDateText(-1), "ERROR");
}

constexpr const char* kFirst = "The End Date of the first Stress Period date must be after Simulation Start Date.";
constexpr const char* kIncreasing = "All Stress Period Dates must be increasing.";
constexpr const char* kBeforeEnd = "All Dates must be before Simulation End Date.";

TEST(StressPeriods, EachCheckMendsTheLastPeriod) {
  struct Case {
    std::vector<std::string> ends;
    const char *error, *nextError, *detail;
  };
  const Case cases[] = {
      {{"2000, 2, 1, 0, 0"}, "", "", ""},
      {{"2000, 1, 10, 0, 0", "2000, 2, 1, 0, 0"}, "", "", ""},
      // The last one follows the end of the simulation, wherever it stood.
      {{"2000, 1, 10, 0, 0", "2000, 1, 20, 0, 0"}, "", "", ""},
      {{"2000, 3, 1, 0, 0"}, "", "", ""},
      {{"2000, 1, 10, 0, 0", "2000, 3, 1, 0, 0"}, kBeforeEnd, "", "moved to 2000-02-01 00:00"},
      {{"2000, 1, 1, 0, 0"}, kFirst, "", "moved to 2000-02-01 00:00"},
      {{"2000, 1, 1, 0, 0", "2000, 2, 1, 0, 0"}, kFirst, kFirst, "period 1 ends at 2000-01-01 00:00"},
      {{"2000, 1, 9, 0, 0", "2000, 1, 9, 0, 0", "2000, 2, 1, 0, 0"}, kIncreasing, kIncreasing, "period 2 ends at"},
      {{"2000, 1, 9, 0, 0", "2000, 1, 8, 0, 0", "2000, 2, 1, 0, 0"}, kIncreasing, kIncreasing, "2000-01-08 00:00"},
      {{"2000, 3, 1, 0, 0", "2000, 2, 1, 0, 0"}, kIncreasing, kIncreasing, "period 2 ends at"},
      {{"2000, 1, 9, 0, 0", "2000, 3, 8, 0, 0", "2000, 4, 1, 0, 0"}, kBeforeEnd, kBeforeEnd, "period 2 ends at"},
      {{"2000, 1, 9, 0, 0", "0, 0, 0, 0, 0"}, kIncreasing, "", "moved to 2000-02-01 00:00"},
      {{"2000, 13, 9, 0, 0", "2000, 2, 1, 0, 0"}, kFirst, kFirst, "Invalid"},
      {{}, "", "", ""}};
  for (const Case& c : cases) {
    Opened opened(c.ends);
    // Opening checks once.
    for (const char* expected : {c.error, c.nextError}) {
      EXPECT_EQ(opened.periods.Valid() != 0, *expected == '\0') << testing::PrintToString(c.ends);
      const auto& findings = opened.periods.Findings();
      ASSERT_EQ(findings.size(), *expected ? 1U : 0U) << testing::PrintToString(c.ends);
      if (!findings.empty()) {
        EXPECT_EQ(findings[0].text, expected) << testing::PrintToString(c.ends);
      }
      if (expected == c.error && !findings.empty()) {
        EXPECT_THAT(findings[0].detail, HasSubstr(c.detail));
      }
      opened.periods.Validate();
    }
    if (c.ends.empty()) continue;
    EXPECT_EQ(Ends(opened.periods).back(), "2000-02-01 00:00");
  }
}

TEST(StressPeriods, NoLastPeriodFollowsASimulationWithoutAnEnd) {
  Opened opened({"2000, 1, 20, 0, 0"});
  opened.simulation.SIMEND = CYbDateTime(2000, 2, 30);
  opened.periods.Validate();
  EXPECT_THAT(Ends(opened.periods), ElementsAre("2000-02-01 00:00"));
}

TEST(StressPeriods, ValuesThatNoEngineCanStepByAreTold) {
  struct Case {
    const char *keys, *finding;
  };
  const Case cases[] = {{"NSTP = 3.0\nTSMULT = 1.0", ""},
                        {"NSTP = 3", ""},
                        {"NSTP = 0.0", "The value 0 is outside its range: 1 or more."},
                        {"NSTP = 2.5", "The number of time steps is 2.5, which is no whole number."},
                        {"TSMULT = 0.0", "The value 0 is outside its range: above 0."},
                        {"TSDIV = 1.0", "The value 1 is outside its range: above 1."}};
  for (const Case& c : cases) {
    TestSetup setup(fmt::format(
        "section SimSpec {{\nModelType = 2\nsection STRESSPERIODS {{\nsection Item_1 {{\n{}\n}}\n}}\n}}", c.keys));
    setup.Root().Validate();
    const auto& findings = setup.At<CYbSEKvfBase>("SimSpec/STRESSPERIODS/Item_1").Findings();
    ASSERT_EQ(findings.size(), *c.finding ? 1U : 0U) << c.keys;
    if (findings.empty()) continue;
    EXPECT_EQ(findings[0].text, c.finding);
  }
  // A fraction stays until somebody edits it.
  TestSetup setup("section SimSpec {\nsection STRESSPERIODS {\nsection Item_1 {\nNSTP = 2.5\n}\n}\n}");
  EXPECT_EQ(setup.Written("SimSpec/STRESSPERIODS/Item_1:NSTP"), "2.5");
}

TEST(StressPeriods, PeriodsOfOneLengthEndWithTheSimulationToTheMinute) {
  Opened opened({"2000, 1, 20, 0, 0"});
  opened.simulation.SIMEND = CYbDateTime(2000, 2, 10);
  opened.periods.Defaults.NSTP = 4;
  StressPeriodSteps steps;
  steps.DELT = 2;
  steps.TSMULT = 1;
  steps.NSTP = 9;
  opened.periods.MakeEqualPeriods(4, steps);
  EXPECT_THAT(Ends(opened.periods),
              ElementsAre("2000-01-11 00:00", "2000-01-21 00:00", "2000-01-31 00:00", "2000-02-10 00:00"));
  EXPECT_EQ(opened.periods.GetItem(3)->DELT, 2);
  EXPECT_EQ(opened.periods.GetItem(3)->TSMULT, 1);
  // These two are none of the values that are asked for.
  EXPECT_EQ(opened.periods.GetItem(3)->NSTP, 4);
  EXPECT_EQ(opened.periods.Defaults.DELT, 1);
  EXPECT_EQ(opened.periods.AddItem()->DELT, 1);

  opened.simulation.SIMEND = CYbDateTime(2000, 1, 1, 1, 40);
  opened.periods.MakeEqualPeriods(7, {});
  EXPECT_EQ(Ends(opened.periods).back(), "2000-01-01 01:40");
  EXPECT_EQ(opened.periods.Validate(), 1);
  opened.periods.MakeEqualPeriods(1, {});
  EXPECT_THAT(Ends(opened.periods), ElementsAre("2000-01-01 01:40"));
}

TEST(StressPeriods, TheNumberAndTheOrderOfPeriodsConcernOthers) {
  Opened opened({"2000, 1, 10, 0, 0", "2000, 1, 20, 0, 0"});
  const std::function<void()> changes[] = {[&] { opened.periods.AddItem(); }, [&] { opened.periods.InsertItem(1, 1); },
                                           [&] { opened.periods.DeleteItem(1, 1); },
                                           [&] { opened.periods.MoveItemUp(2, 1); },
                                           [&] { opened.periods.MoveItemDown(1, 1); }};
  opened.setup.Root().TakeRevalidateAll();
  for (const auto& change : changes) {
    change();
    EXPECT_TRUE(opened.setup.Root().TakeRevalidateAll());
  }
}

TEST(StressPeriods, AMovedEndOfTheSimulationIsOneStepWithTheLastPeriod) {
  const auto session = EditSession::New({});
  auto& root = session->Document().Root();
  auto& simulation = *root.Important(kSimulationPeriod);
  auto& periods = *root.Important(kStressPeriods);
  root.Important(kBasicParameters)->ModelType = kEngineModflowSurfact;
  session->UpdateDoc(*root.Important(kBasicParameters), 8, "Change Numeric Engine");
  periods.MakeEqualPeriods(2, {});
  session->UpdateDoc(periods, 1, "Make Stress Periods");
  const std::vector<std::string> before = Ends(periods);

  simulation.SIMEND = CYbDateTime(2000, 1, 20);
  simulation.SetRevalidateAll();
  session->UpdateDoc(simulation, 1, "Change End Date");
  EXPECT_THAT(Ends(periods), ElementsAre(before[0], "2000-01-20 00:00"));
  ASSERT_EQ(periods.Findings().size(), 1U);
  EXPECT_EQ(periods.Findings()[0].text, kBeforeEnd);

  session->Undo();
  EXPECT_EQ(Ends(periods), before);
  EXPECT_EQ(session->Steps().UndoName(), "Make Stress Periods");
  session->Redo();
  EXPECT_THAT(Ends(periods), ElementsAre(before[0], "2000-01-20 00:00"));
  EXPECT_FALSE(session->Steps().CanRedo());
}

}  // namespace
}  // namespace tervane::stress_periods_test
