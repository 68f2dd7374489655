// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/simspec/period_pages.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "simspec/periods.h"
#include "tests/support/page_driver.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::period_pages_test {
namespace {

using test::PageDriver;
using test::SetupText;
using test::TempFolder;
using test::ValueOf;
using testing::ElementsAre;

constexpr const char* kCatalogue = R"(target TVDRES {
  section general {
    section version {
      VersionNumber = 1002
    }
  }
  section OutputPeriodAndMaxTimestep {
    HotStartData = 1
    StartDate = 2000, 1, 1, 0, 0
    EndDate = 2000, 1, 2, 0, 0
    HotstartStoringTimestep_Hrs = 6.0
  }
})";

TEST(PeriodPages, AHotStartDateIsChosenFromTheResultFileAndBecomesTheStart) {
  const TempFolder folder;
  folder.Write("flow.tvdres", kCatalogue);
  CFlowModelDoc document;
  ASSERT_TRUE(document.OpenText(SetupText(14, ""), folder.File("a.tvd")));
  PageDriver page(document, "SimSpec/SimulationPeriod");
  EXPECT_FALSE(page.IsEnabled("Hot start date:"));
  page.Enter("Use hot start data", "1");
  EXPECT_FALSE(page.IsEnabled("Use hot start date for simulation start date"));
  page.Enter("Hot start result File:", folder.File("flow.tvdres"));
  EXPECT_EQ(ValueOf(document, "SimSpec/SimulationPeriod:HotStartResultFile"), "flow.tvdres");
  EXPECT_THAT(page.Find("Hot start date:").Options(),
              ElementsAre("2000/01/01 06:00:00", "2000/01/01 12:00:00", "2000/01/01 18:00:00", "2000/01/02 00:00:00"));
  EXPECT_EQ(ValueOf(document, "SimSpec/SimulationPeriod:HotStartDate"), "2000, 1, 1, 6, 0");
  page.Enter("Hot start date:", "2");
  page.Enter("Use hot start date for simulation start date", "1");
  EXPECT_FALSE(page.IsEnabled("Start Date:"));
  EXPECT_EQ(page.Find("Start Date:").Text(), "2000/01/01  18:00");
  EXPECT_EQ(ValueOf(document, "SimSpec/SimulationPeriod:SIMSTART"), "2000, 1, 1, 18, 0");
  // The own start date comes back.
  page.Enter("Use hot start data", "0");
  EXPECT_TRUE(page.IsEnabled("Start Date:"));
  EXPECT_EQ(ValueOf(document, "SimSpec/SimulationPeriod:SIMSTART"), "2000, 1, 1, 0, 0");
}

TEST(PeriodPages, AHotStartDateThatTheListDoesNotHaveIsGivenUpWhenAUserSeesThePage) {
  const TempFolder folder;
  folder.Write("flow.tvdres", kCatalogue);
  const struct {
    const char *file, *index, *date;
    bool isGivenUp;
  } cases[] = {{"flow.tvdres", "3", "2000, 1, 2, 0, 0", false},
               {"flow.tvdres", "4", "2000, 1, 2, 6, 0", true},
               {"gone.tvdres", "0", "2000, 1, 2, 6, 0", true},
               {"gone.tvdres", "0", "0, 0, 0, 0, 0", false}};
  for (const auto& c : cases) {
    SCOPED_TRACE(c.index);
    CFlowModelDoc document;
    ASSERT_TRUE(document.OpenText(
        SetupText(14, fmt::format("section SimSpec {{\nsection SimulationPeriod {{\nHotStart = 1\n"
                                  "HotStartResultFile = file \"{}\"\nHotStartDate = {}\nHotStartDateIndex = {}\n}}\n}}",
                                  c.file, c.date, c.index)),
        folder.File("a.tvd")));
    // A page that is only read changes nothing.
    NobodyToAsk nobody;
    auto& period = *document.Root().Important(kSimulationPeriod);
    MakePage(kSimPeriodPage, period, {document, nobody, {}});
    EXPECT_EQ(ValueOf(document, "SimSpec/SimulationPeriod:HotStartDate"), c.date);
    PageDriver page(document, "SimSpec/SimulationPeriod");
    EXPECT_EQ(page.Changes(),
              c.isGivenUp ? std::vector<std::string>{"1 Give Up Lost Hot Start Date"} : std::vector<std::string>());
    EXPECT_EQ(ValueOf(document, "SimSpec/SimulationPeriod:HotStartDate"), c.isGivenUp ? "0, 0, 0, 0, 0" : c.date);
    EXPECT_EQ(ValueOf(document, "SimSpec/SimulationPeriod:HotStartDateIndex"), c.isGivenUp ? "0" : c.index);
  }
}

TEST(PeriodPages, RecyclingDecidesWhichDatesCount) {
  CFlowModelDoc document;
  for (const char* path : {"ModelCompWQ/SimulationPeriodWQ", "ModelCompPT/SimulationPeriodPT"}) {
    PageDriver page(document, path);
    for (const char* type : {"0", "1", "2"}) {
      page.Enter("RecyclingType", type);
      EXPECT_EQ(page.IsEnabled("Cycle Restart Date:"), *type == '1');
      EXPECT_EQ(page.IsEnabled("Cycle End Date:"), *type == '1');
      EXPECT_EQ(page.IsEnabled("Date for Flow Field Solution:"), *type == '2');
      EXPECT_TRUE(page.IsEnabled("Start Date:"));
    }
  }
}

}  // namespace
}  // namespace tervane::period_pages_test
