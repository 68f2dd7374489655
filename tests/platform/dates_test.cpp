// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/dates.h"

#include <cstdint>
#include <iterator>
#include <limits>
#include <span>

#include <gmock/gmock.h>

namespace tervane::dates_test {
namespace {

constexpr const char* kFull = "%Y/%m/%d %H:%M:%S";

TEST(Dates, OnlyDaysOfTheCalendarAreValid) {
  const CYbDateTime valid[] = {{2000, 2, 29}, {2024, 2, 29}, {1, 1, 1}, {9999, 12, 31, 23, 59, 59}};
  for (const CYbDateTime& date : valid) EXPECT_TRUE(date.IsValid()) << date.Format(kFull);
  const CYbDateTime days[] = {{1900, 2, 29}, {2023, 2, 29}, {2023, 4, 31}, {2023, 13, 1}, {2023, 0, 1},
                              {2023, 1, 0},  {0, 1, 1},     {10000, 1, 1}, {-4, 1, 1}};
  const CYbDateTime times[] = {{}, {2023, 1, 1, 24}, {2023, 1, 1, 0, 60}, {2023, 1, 1, 0, 0, 60}, {2023, 1, 1, -1}};
  for (const auto& invalid : {std::span<const CYbDateTime>(days), std::span<const CYbDateTime>(times)})
    for (const CYbDateTime& date : invalid) {
      EXPECT_FALSE(date.IsValid()) << date.Year() << '-' << date.Month() << '-' << date.Day();
      EXPECT_EQ(date.Format(kFull), "Invalid DateTime.");
    }
  // It keeps its numbers.
  const CYbDateTime date(2001, 13, 32, 25, 61, 62);
  EXPECT_EQ(date.Second(), 62);
  EXPECT_EQ((date + CYbDateTimeSpan{1}).Month(), 13);
}

TEST(Dates, TextIsReadByItsFormat) {
  struct Case {
    const char *text, *format, *expected;
  };
  const Case cases[] = {{"2000/01/02 03:04:05", kFull, "2000/01/02 03:04:05"},
                        {"  2000/1/2 3:4:5 ", kFull, "2000/01/02 03:04:05"},
                        {"2000/01/02\t  03:04:05", kFull, "2000/01/02 03:04:05"},
                        {"2000/01/01 06:00:00", "%Y/%m/%d %H:%M", "2000/01/01 06:00:00"},
                        {"20000102030405", "%Y%m%d%H%M%S", "2000/01/02 03:04:05"},
                        {"2.1.800 at 7", "%d.%m.%Y at %H", "0800/01/02 07:00:00"}};
  for (const Case& c : cases) EXPECT_EQ(CYbDateTime::Parse(c.text, c.format).Format(kFull), c.expected) << c.text;
  for (const char* text : {"", "yesterday", "2000-01-02 03:04:05", "2000/01/02", "2000/01/02 03:04",
                           "-200/01/02 03:04:05", "12000/01/02 03:04:05", "2000/02/30 00:00:00"})
    EXPECT_FALSE(CYbDateTime::Parse(text, kFull).IsValid()) << text;
  EXPECT_FALSE(CYbDateTime::Parse("100%", "%Y%").IsValid());  // No month and day.
  EXPECT_EQ(CYbDateTime::Parse("2000/02/30 00:00:00", kFull).Day(), 30);
}

TEST(Dates, FormatsMayLeaveOutAndRepeatFields) {
  const CYbDateTime date(33, 4, 5, 6, 7, 8);
  EXPECT_EQ(date.Format("%d.%m.%Y"), "05.04.0033");
  EXPECT_EQ(date.Format("%H%H %q 100%"), "0606 %q 100%");
}

TEST(Dates, SecondsCountFrom1970) {
  const std::pair<CYbDateTime, std::int64_t> cases[] = {{{1970, 1, 1}, 0},
                                                        {{1969, 12, 31, 23, 59, 59}, -1},
                                                        {{2000, 2, 29, 12, 0, 0}, 951825600},
                                                        {{2038, 1, 19, 3, 14, 8}, 2147483648},
                                                        {{9999, 12, 31, 23, 59, 59}, 253402300799}};
  for (const auto& [date, seconds] : cases) {
    EXPECT_EQ(date.SecondsSinceEpoch(), seconds);
    EXPECT_EQ(CYbDateTime::FromSecondsSinceEpoch(seconds).Format(kFull), date.Format(kFull));
  }
  // Every day of the calendar has its number.
  std::int64_t seconds = CYbDateTime(1, 1, 1).SecondsSinceEpoch();
  int year = 1;
  for (CYbDateTime day(1, 1, 1), next; day.IsValid(); day = next) {
    ASSERT_EQ(day.SecondsSinceEpoch(), seconds) << day.Format(kFull);
    next = CYbDateTime::FromSecondsSinceEpoch(seconds += 86400);
    const bool isNextDay = next.Day() == day.Day() + 1 && next.Month() == day.Month();
    ASSERT_TRUE(isNextDay || next.Day() == 1 || !next.IsValid()) << day.Format(kFull);
    year = day.Year();
  }
  EXPECT_EQ(year, 9999);
}

TEST(Dates, SpansAreAddedAndTaken) {
  const CYbDateTime start(2000, 2, 28, 18);
  EXPECT_EQ((start + CYbDateTimeSpan::Days(1.5)).Format(kFull), "2000/03/01 06:00:00");
  EXPECT_EQ((start + CYbDateTimeSpan{-1}).Format(kFull), "2000/02/28 17:59:59");
  EXPECT_EQ((CYbDateTime(2001, 2, 28, 18) - start).InDays(), 366);
  EXPECT_EQ((CYbDateTime() - start).seconds, 0);
  // Days are rounded to seconds.
  constexpr double kInfinite = std::numeric_limits<double>::infinity();
  EXPECT_EQ(CYbDateTimeSpan::Days(1.0 / 3).seconds, 28800);
  EXPECT_EQ(CYbDateTimeSpan::Days(-0.6 / 86400).seconds, -1);
  EXPECT_EQ(CYbDateTimeSpan::Days(std::numeric_limits<double>::quiet_NaN()).seconds, 0);
  // A sum outside the calendar is not valid.
  for (const CYbDateTimeSpan& span :
       {CYbDateTimeSpan{1}, CYbDateTimeSpan::Days(kInfinite), CYbDateTimeSpan::Days(-kInfinite),
        CYbDateTimeSpan{std::numeric_limits<std::int64_t>::min()}})
    EXPECT_FALSE((CYbDateTime(9999, 12, 31, 23, 59, 59) + span).IsValid()) << span.seconds;
}

TEST(Dates, ValidDatesSortByTimeBehindAllInvalidOnes) {
  const CYbDateTime inOrder[] = {{},           {1999, 13, 1},         {2005, 13, 1}, {1, 1, 1},
                                 {2000, 1, 1}, {2000, 1, 1, 0, 0, 1}, {2000, 2, 1},  {2001, 1, 1}};
  for (std::size_t a = 0; a < std::size(inOrder); ++a) {
    for (std::size_t b = 0; b < std::size(inOrder); ++b) {
      EXPECT_EQ(inOrder[a] < inOrder[b], a < b) << a << ' ' << b;
      EXPECT_EQ(inOrder[a] == inOrder[b], a == b) << a << ' ' << b;
    }
  }
}

}  // namespace
}  // namespace tervane::dates_test
