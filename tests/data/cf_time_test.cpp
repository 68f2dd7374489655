// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/cf_time.h"

#include <gmock/gmock.h>

#include "platform/dates.h"

namespace tervane::cf_time_test {
namespace {

TEST(CfTime, NumbersMeanMoments) {
  struct Row {
    const char* units;
    const char* calendar;
    double value;
    const char* moment;
  };
  constexpr Row kRows[] = {
      {"days since 2000-01-01", "", 59, "2000-02-29 00:00:00"},
      {"days since 1900-01-01", "standard", 59, "1900-03-01 00:00:00"},
      {"Hours Since 1999-12-31 12:00:00.0", "gregorian", 12.5, "2000-01-01 00:30:00"},
      {"seconds since 1970-01-01T00:00:00Z", "proleptic_gregorian", -1, "1969-12-31 23:59:59"},
      {"minutes since 2000-01-01 06:00 +02:00", "", 0, "2000-01-01 04:00:00"},
      {"minutes since 2000-01-01 06:00:00 -0530", "", 0, "2000-01-01 11:30:00"},
      {"h since 2000-1-1 3:4:5", "", 1, "2000-01-01 04:04:05"},
      {"msecs since 2000-01-01", "", 1499.6, "2000-01-01 00:00:01"},
      {"weeks since 2000-01-01", "", 2, "2000-01-15 00:00:00"},
      // 0.1 day is 8640 s, though no double is 0.1.
      {"days since 1850-01-01", "", 54786.1, "2000-01-01 02:24:00"},
      // The day before 1582-10-15 was the 4th; year 1 began two days earlier in the Julian calendar.
      {"days since 1582-10-04", "standard", 1, "1582-10-15 00:00:00"},
      {"hours since 1-1-1 00:00:00", "", 17522904, "2000-01-01 00:00:00"},
      {"hours since 1-1-1 00:00:00", "proleptic_gregorian", 17522904, "2000-01-03 00:00:00"},
      {"days since 1500-02-29", "", 182612, "2000-02-29 00:00:00"},
  };
  for (const Row& row : kRows) {
    const CfTimeUnits units = ParseCfTimeUnits(row.units, row.calendar);
    ASSERT_EQ(units.error, "") << row.units;
    const auto seconds = units.SecondsSinceEpoch(row.value);
    ASSERT_TRUE(seconds) << row.units;
    EXPECT_EQ(CYbDateTime::FromSecondsSinceEpoch(*seconds).Format("%Y-%m-%d %H:%M:%S"), row.moment) << row.units;
  }
}

TEST(CfTime, WhatTellsNoMomentsIsRefusedWithAReason) {
  struct Row {
    const char* units;
    const char* calendar;
    const char* reason;
  };
  constexpr Row kRows[] = {
      {"days since 2000-01-01", "360_day", "calendar \"360_day\""},
      {"days since 2000-01-01", "noleap", "calendar \"noleap\""},
      {"days since 2000-01-01", "julian", "calendar \"julian\""},
      {"months since 2000-01-01", "", "no fixed length"},
      {"days", "", "\"days since 2000-01-01\" were expected"},
      {"fortnights since 2000-01-01", "", "were expected"},
      {"days since 2001-02-29", "", "were expected"},
      {"days since 2000-13-01", "", "were expected"},
      {"days since 0000-01-01", "", "were expected"},
      {"days since yesterday", "", "were expected"},
      {"days since 2000-01-01 12:61", "", "were expected"},
      {"days since 2000-01-01 12:00 XYZ", "", "were expected"},
      {"days since 2000-01-01T", "", "were expected"},
      {"", "", "were expected"},
  };
  for (const Row& row : kRows)
    EXPECT_THAT(ParseCfTimeUnits(row.units, row.calendar).error, testing::HasSubstr(row.reason)) << row.units;
  const CfTimeUnits units = ParseCfTimeUnits("days since 2000-01-01", "");
  for (const double value : {1e300, -1e9, 3e6, std::numeric_limits<double>::quiet_NaN()})
    EXPECT_FALSE(units.SecondsSinceEpoch(value)) << value;
}

}  // namespace
}  // namespace tervane::cf_time_test
