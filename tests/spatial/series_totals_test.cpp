// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/series_totals.h"

#include <cmath>

#include <gmock/gmock.h>

namespace tervane::series_totals_test {
namespace {

using testing::ElementsAre;

constexpr std::int64_t kDay = 86400;
constexpr double kNone = std::numeric_limits<double>::quiet_NaN();

/// Values with stamps in days from the first of two periods of ten days on; not a number for a missing one.
struct Values {
  ValueType type;
  std::optional<double> begin;
  std::vector<double> days;
  std::vector<double> values;
};

SeriesFacts Sum(const Values& values) {
  DataItem item;
  item.hasTime = true;
  item.valueType = values.type;
  TimeAxis time;
  const auto at = [](double days) { return static_cast<std::int64_t>(days * kDay); };
  for (const double day : values.days) time.stamps.push_back(at(day));
  time.steps = time.stamps.size();
  if (values.begin) time.begin = CYbDateTime::FromSecondsSinceEpoch(at(*values.begin));
  return SumSteps(item, time, {{0, 10 * kDay}, {10 * kDay, 20 * kDay}}, TimeSpan{kDay, 19 * kDay},
                  [&](std::size_t step, double& value) -> std::string {
                    value = values.values[step];
                    return {};
                  },
                  {});
}

TEST(SeriesTotals, FollowTheKindOfValue) {
  struct Row {
    Values values;
    double first, second;          ///< Integrals in unit times days; of what is counted over steps the amount.
    double firstDays, secondDays;  ///< Covered.
  };
  const Row rows[] = {
      // A mean holds over its step, also over the border of two periods.
      {{ValueType::MeanStep, 0, {5, 15, 20}, {2, 3, 1}}, 2 * 5 + 3 * 5, 3 * 5 + 1 * 5, 10, 10},
      // A sum spreads evenly over its step.
      {{ValueType::StepAccumulated, 5, {15, 20}, {10, 5}}, 5, 5 + 5, 5, 10},
      {{ValueType::Accumulated, 0, {5, 15}, {10, 40}}, 10 + 15, 15, 10, 5},
      // Instantaneous values go in a line from one to the next; before the first and behind the last nothing is known.
      {{ValueType::Instantaneous, {}, {8, 12}, {0, 4}}, 2, 6, 2, 2},
      // What is missing counts for nothing, and an instantaneous value needs both ends.
      {{ValueType::MeanStep, 0, {5, 10, 20}, {2, kNone, 4}}, 10, 40, 5, 10},
      {{ValueType::Instantaneous, {}, {0, 5, 10}, {1, kNone, 1}}, 0, 0, 0, 0},
      // Without a begin the first step is as long as the others, where all are.
      {{ValueType::MeanStep, {}, {5, 20}, {100, 1}}, 5, 10, 5, 10},
  };
  for (const Row& row : rows) {
    const SeriesFacts facts = Sum(row.values);
    ASSERT_EQ(facts.error, "");
    ASSERT_EQ(facts.sums.size(), 2U);
    const double day = static_cast<double>(kDay);
    const bool isAmount = row.values.type == ValueType::StepAccumulated || row.values.type == ValueType::Accumulated;
    EXPECT_NEAR(facts.sums[0].integral / (isAmount ? 1 : day), row.first, 1e-9);
    EXPECT_NEAR(facts.sums[1].integral / (isAmount ? 1 : day), row.second, 1e-9);
    EXPECT_NEAR(static_cast<double>(facts.sums[0].covered) / day, row.firstDays, 1e-9);
    EXPECT_NEAR(static_cast<double>(facts.sums[1].covered) / day, row.secondDays, 1e-9);
  }
}

TEST(SeriesTotals, TellTheGapsOfTheTimeThatIsWatched) {
  const auto gapsOf = [](const Values& values) {
    std::vector<std::pair<double, double>> days;
    for (const TimeSpan& gap : Sum(values).gaps)
      days.emplace_back(static_cast<double>(gap.start) / kDay, static_cast<double>(gap.end) / kDay);
    return days;
  };
  using testing::IsEmpty;
  using testing::Pair;
  std::vector<double> days, values;
  for (int day = 1; day <= 20; ++day) {
    days.push_back(day);
    values.push_back(1);
  }
  EXPECT_THAT(gapsOf({ValueType::MeanStep, 0, days, values}), IsEmpty());
  values[0] = values[4] = values[5] = values[19] = kNone;  // the first and the last day are not watched
  EXPECT_THAT(gapsOf({ValueType::MeanStep, 0, days, values}), ElementsAre(Pair(4, 6)));
  values[4] = values[5] = 1;
  // Days that are left out, where nearly all steps are a day.
  days.erase(days.begin() + 10, days.begin() + 13);
  values.erase(values.begin() + 10, values.begin() + 13);
  EXPECT_THAT(gapsOf({ValueType::MeanStep, 0, days, values}), ElementsAre(Pair(10, 13)));
  // Steps of many lengths have none.
  EXPECT_THAT(gapsOf({ValueType::MeanStep, 0, {1, 3, 4, 9, 20}, {1, 1, 1, 1, 1}}), IsEmpty());
}

TEST(SeriesTotals, AreAmountsOfRatesAndMeansOfStates) {
  const struct {
    int itemType;
    ValueType type;
    const char* unit;
    double value;  ///< Of 2 in the base unit over ten days; a sum over the steps that comes to 2.
  } rows[] = {
      {100431, ValueType::MeanStep, "mm", 20},        {100431, ValueType::Instantaneous, "mm", 20},
      {100004, ValueType::StepAccumulated, "mm", 2},  {100001, ValueType::MeanStep, "m³", 2 * 864000.0},
      {100006, ValueType::Instantaneous, "°C", 2},    {100274, ValueType::MeanStep, "m/s", 2},
      {100453, ValueType::MeanStep, "kg", 2 * 864.0}, {100383, ValueType::Instantaneous, "-", 2},
  };
  for (const auto& row : rows) {
    const TotalForm form = TotalFormOf(row.itemType, row.type);
    EXPECT_EQ(form.unit, row.unit) << row.itemType;
    const double integral = row.type == ValueType::StepAccumulated ? 2 : 2 * 10 * static_cast<double>(kDay);
    EXPECT_NEAR(form.Of({integral, 10 * kDay}), row.value, 1e-9 * row.value) << row.itemType;
    EXPECT_TRUE(std::isnan(form.Of({0, 0})));
  }
}

}  // namespace
}  // namespace tervane::series_totals_test
