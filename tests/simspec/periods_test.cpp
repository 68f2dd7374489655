// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/periods.h"

#include <gmock/gmock.h>

#include "simspec/model_components.h"
#include "tests/simspec/test_setup.h"
#include "tests/support/temp_folder.h"

namespace tervane {
namespace {

using test::TestSetup;
using testing::IsEmpty;
using testing::SizeIs;

constexpr const char* kPeriod = "SimSpec/SimulationPeriod";

std::string SimPeriod(const std::string& keys) {
  return "section SimSpec {\nsection SimulationPeriod {\n" + keys + "\n}\n}\n";
}

TEST(Periods, ANewSetupRunsThroughJanuary2000) {
  TestSetup setup;
  EXPECT_EQ(setup.WrittenKeys(kPeriod),
            "HotStart=0 HotStartResultFile=file \"\" HotStartDate=0, 0, 0, 0, 0 HotStartDateIndex=0 "
            "SimStartFromHotStartDate=0 SIMSTART=2000, 1, 1, 0, 0 SIMEND=2000, 2, 1, 0, 0");
  for (const char* period : {"ModelCompWQ/SimulationPeriodWQ", "ModelCompPT/SimulationPeriodPT"})
    EXPECT_EQ(setup.WrittenKeys(period),
              "SimStart=2000, 1, 1, 0, 0 SimEnd=2000, 2, 1, 0, 0 RecyclingType=0 CycleRestartDate=2000, 1, 1, 0, 0 "
              "CycleEndDate=2000, 2, 1, 0, 0 FlowFieldSolutionDate=2000, 2, 1, 0, 0");
  for (const char* title : {"SimSpec/SimTitle", "ModelCompWQ/SimTitleWQ", "ModelCompPT/SimTitlePT"})
    EXPECT_EQ(setup.WrittenKeys(title), "Title=\"\" Description=\"\"");
  EXPECT_NE(setup.Root().GetImportantNode("PT_SIM_PERIOD"), nullptr);
  // The defaults of the later periods are those of a new setup, whatever the file says.
  TestSetup read(SimPeriod("SIMSTART = 1990, 1, 1, 0, 0"));
  EXPECT_EQ(read.Written("ModelCompWQ/SimulationPeriodWQ:SimStart"), "2000, 1, 1, 0, 0");
}

TEST(Periods, TheEngineGetsTheEffectiveStartAndTheHeldOneSurvives) {
  struct Case {
    int hotStart, startsFromIt;
    const char* date;  ///< In the file.
    const char* writtenDate;
    const char* writtenStart;
  };
  const char* held = "1990, 5, 6, 7, 8";
  for (const Case& c : {Case{1, 1, "1995, 2, 3, 4, 5", "1995, 2, 3, 4, 5", "1995, 2, 3, 4, 5"},
                        {1, 0, "1995, 2, 3, 4, 5", "1995, 2, 3, 4, 5", held},
                        {0, 1, "1995, 2, 3, 4, 5", "1995, 2, 3, 4, 5", held},
                        {1, 1, "1995, 2, 30, 4, 5", "0, 0, 0, 0, 0", held},
                        {1, 1, "0, 0, 0, 0, 0", "0, 0, 0, 0, 0", held}}) {
    TestSetup setup(SimPeriod("HotStart = " + std::to_string(c.hotStart) + "\nHotStartDate = " + c.date +
                              "\nSimStartFromHotStartDate = " + std::to_string(c.startsFromIt) +
                              "\nSIMSTART = " + held));
    EXPECT_EQ(setup.Written(std::string(kPeriod) + ":HotStartDate"), c.writtenDate);
    EXPECT_EQ(setup.Written(std::string(kPeriod) + ":SIMSTART"), c.writtenStart);
    auto& period = setup.At<CSimPeriodKvf>(kPeriod);
    period.HotStart = 0;
    EXPECT_EQ(setup.Written(std::string(kPeriod) + ":SIMSTART"), held);
  }
}

TEST(Periods, TheHotStartDateIsHeldAsText) {
  TestSetup setup(SimPeriod("HotStartDate = 1995, 2, 3, 4, 5"));
  auto& period = setup.At<CSimPeriodKvf>(kPeriod);
  EXPECT_EQ(period.HotStartDate, "1995/02/03 04:05");
  // As an entry of the list, an empty text and one that is no date.
  for (const auto& [text, written] : {std::pair{"2001/02/03 04:05:06", "2001, 2, 3, 4, 5"},
                                      {"", "0, 0, 0, 0, 0"},
                                      {"Invalid DateTime.", "0, 0, 0, 0, 0"},
                                      {"2001/02", "0, 0, 0, 0, 0"}}) {
    period.HotStartDate = text;
    EXPECT_EQ(setup.Written(std::string(kPeriod) + ":HotStartDate"), written) << text;
  }
}

struct Catalogue {
  int version = 1002;
  const char* hasData = "HotStartData = 1";
  const char* start = "StartDate = 2000, 1, 1, 0, 0";
  const char* end = "EndDate = 2000, 1, 2, 0, 0";
  const char* interval = "HotstartStoringTimestep_Hrs = 6.0";

