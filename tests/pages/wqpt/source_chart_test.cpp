// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/wqpt/source_chart.h"

#include <gmock/gmock.h>

#include "platform/item_types.h"
#include "platform/units.h"
#include "tests/wqpt/quality_setup.h"

namespace tervane::source_chart_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

CYbDateTime Day(int day) { return CYbDateTime(2000, 1, day); }

DrawnSource Stepped(std::vector<int> days, std::vector<double> values, int itemType = quantity::kMassRate) {
  DrawnSource source{"S", itemType};
  auto series = std::make_shared<Series>();
  for (const int day : days) series->times.push_back(Day(day));
  series->values = std::move(values);
  series->isStepped = true;
  source.series = std::move(series);
  source.unit = BaseUnit(*FindItemType(itemType)).key;
  return source;
}

TEST(SourceChart, AddsUpRatesOverAllTimes) {
  std::vector<std::string> left;
  // A constant, one over the intervals that end on days 3 and 5, and a concentration, which is no mass.
  const std::vector<DrawnSource> sources{
      {"A", quantity::kMassRate, 10}, Stepped({3, 5}, {1, 2}), {"C", quantity::kConcentration, 7}};
  const std::vector<Series> sums = SumsOfMass(sources, Day(1), Day(9), left);
  ASSERT_EQ(sums.size(), 1U);
  EXPECT_THAT(sums[0].times, ElementsAre(Day(1), Day(3), Day(5), Day(9)));
  EXPECT_THAT(sums[0].values, ElementsAre(10, 11, 12, 10));
  EXPECT_TRUE(sums[0].isStepped);
  EXPECT_THAT(left, IsEmpty());
  // What is out of the simulation has its own time alone.
  EXPECT_THAT(SumsOfMass({{"A", quantity::kMassRate, 10}, Stepped({3, 5}, {1, 2})}, Day(4), Day(5), left)[0].values,
              ElementsAre(1, 12, 12));
}

TEST(SourceChart, MassesOfStepsAreAddedWhereTheStepsAreTheSame) {
  std::vector<std::string> left;
  const DrawnSource first = Stepped({2, 3}, {1, 2}, quantity::kMass), same = Stepped({2, 3}, {5, 5}, quantity::kMass),
                    other = Stepped({2, 4}, {5, 5}, quantity::kMass);
  const auto sums = SumsOfMass({first, same}, Day(2), Day(3), left);
  ASSERT_EQ(sums.size(), 1U);
  EXPECT_THAT(sums[0].values, ElementsAre(6, 7));
  EXPECT_THAT(SumsOfMass({first, other}, Day(2), Day(3), left), IsEmpty());
  EXPECT_THAT(left, ElementsAre(HasSubstr("time steps differ")));
}

TEST(SourceChart, ShowsEachSourceAsABarAndTellsWhatIsNoCurve) {
  test::QualitySetup setup(
      "section SimSpec { section ModelComp { WQ = 1; } section SimulationPeriod { SIMSTART = 2000, 1, 1, 0, 0; SIMEND "
      "= "
      "2000, 2, 1, 0, 0; } } section Sources { NumberOfSources = 3; section Source_1 { SourceName = \"Rain\"; } "
      "section "
      "Source_2 { SourceName = \"Farm\"; SourceType = 1; section Strength { section GLOBAL { FIXED_VALUE = 3f; } } } "
      "section Source_3 { SourceName = \"Wells\"; SourceType = 1; section Strength { DistributionType = 2; } } }");
  SourceChart chart;
  const SeriesContent content = chart.Content(setup.At<CSourcesWQListKvf>("Sources"));
  ASSERT_EQ(content.bars.size(), 3U);
  EXPECT_EQ(content.bars[1].name, "Farm");
  EXPECT_EQ(content.bars[1].end, CYbDateTime(2000, 2, 1));
  ASSERT_EQ(content.series.size(), 2U);
  EXPECT_EQ(content.series[0].name, "Sum of mass sources");
  EXPECT_THAT(content.series[0].values, ElementsAre(3, 3));
  EXPECT_EQ(content.series[1].name, "Rain");
  EXPECT_EQ(content.series[1].panel, 1);
  EXPECT_THAT(chart.Left(), ElementsAre("Wells: its strength differs from station to station"));
}

}  // namespace
}  // namespace tervane::source_chart_test
