// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "forms/series_views.h"

#include <cmath>

#include <gmock/gmock.h>

namespace tervane::series_views_test {
namespace {

using testing::DoubleNear;
using testing::ElementsAre;
using testing::NanSensitiveDoubleEq;

const double kNothing = std::nan("");

/// Daily values, stamped at the ends of the days from the first of January on.
Series Daily(std::string unit, bool isStepped, std::vector<double> values) {
  Series series{"Rain", std::move(unit), {}, std::move(values), isStepped};
  for (std::size_t i = 0; i < series.values.size(); ++i)
    series.times.push_back(CYbDateTime(2001, 1, 2) + CYbDateTimeSpan::Days(static_cast<double>(i)));
  return series;
}

TEST(SeriesViews, RatesAreSummedOverTheTimeForWhichTheyHold) {
  const struct {
    const char *unit, *sumUnit;
    double last;
  } cases[] = {{"mm/day", "mm", 6}, {"mm/h", "mm", 144}, {"m³/s", "m³", 518400}, {"mm", "mm", 6}};
  for (const auto& c : cases) {
    SCOPED_TRACE(c.unit);
    const Series sums = ViewOf(Daily(c.unit, true, {1, kNothing, 2, 3}), SeriesView::Cumulated);
    EXPECT_EQ(sums.unit, c.sumUnit);
    EXPECT_EQ(sums.values[1], sums.values[0]) << "a gap adds nothing";
    EXPECT_THAT(sums.values.back(), DoubleNear(c.last, 1e-9));
  }
}

TEST(SeriesViews, AMonthHasTheMeanOfRatesAndTheSumOfAmounts) {
  std::vector<double> values(31 + 28 + 31, 2);
  for (int day = 31; day < 59; ++day) values[static_cast<std::size_t>(day)] = kNothing;
  values[59] = 33;
  const Series rates = ViewOf(Daily("mm/day", true, values), SeriesView::Monthly);
  EXPECT_THAT(rates.times, ElementsAre(CYbDateTime(2001, 1, 1), CYbDateTime(2001, 2, 1), CYbDateTime(2001, 3, 1),
                                       CYbDateTime(2001, 4, 1)));
  EXPECT_THAT(rates.values, ElementsAre(NanSensitiveDoubleEq(kNothing), 2, NanSensitiveDoubleEq(kNothing), 3));
  const Series amounts = ViewOf(Daily("mm", true, values), SeriesView::Monthly);
  EXPECT_THAT(amounts.values, ElementsAre(NanSensitiveDoubleEq(kNothing), 62, NanSensitiveDoubleEq(kNothing), 93));
  EXPECT_THAT(ViewOf({}, SeriesView::Monthly).values, ElementsAre());
}

TEST(SeriesViews, GapsReachFromValueToValue) {
  const Series series = Daily("mm", true, {kNothing, 1, kNothing, kNothing, 2, 3, kNothing, 4, kNothing});
  EXPECT_THAT(GapsOf(series, 9),
              ElementsAre(std::pair(series.times[1], series.times[4]), std::pair(series.times[5], series.times[7])));
  EXPECT_EQ(GapsOf(series, 1).size(), 1U);
}

}  // namespace
}  // namespace tervane::series_views_test