  std::string Text() const {
    return "target TVDRES {\nsection general {\nsection version {\nVersionNumber = " + std::to_string(version) +
           "\n}\n}\nsection OutputPeriodAndMaxTimestep {\n" + hasData + "\n" + start + "\n" + end + "\n" + interval +
           "\n}\n}\n";
  }
};

TEST(Periods, HotStartDatesLieOneStoringIntervalApartBehindTheStart) {
  const test::TempFolder folder;
  struct Case {
    Catalogue catalogue;
    int result;
    std::vector<std::string> dates;
  };
  const std::vector<std::string> quarters = {"2000/01/01 06:00:00", "2000/01/01 12:00:00", "2000/01/01 18:00:00",
                                             "2000/01/02 00:00:00"};
  for (const Case& c :
       {Case{{}, 1, quarters},
        {{.version = 1001}, 0, {}},
        {{.hasData = "HotStartData = 0"}, 0, {}},
        {{.hasData = "HotStartData = 2"}, 0, {}},
        {{.hasData = ""}, 0, {}},
        {{.interval = "HotstartStoringTimestep_Hrs = 0.0"}, 1, {}},
        {{.interval = "HotstartStoringTimestep_Hrs = -6.0"}, 1, {}},
        {{.interval = "HotstartStoringTimestep_Hrs = 0.0001"}, 1, {}},  // Less than half a second.
        {{.interval = ""}, 1, {}},
        {{.interval = "HotstartStoringTimestep_Hrs = 6"}, 1, quarters},
        {{.interval = "HotstartStoringTimestep_Hrs = 10.0003"}, 1, {"2000/01/01 10:00:01", "2000/01/01 20:00:02"}},
        {{.interval = "HotstartStoringTimestep_Hrs = 24.0"}, 1, {"2000/01/02 00:00:00"}},
        {{.interval = "HotstartStoringTimestep_Hrs = 24.1"}, 1, {}},
        {{.interval = "HotstartStoringTimestep_Hrs = 1e300"}, 1, {}},
        {{.end = ""}, 1, {}},
        {{.start = ""}, 1, {}},
        {{.start = "StartDate = 9999, 12, 31, 12, 0", .end = "EndDate = 9999, 12, 31, 23, 59"},
         1,
         {"9999/12/31 18:00:00"}}}) {
    TestSetup setup;
    auto& period = setup.At<CSimPeriodKvf>(kPeriod);
    const std::string path = folder.Write("x.tvdres", c.catalogue.Text());
    period.HotStart = 1;
    period.HotStartDates = {"stale"};
    EXPECT_EQ(period.LoadHotStartDates(path), c.result) << c.catalogue.Text();
    EXPECT_EQ(period.HotStartDates, c.dates) << c.catalogue.Text();
  }
}

TEST(Periods, WithoutAHotStartFileThereAreNoHotStartDatesAndNoPendingError) {
  const test::TempFolder folder;
  const std::string good = folder.Write("good.tvdres", Catalogue().Text());
  struct Case {
    int hotStart;
    std::string path;
  };
  for (const Case& c : {Case{0, good},
                        {1, ""},
                        {1, folder.File("missing.tvdres")},
                        {1, folder.Write("broken.tvdres", "target {")},
                        {1, folder.Write("other.tvdres", "target OTHER {\n}\n")}}) {
    TestSetup setup;
    auto& period = setup.At<CSimPeriodKvf>(kPeriod);
    period.HotStart = c.hotStart;
    period.HotStartDates = {"stale"};
    EXPECT_EQ(period.LoadHotStartDates(c.path), 0) << c.path;
    EXPECT_THAT(period.HotStartDates, IsEmpty()) << c.path;
    EXPECT_EQ(kvfPeekErrorGlb(), kKvfNoError);
  }
}

TEST(Periods, DatesOnFlowResultsMustLieWithinTheSimulation) {
  const CYbDateTime start(2000, 1, 1), end(2000, 2, 1);
  const CYbDateTime before(1999, 12, 31, 23, 59), after(2000, 2, 1, 0, 1);
  using Date = CYbDateTime CSimPeriodOnFlowBase::*;
  const Date simStart = &CSimPeriodOnFlowBase::SimStart, simEnd = &CSimPeriodOnFlowBase::SimEnd,
             restart = &CSimPeriodOnFlowBase::CycleRestartDate, cycleEnd = &CSimPeriodOnFlowBase::CycleEndDate,
             solution = &CSimPeriodOnFlowBase::FlowFieldSolutionDate;
  const std::string between = " must be between Water Movement Simulation Start Date and Simulation End Date.";
  struct Case {
    int recyclingType;
    Date date;
    CYbDateTime value;
    std::string error;  ///< Empty for none.
  };
  const std::string early = "Water Quality Start Date can't be before Water Movement Simulation Start Date.";
  const std::string late = "Water Quality End Date can't be after Water Movement Simulation End Date.";
  std::vector<Case> cases = {{0, simStart, start, ""}, {0, simStart, before, early}, {0, simStart, after, ""},
                             {0, simStart, {}, early},  // No date.
                             {0, simEnd, end, ""},     {0, simEnd, after, late},     {0, simEnd, before, ""},
                             {0, restart, before, ""}, {0, cycleEnd, after, ""},     {0, solution, after, ""},
                             {1, simEnd, after, ""},   {1, solution, after, ""},     {2, simStart, before, ""},
                             {2, simEnd, after, ""},   {2, restart, before, ""},     {3, simStart, before, ""}};
  const std::tuple<int, Date, std::string> bounded[] = {{1, simStart, "Water Quality Start Date" + between},
                                                        {1, restart, "Water Quality Cycle Restart Date" + between},
                                                        {1, cycleEnd, "Water Quality Cycle End Date" + between},
                                                        {2, solution, "Water Quality Flow Field Date" + between}};
  for (const auto& [type, date, error] : bounded) {
    for (const CYbDateTime& value : {start, end}) cases.push_back({type, date, value, ""});
    for (const CYbDateTime& value : {before, after}) cases.push_back({type, date, value, error});
  }
  for (const Case& c : cases) {
    for (const bool tracksParticles : {false, true}) {
      TestSetup setup;
      auto& components = setup.At<CModelCompKvf>("SimSpec/ModelComp");
      components.WQ = 1;
      components.ADPTRadio = tracksParticles;
      auto& period = setup.At<CSimPeriodOnFlowBase>(tracksParticles ? "ModelCompPT/SimulationPeriodPT"
                                                                    : "ModelCompWQ/SimulationPeriodWQ");
      period.RecyclingType = c.recyclingType;
      period.*c.date = c.value;
      std::vector<std::string> errors;
      EXPECT_EQ(period.Validate(), c.error.empty());
      for (const Finding& finding : period.Findings()) errors.push_back(finding.text);
      EXPECT_EQ(errors, c.error.empty() ? std::vector<std::string>() : std::vector{c.error})
          << c.recyclingType << ' ' << c.value.Format("%Y/%m/%d %H:%M");
      EXPECT_EQ(period.ValidateData(), c.error.empty());
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
  simulation.SIMEND = {1990, 1, 1};  // Dates that run backwards are no error of their own.
  setup.Root().Validate();
  EXPECT_THAT(simulation.Findings(), IsEmpty());
  EXPECT_THAT(period.Findings(), SizeIs(1));
}

}  // namespace
}  // namespace tervane
