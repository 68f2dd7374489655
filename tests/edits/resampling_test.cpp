// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "edits/resampling.h"

#include <gmock/gmock.h>

namespace tervane::resampling_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;

constexpr std::int64_t kHour = 3600, kDay = 24 * kHour;
constexpr float kNo = kDeleteValue;

std::int64_t At(int month, int day, int hour = 0) { return CYbDateTime(2001, month, day, hour).SecondsSinceEpoch(); }

TEST(Resampling, EachValueTypeHasItsOwnWay) {
  // Six hours each, from 2001-01-01 00:00.
  SeriesRows rows;
  for (int i = 1; i <= 8; ++i) rows.stamps.push_back(At(1, 1) + 6 * i * kHour);
  rows.begin = At(1, 1);
  const std::vector<float> values{1, 2, 3, 4, 5, 6, 7, 8};
  struct Row {
    ValueType type;
    std::int64_t step;
    std::vector<float> expected;
  };
  const Row table[] = {
      {ValueType::MeanStep, 12 * kHour, {1.5, 3.5, 5.5, 7.5}},
      {ValueType::StepAccumulated, 12 * kHour, {3, 7, 11, 15}},
      {ValueType::Instantaneous, 12 * kHour, {2, 4, 6, 8}},
      {ValueType::Accumulated, 12 * kHour, {2, 4, 6, 8}},
      {ValueType::MeanStep, 3 * kHour, {1, 1, 2, 2, 3, 3, 4, 4, 5, 5, 6, 6, 7, 7, 8, 8}},
      {ValueType::StepAccumulated, 3 * kHour, {.5, .5, 1, 1, 1.5, 1.5, 2, 2, 2.5, 2.5, 3, 3, 3.5, 3.5, 4, 4}},
      {ValueType::Instantaneous, 3 * kHour, {1, 1.5, 2, 2.5, 3, 3.5, 4, 4.5, 5, 5.5, 6, 6.5, 7, 7.5, 8}},
      // A step that the old ones do not divide takes each by its share.
      {ValueType::MeanStep, 8 * kHour, {1.25, 2.5, 3.75, 5.25, 6.5, 7.75}},
  };
  for (const Row& row : table) {
    SCOPED_TRACE(testing::Message() << static_cast<int>(row.type) << " " << row.step);
    rows.values = {values};
    SeriesRows made;
    ASSERT_EQ(Resample(rows, {row.type}, {row.step, 0}, made), "");
    ASSERT_EQ(made.values[0].size(), row.expected.size());
    for (std::size_t i = 0; i < row.expected.size(); ++i) EXPECT_NEAR(made.values[0][i], row.expected[i], 1e-6) << i;
    EXPECT_EQ(made.stamps.back(), At(1, 3));
  }
}

TEST(Resampling, AStepWithAMissingPartIsMissing) {
  const SeriesRows rows{{At(1, 1, 12), At(1, 2), At(1, 2, 12), At(1, 3), At(1, 3, 12)}, {{1, kNo, 3, 5, 7}}, {}};
  SeriesRows made;
  ASSERT_EQ(Resample(rows, {ValueType::MeanStep}, {kDay, 0}, made), "");
  // The first day has no value, and of the last one half is not there.
  EXPECT_EQ(made.stamps, std::vector{At(1, 3)});
  EXPECT_THAT(made.values[0], ElementsAre(4));
  EXPECT_EQ(made.begin, At(1, 2));
  EXPECT_THAT(Resample(rows, {ValueType::MeanStep}, {100 * kDay, 0}, made), HasSubstr("no whole step"));
  EXPECT_THAT(Resample(rows, {ValueType::MeanStep}, {0, 0}, made), HasSubstr("above 0"));
  EXPECT_THAT(Resample({{At(1, 1)}, {{1}}, {}}, {ValueType::MeanStep}, {kDay, 0}, made), HasSubstr("how long"));
  SeriesRows wide{{At(1, 1), At(1, 1) + 2'000'000'000}, {{1, 2}}, {}};
  EXPECT_THAT(Resample(wide, {ValueType::Instantaneous}, {1, 0}, made), HasSubstr("longer step"));
}

TEST(Resampling, MonthsAreThoseOfTheCalendar) {
  SeriesRows rows;
  rows.begin = At(1, 1);
  rows.values.resize(1);
  for (int day = 1; day <= 90; ++day) {
    rows.stamps.push_back(At(1, 1) + day * kDay);
    rows.values[0].push_back(1);
  }
  SeriesRows made;
  ASSERT_EQ(Resample(rows, {ValueType::StepAccumulated}, {0, 1}, made), "");
  EXPECT_THAT(made.values[0], ElementsAre(31, 28, 31));
  EXPECT_EQ(made.stamps, (std::vector{At(2, 1), At(3, 1), At(4, 1)}));
  EXPECT_EQ(MonthsLater(At(1, 31, 5), 1), At(2, 28, 5));
  EXPECT_EQ(MonthsLater(At(3, 31), -1), At(2, 28));
  EXPECT_EQ(MonthsLater(At(3, 1), 12), CYbDateTime(2002, 3, 1).SecondsSinceEpoch());
}

}  // namespace
}  // namespace tervane::resampling_test
