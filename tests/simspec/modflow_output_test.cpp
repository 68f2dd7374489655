// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/modflow_output.h"

#include <functional>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "simspec/basic_parameters.h"
#include "simspec/periods.h"
#include "subsurface/saturated_zone.h"
#include "tests/simspec/test_setup.h"

namespace tervane::modflow_output_test {
namespace {

using test::TestSetup;
using testing::HasSubstr;
using testing::IsEmpty;

constexpr const char* kOutputPath = "OutputModflow";

struct Opened {
  explicit Opened(const std::string& sections = {}, int engine = kEngineModflowSurfact) : setup(sections) {
    setup.At<CBasicParaKvf>("SimSpec").ModelType = engine;
  }
  TestSetup setup;
  COutputModKvf& output = setup.At<COutputModKvf>(kOutputPath);
};

TEST(ModflowOutput, ANewSetupHasAllPackages) {
  TestSetup setup;
  EXPECT_EQ(setup.WrittenKeys(kOutputPath),
            "OutputControlOption=0 StoringTimeStep=10 StoringTimeStepHours=24f ModPath=0");
  for (const char* list : {"OutputDates", "OutputTimesteps"})
    EXPECT_EQ(setup.Written(fmt::format("{}/{}:NumberOfItems", kOutputPath, list)), "0");
  EXPECT_EQ(setup.Written("OutputModflow/PackagesOutput:NumberOfItems"), "8");
  const char* ids[] = {"HEAD", "DRAWDOWN", "BUDGET", "BCF", "RECHARGE", "EVAPOTRANSPIRATION", "DRAIN", "WELL"};
  for (std::size_t i = 0; i < std::size(ids); ++i)
    EXPECT_EQ(setup.WrittenKeys(fmt::format("OutputModflow/PackagesOutput/PackageOutput_{}", i + 1)),
              fmt::format("DataTypeID=\"{}\" ASCII=0 Binary=0", ids[i]));
}

TEST(ModflowOutput, ALittleCountDecidesForEachList) {
  struct Case {
    const char* keys;
    int packages;
  };
  const Case cases[] = {{"", 0},
                        {"YbSEKvfListItemCount = 8", 0},
                        {"NumberOfItems = 3", 3},
                        {"YbSEKvfListItemCount = 3\nNumberOfItems = 8", 8},
                        {"NumberOfItems = 0", 0},
                        {"NumberOfItems = -5", 0},
                        {"NumberOfItems = 2000000000", 1000}};
  for (const Case& c : cases) {
    Opened opened(fmt::format("section OutputModflow {{\nsection PackagesOutput {{\n{}\n}}\n}}", c.keys));
    EXPECT_EQ(opened.output.Packages().GetItemCount(), c.packages) << c.keys;
  }
  // Without their section the lists are as in a new setup.
  EXPECT_EQ(Opened("section OutputModflow {\n}").output.Packages().GetItemCount(), 8);
}

TEST(ModflowOutput, NamesAndFormatsGoByPlaceAndUseByTheFile) {
  Opened opened(
      "section OutputModflow {\nsection PackagesOutput {\nNumberOfItems = 9\nsection PackageOutput_1 {\nDataTypeID = "
      "\"WELL\"\nASCII = 1\nBinary = 1\n}\nsection PackageOutput_8 {\nDataTypeID = \"SOMETHING\"\n}\n}\n}");
  auto& packages = opened.output.Packages();
  EXPECT_EQ(packages.GetItem(1)->DisplayName(), "Head");
  EXPECT_FALSE(packages.GetItem(1)->IsDlgUsedInSetup());
  EXPECT_FALSE(packages.GetItem(5)->OffersAscii());
  EXPECT_FALSE(packages.GetItem(3)->OffersBinary());
  EXPECT_EQ(packages.GetItem(8)->DisplayName(), "Well/FWL");
  EXPECT_TRUE(packages.GetItem(8)->IsDlgUsedInSetup());
  EXPECT_EQ(packages.GetItem(9)->DisplayName(), "");
  EXPECT_TRUE(packages.GetItem(9)->OffersAscii() && packages.GetItem(9)->OffersBinary());
  EXPECT_EQ(opened.setup.WrittenKeys("OutputModflow/PackagesOutput/PackageOutput_1"),
            "DataTypeID=\"WELL\" ASCII=1 Binary=1");
}

TEST(ModflowOutput, PackagesFollowTheComponentsAtEachQuestion) {
  Opened opened;
  auto& components = opened.setup.At<CModModelCompKvf>("SimSpec/ModModelComp");
  auto& zone = opened.setup.At<CSatZoneKvf>("SaturatedZone");
  const auto used = [&] {
    std::string names;
    for (int number = 1; number <= 8; ++number)
      if (opened.output.Packages().GetItem(number)->IsDlgUsedInSetup())
        names += opened.output.Packages().GetItem(number)->DataTypeID + ' ';
    return names;
  };
  EXPECT_EQ(used(), "HEAD DRAWDOWN BUDGET BCF ");
  components.Recharge = 1;
  EXPECT_EQ(used(), "HEAD DRAWDOWN BUDGET BCF RECHARGE ");
  components.ET = zone.Wells = 1;
  EXPECT_EQ(used(), "HEAD DRAWDOWN BUDGET BCF RECHARGE EVAPOTRANSPIRATION WELL ");
}

TEST(ModflowOutput, EnginesHaveDatesOrTimeSteps) {
  for (int engine = 0; engine <= 4; ++engine)
    for (int option = 0; option <= 2; ++option) {
      Opened opened({}, engine);
      opened.output.OutputControlOption = option;
      EXPECT_EQ(opened.setup.IsUsed(kOutputPath), engine >= 1 && engine <= 3);
      EXPECT_EQ(opened.setup.IsUsed("OutputModflow/OutputDates"), engine == 1 && option == 2);
      EXPECT_EQ(opened.setup.IsUsed("OutputModflow/OutputTimesteps"), engine == 2 || engine == 3);
      EXPECT_TRUE(opened.setup.IsUsed("OutputModflow/PackagesOutput"));
      opened.output.Validate();
      EXPECT_TRUE(opened.output.Findings().empty());
    }
}

TEST(ModflowOutput, OutputDatesLieInTheSimulationAndIncrease) {
  struct Case {
    std::vector<CYbDateTime> dates;
    const char *error, *detail;
  };
  const Case cases[] = {
      {{}, "", ""},
      {{{2000, 1, 1}, {2000, 2, 1}}, "", ""},
      {{{2000, 2, 1, 0, 1}}, "At least one Output Date is after Simulation End Date.", "output date 1"},
      {{{1999, 12, 31, 23, 59}}, "All out dates dates must be after Simulation Start Date.", "output date 1"},
      {{{2000, 1, 9}, {2000, 1, 9}}, "All Output Dates must be increasing.", "output date 2"},
      {{{2000, 1, 9}, {2000, 1, 8}, {2001, 1, 1}}, "All Output Dates must be increasing.", "output date 2"},
      {{{2000, 1, 9}, {}}, "At least one Output Date is before Simulation Start Date.", "Invalid"}};
  for (const Case& c : cases) {
    Opened opened;
    opened.output.OutputControlOption = COutputModKvf::kSpecified;
    for (const CYbDateTime& date : c.dates) opened.output.Dates().AddItem()->Date = date;
    EXPECT_EQ(opened.output.Validate() != 0, *c.error == '\0');
    const auto& findings = opened.output.Dates().Findings();
    ASSERT_EQ(findings.size(), *c.error ? 1U : 0U);
    if (!*c.error) continue;
    EXPECT_THAT(findings[0].text, HasSubstr(c.error));
    EXPECT_THAT(findings[0].detail, HasSubstr(c.detail));
  }
  // A new date is the end of the simulation, of which there can be one.
  Opened opened;
  opened.output.OutputControlOption = COutputModKvf::kSpecified;
  opened.output.Dates().AddItem();
  EXPECT_TRUE(opened.output.Validate());
  opened.output.Dates().AddItem();
  EXPECT_FALSE(opened.output.Validate());
}

TEST(ModflowOutput, ATimeStepWithoutItsPeriodIsOneOfTheFirst) {
  Opened opened(
      "section OutputModflow {\nsection OutputTimesteps {\nNumberOfItems = 2\nsection OutputTimestep_1 {\nTimestep = "
      "4.0\n}\nsection OutputTimestep_2 {\nStressPeriod = 7\n}\n}\n}",
      kEngineModflow96);
  EXPECT_EQ(opened.setup.WrittenKeys("OutputModflow/OutputTimesteps/OutputTimestep_1"), "StressPeriod=1 Timestep=4f");
  EXPECT_EQ(opened.setup.WrittenKeys("OutputModflow/OutputTimesteps/OutputTimestep_2"), "StressPeriod=7 Timestep=1f");
}

TEST(ModflowOutput, ADateWithoutASimulationIsToday) {
  const COutputModDateItemKvf item(nullptr);
  EXPECT_TRUE(item.Date.IsValid());
  EXPECT_GE(item.Date.Year(), 2024);
}

}  // namespace
}  // namespace tervane::modflow_output_test
