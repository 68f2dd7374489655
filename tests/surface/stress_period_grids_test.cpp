// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "surface/stress_period_grids.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "simspec/basic_parameters.h"
#include "simspec/stress_periods.h"
#include "surface/climate.h"
#include "tests/simspec/test_setup.h"

namespace tervane::stress_period_grids_test {
namespace {

using test::TestSetup;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

/// A setup with Modflow whose recharge layers have spans.
struct Opened {
  explicit Opened(int periods, const std::vector<int>& ends = {}) {
    setup.At<CBasicParaKvf>("SimSpec").ModelType = kEngineModflowSurfact;
    setup.At<CModModelCompKvf>("SimSpec/ModModelComp").Recharge = 1;
    setup.At<CPrecipitationRelatedKvf>("Climate").RechargeOption = CPrecipitationRelatedKvf::kGivenLayer;
    stressPeriods.MakeEqualPeriods(periods, {});
    for (const int end : ends) spans.AddItem()->StressPeriodTo = end;
  }
  std::vector<int> Ends() const {
    std::vector<int> ends;
    for (int number = 1; number <= spans.GetItemCount(); ++number)
      ends.push_back(spans.GetItem(number)->StressPeriodTo);
    return ends;
  }
  TestSetup setup;
  CStressPeriodsKvf& stressPeriods = setup.At<CStressPeriodsKvf>("SimSpec/STRESSPERIODS");
  CRechargeAndPondingModListKvf& spans = setup.At<CRechargeAndPondingModListKvf>("Climate/RechargeLayer");
};

TEST(StressPeriodGrids, EnginesAndOptionsDecideWhatTakesPart) {
  for (int engine = 0; engine <= 4; ++engine)
    for (int recharge = 0; recharge <= 2; ++recharge)
      for (int ponding = 0; ponding <= 1; ++ponding) {
        TestSetup setup;
        setup.At<CBasicParaKvf>("SimSpec").ModelType = engine;
        setup.At<CPrecipitationRelatedKvf>("Climate").RechargeOption = recharge;
        setup.At<CPrecipitationRelatedKvf>("Climate").PondingOption = ponding;
        auto& old = setup.At<CEvapotransKvf>("Evapotrans");
        const bool isModflow = engine >= 1 && engine <= 3;
        EXPECT_EQ(setup.IsUsed("Climate/RechargeFraction"), isModflow);
        EXPECT_EQ(setup.IsUsed("Climate/RechargeLayer"), isModflow && recharge == 2);
        EXPECT_EQ(setup.IsUsed("Climate/PondingElevation"), engine == 1 && ponding == 1);
        for (const char* list : {"ETSurfaceElevation", "ETExtinctionDepth"})
          EXPECT_EQ(setup.IsUsed(fmt::format("Evapotrans/{}", list)), isModflow);
        for (const int layer : {0, 1, 2}) {
          old.ETLayer = layer;
          EXPECT_EQ(setup.IsUsed("Evapotrans/ETLayer"), isModflow && layer != 0);
        }
      }
}

TEST(StressPeriodGrids, ASpanHasItsEndAndTheKeysOfItsQuantity) {
  const std::tuple<const char*, int, bool> lists[] = {
      {"Climate/RechargeLayer", quantity::kCode, false},
      {"Climate/PondingElevation", quantity::kWaterLevel, true},
      {"Evapotrans/ETSurfaceElevation", quantity::kElevation, true},
      {"Evapotrans/ETExtinctionDepth", quantity::kDepthBelowGround, false},
      {"Evapotrans/ETLayer", quantity::kCode, false}};
  TestSetup setup;
  setup.At<CStressPeriodsKvf>("SimSpec/STRESSPERIODS").SetItemCount(3, 1);
  for (const auto& [path, itemType, mayBeRelative] : lists) {
    const CRechargeAndPondingModItemKvf& item = *setup.At<CRechargeAndPondingModListKvf>(path).AddItem();
    EXPECT_EQ(item.StressPeriodTo, 3);
    EXPECT_EQ(item.GetItemType(), itemType) << path;
    EXPECT_EQ(item.HasRelativeToGround(), mayBeRelative) << path;
    EXPECT_EQ(item.RelativeToGround, 0);
  }
  EXPECT_THAT(setup.WrittenKeys("Climate/RechargeLayer/STRESSPERIODSPAN_1"),
              testing::StartsWith("StressPeriodTo=3 Type=0 FixedValue=0f InterpMethod=2 "));
}

TEST(StressPeriodGrids, TheLastSpanReachesTheLastPeriod) {
  constexpr const char* kLast = "Last Stress period is not valid";
  constexpr const char* kOrder = "To must be greater than or equal to From";
  constexpr const char* kBeyond = "To can not be greater than last Stress Period number";
  struct Case {
    int periods;
    std::vector<int> ends, mended;
    std::vector<std::string> errors;
  };
  const Case cases[] = {{10, {}, {}, {}},
                        {10, {10}, {10}, {}},
                        {10, {3}, {10}, {}},
                        {10, {12}, {10}, {}},
                        {5, {3, 10}, {3, 5}, {}},
                        {12, {3, 10}, {3, 12}, {}},
                        {2, {3, 10}, {3, 10}, {kLast, kBeyond}},
                        {4, {4, 4}, {4, 4}, {kOrder}},
                        {4, {4, 9}, {4, 4}, {kOrder}},
                        {4, {3, 2, 4}, {3, 2, 4}, {kOrder}},
                        {4, {0, 4}, {0, 4}, {kOrder}},
                        {4, {-7, 4}, {-7, 4}, {kOrder}},
                        {4, {2, 9, 3}, {2, 9, 4}, {kBeyond}}};
  for (const Case& c : cases) {
    Opened opened(c.periods, c.ends);
    EXPECT_EQ(opened.spans.Validate() != 0, c.errors.empty());
    std::vector<std::string> errors;
    for (const Finding& finding : opened.spans.Findings()) errors.push_back(finding.text);
    EXPECT_EQ(errors, c.errors) << c.periods << testing::PrintToString(c.ends);
    EXPECT_EQ(opened.Ends(), c.mended);
  }
}

TEST(StressPeriodGrids, SpansAreNamedByTheirPeriods) {
  Opened opened(10, {3, 10});
  opened.setup.Root().Validate();
  auto& second = *opened.spans.GetItem(2);
  EXPECT_EQ(second.GetTitle(), "Recharge Layer for Stress Period 4 to 10");
  EXPECT_EQ(second.GetAbbreviatedTitle(), "StressP. 4-10");
  EXPECT_EQ(second.DatesText(), "From 2000-01-10 07:12 to 2000-02-01 00:00");
  EXPECT_EQ(opened.spans.GetItem(1)->DatesText(), "From 2000-01-01 00:00 to 2000-01-10 07:12");
  // They follow the span before them and the number of periods.
  opened.spans.GetItem(1)->StressPeriodTo = 5;
  opened.stressPeriods.SetItemCount(12, 1);
  opened.setup.Root().Validate();
  EXPECT_EQ(second.GetAbbreviatedTitle(), "StressP. 6-12");
  second.StressPeriodTo = 99;
  EXPECT_THAT(second.DatesText(), HasSubstr("to ERROR"));

  TestSetup read(
      "section Climate {\nsection RechargeLayer {\nYbSEKvfListItemCount = 2\nsection STRESSPERIODSPAN_1 "
      "{\nStressPeriodTo "
      "= 2\n}\nsection STRESSPERIODSPAN_2 {\nStressPeriodTo = 4\n}\n}\n}");
  EXPECT_EQ(read.At<CYbSEKvfBase>("Climate/RechargeLayer/STRESSPERIODSPAN_2").GetTitle(),
            "Recharge Layer for Stress Period 3 to 4");
}

TEST(StressPeriodGrids, OldFilesAreToldWhatTheNextSaveWillNotHold) {
  struct Case {
    int engine;
    const char* keys;
    std::size_t notes;
  };
  const Case cases[] = {{1, "ETLayer = 1", 1},
                        {3, "section ETExtinctionDepth {\nYbSEKvfListItemCount = 1\n}", 1},
                        {1, "ETLayer = 1\nsection ETLayer {\nYbSEKvfListItemCount = 1\n}", 1},
                        {1, "", 0},
                        {0, "ETLayer = 1", 0}};
  for (const Case& c : cases) {
    TestSetup setup(
        fmt::format("section SimSpec {{\nModelType = {}\n}}\nsection Evapotrans {{\n{}\n}}", c.engine, c.keys));
    std::size_t notes = 0;
    for (const auto& entry : setup.Report().entries)
      notes += entry.text.find("evapotranspiration") != std::string::npos;
    EXPECT_EQ(notes, c.notes) << c.keys;
    EXPECT_THAT(setup.Report().unread, IsEmpty()) << c.keys;
  }
}

}  // namespace
}  // namespace tervane::stress_period_grids_test
