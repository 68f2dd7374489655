// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/periods.h"

#include <fmt/format.h>
#include <fmt/ranges.h>
#include <gmock/gmock.h>

#include "platform/text.h"
#include "simspec/model_components.h"
#include "tests/simspec/test_setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::periods_test {
namespace {

using test::TestSetup;
using testing::IsEmpty;
using testing::SizeIs;

constexpr const char* kPeriod = "SimSpec/SimulationPeriod";

std::string SimPeriod(const std::string& keys) {
  return "section SimSpec {\nsection SimulationPeriod {\n" + keys + "\n}\n}\n";
}

TEST(Periods, TheLaterPeriodsStartAsThatOfANewSetupWhateverTheFileSays) {
  const TestSetup read(SimPeriod("SIMSTART = 1990, 1, 1, 0, 0"));
  EXPECT_EQ(read.Written("ModelCompWQ/SimulationPeriodWQ:SimStart"), "2000, 1, 1, 0, 0");
  EXPECT_EQ(read.Written("ModelCompPT/SimulationPeriodPT:FlowFieldSolutionDate"), "2000, 2, 1, 0, 0");
}

TEST(Periods, TheEngineGetsTheEffectiveStartAndTheHeldOneSurvives) {
  struct Case {
    int hotStart, startsFromIt;
    const char *date, *writtenDate, *writtenStart;
  };
  const char *held = "1990, 5, 6, 7, 8", *hot = "1995, 2, 3, 4, 5", *none = "0, 0, 0, 0, 0";
  const Case cases[] = {{1, 1, hot, hot, hot},
                        {1, 0, hot, hot, held},
                        {0, 1, hot, hot, held},
                        {1, 1, "1995, 2, 30, 4, 5", none, held},
                        {1, 1, none, none, held}};
  for (const Case& c : cases) {
    TestSetup setup(
        SimPeriod(fmt::format("HotStart = {}\nHotStartDate = {}\nSimStartFromHotStartDate = {}\nSIMSTART = {}",
                              c.hotStart, c.date, c.startsFromIt, held)));
    EXPECT_EQ(setup.Written("SimSpec/SimulationPeriod:HotStartDate"), c.writtenDate);
    EXPECT_EQ(setup.Written("SimSpec/SimulationPeriod:SIMSTART"), c.writtenStart);
    setup.At<CSimPeriodKvf>(kPeriod).HotStart = 0;
    EXPECT_EQ(setup.Written("SimSpec/SimulationPeriod:SIMSTART"), held);
  }
  // The date of the hot start is held as text.
  TestSetup setup(SimPeriod("HotStartDate = 1995, 2, 3, 4, 5"));
  auto& period = setup.At<CSimPeriodKvf>(kPeriod);
  EXPECT_EQ(period.HotStartDate, "1995/02/03 04:05");
  // As an entry of the list, an empty text and one that is no date.
  for (const auto& [text, written] : {std::pair{"2001/02/03 04:05:06", "2001, 2, 3, 4, 5"},
                                      {"", "0, 0, 0, 0, 0"},
                                      {"Invalid DateTime.", "0, 0, 0, 0, 0"},
                                      {"2001/02", "0, 0, 0, 0, 0"}}) {
    period.HotStartDate = text;
    EXPECT_EQ(setup.Written("SimSpec/SimulationPeriod:HotStartDate"), written) << text;
  }
}

TEST(Periods, HotStartDatesLieOneStoringIntervalApartBehindTheStart) {
  const test::TempFolder folder;
  struct Case {
    const char *part, *other;  ///< Of the catalogue, and what stands in its place.
    int result;
    const char* dates;
  };
  const std::string catalogue =
      "target TVDRES {\nsection general {\nsection version {\nVersionNumber = 1002\n}\n}\n"
      "section OutputPeriodAndMaxTimestep {\nHotStartData = 1\nStartDate = 2000, 1, 1, 0, 0\n"
      "EndDate = 2000, 1, 2, 0, 0\nHotstartStoringTimestep_Hrs = 6.0\n}\n}\n";
  const char* quarters = "2000/01/01 06:00:00, 2000/01/01 12:00:00, 2000/01/01 18:00:00, 2000/01/02 00:00:00";
  const Case cases[] = {{"", "", 1, quarters},
                        {"1002", "1001", 0, ""},
                        {"HotStartData = 1", "HotStartData = 0", 0, ""},
                        {"HotStartData = 1", "HotStartData = 2", 0, ""},
                        {"HotStartData = 1", "", 0, ""},
                        {"6.0", "0.0", 1, ""},
                        {"6.0", "-6.0", 1, ""},
                        {"6.0", "0.0001", 1, ""},  // Less than half a second.
                        {"6.0", "", 1, ""},
                        {"6.0", "6", 1, quarters},
                        {"6.0", "10.0003", 1, "2000/01/01 10:00:01, 2000/01/01 20:00:02"},
                        {"6.0", "24.0", 1, "2000/01/02 00:00:00"},
                        {"6.0", "24.1", 1, ""},
                        {"6.0", "1e300", 1, ""},
                        {"EndDate = 2000, 1, 2, 0, 0", "", 1, ""},
                        {"StartDate = 2000, 1, 1, 0, 0", "", 1, ""},
                        {"2000, 1, 1, 0, 0\nEndDate = 2000, 1, 2, 0, 0",
                         "9999, 12, 31, 12, 0\nEndDate = 9999, 12, 31, 23, 59", 1, "9999/12/31 18:00:00"},
                        {"target TVDRES", "target {", 0, ""},
                        {"target TVDRES", "target OTHER", 0, ""}};
  TestSetup setup;
  auto& period = setup.At<CSimPeriodKvf>(kPeriod);
  period.HotStart = 1;
  for (const Case& c : cases) {
    period.HotStartDates = {"stale"};
    const std::string text = *c.part ? Replaced(catalogue, c.part, c.other) : catalogue;
    EXPECT_EQ(period.LoadHotStartDates(folder.Write("x.tvdres", text)), c.result) << text;
    EXPECT_EQ(fmt::format("{}", fmt::join(period.HotStartDates, ", ")), c.dates) << text;
    EXPECT_EQ(kvfPeekErrorGlb(), kKvfNoError);
  }
  // Without a hot start, without a file.
  const std::string good = folder.Write("good.tvdres", catalogue);
  for (const std::string& path : {good, std::string(), folder.File("missing.tvdres")}) {
    period.HotStart = path != good;
    period.HotStartDates = {"stale"};
    EXPECT_EQ(period.LoadHotStartDates(path), 0) << path;
    EXPECT_THAT(period.HotStartDates, IsEmpty()) << path;
    EXPECT_EQ(kvfPeekErrorGlb(), kKvfNoError);
  }
}

TEST(Periods, DatesOnFlowResultsMustLieWithinTheSimulation) {
  using Period = CSimPeriodOnFlowBase;
  struct Rule {
    int recyclingType;
    CYbDateTime Period::*date;
    bool hasStart, hasEnd;
    std::string error;
  };
  const std::string between = " must be between Water Movement Simulation Start Date and Simulation End Date.";
  const Rule rules[] = {
      {0, &Period::SimStart, true, false,
       "Water Quality Start Date can't be before Water Movement Simulation Start Date."},
      {0, &Period::SimEnd, false, true, "Water Quality End Date can't be after Water Movement Simulation End Date."},
      {1, &Period::SimStart, true, true, "Water Quality Start Date" + between},
      {1, &Period::CycleRestartDate, true, true, "Water Quality Cycle Restart Date" + between},
      {1, &Period::CycleEndDate, true, true, "Water Quality Cycle End Date" + between},
      {2, &Period::FlowFieldSolutionDate, true, true, "Water Quality Flow Field Date" + between}};
  const CYbDateTime start(2000, 1, 1), end(2000, 2, 1), before(1999, 12, 31, 23, 59), after(2000, 2, 1, 0, 1), none;
  for (const char* path : {"ModelCompWQ/SimulationPeriodWQ", "ModelCompPT/SimulationPeriodPT"}) {
    TestSetup setup;
    auto& components = setup.At<CModelCompKvf>("SimSpec/ModelComp");
    components.WQ = 1;
    components.ADPTRadio = std::string_view(path).starts_with("ModelCompPT");
    auto& period = setup.At<Period>(path);
    for (period.RecyclingType = 0; period.RecyclingType <= 3; ++period.RecyclingType) {
      for (CYbDateTime Period::*date : {&Period::SimStart, &Period::SimEnd, &Period::CycleRestartDate,
                                        &Period::CycleEndDate, &Period::FlowFieldSolutionDate}) {
        for (const CYbDateTime& value : {before, start, end, after, none}) {
          period.*date = value;
          std::string expected, errors;
          for (const Rule& rule : rules)
            if (rule.recyclingType == period.RecyclingType && rule.date == date &&
                ((rule.hasStart && value < start) || (rule.hasEnd && value > end)))
              expected = rule.error;
          EXPECT_EQ(period.Validate(), expected.empty());
          for (const Finding& finding : period.Findings())
            if (finding.severity == Severity::Error) errors += finding.text;
          EXPECT_EQ(errors, expected) << period.RecyclingType << ' ' << value.Format("%Y/%m/%d %H:%M");
        }
        period.*date = start;
      }
    }
  }
}

TEST(Periods, EveryDateThatIsWrongIsTold) {
  TestSetup setup;
  setup.At<CModelCompKvf>("SimSpec/ModelComp").WQ = 1;
  auto& period = setup.At<CSimPeriodOnFlowBase>("ModelCompWQ/SimulationPeriodWQ");
  // The effective start counts: here it lies behind the held one and behind all dates.
  auto& simulation = setup.At<CSimPeriodKvf>(kPeriod);
  simulation.HotStart = simulation.SimStartFromHotStartDate = 1;
  simulation.HotStartDate = "2000/01/15 00:00";
  period.CycleEndDate = {2000, 1, 14};
  for (const auto& [type, count] : {std::pair{0, 1U}, {1, 3U}, {2, 0U}}) {
    period.RecyclingType = type;
    setup.Root().Validate();
    EXPECT_THAT(period.Findings(), SizeIs(count)) << type;
  }
  simulation.SIMEND = {1990, 1, 1};
  setup.Root().Validate();
  EXPECT_EQ(simulation.Findings().at(0).text, "The simulation ends before it begins");
  EXPECT_EQ(simulation.Valid(), 0);
  EXPECT_THAT(period.Findings(), SizeIs(1));
  simulation.SIMEND = simulation.GetSimStartDate();
  setup.Root().Validate();
  EXPECT_EQ(simulation.Findings().at(0).severity, Severity::Warning);
}

}  // namespace
}  // namespace tervane::periods_test
