// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/dates.h"

#include <cmath>

#include <fmt/format.h>

#include "platform/text.h"

namespace tervane {
namespace {

constexpr std::int64_t kSecondsPerDay = 86400;
/// 0001-01-01 00:00:00 and 9999-12-31 23:59:59, the first and the last valid moment.
constexpr std::int64_t kFirstSecond = -62135596800;
constexpr std::int64_t kLastSecond = 253402300799;
constexpr std::int64_t kDaysPer400Years = 146097;

bool IsLeapYear(int year) { return year % 4 == 0 && (year % 100 != 0 || year % 400 == 0); }

int DaysInMonth(int year, int month) {
  constexpr std::array<int, 12> kDays{31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
  return month == 2 && IsLeapYear(year) ? 29 : kDays[static_cast<std::size_t>(month - 1)];
}

/// Days since 1970-01-01. The year is counted from March, so that the leap day is its last.
std::int64_t DaysSinceEpoch(int year, int month, int day) {
  const std::int64_t marchYear = month <= 2 ? year - 1 : year;
  const std::int64_t era = marchYear / 400;  // years are positive
  const std::int64_t yearOfEra = marchYear % 400;
  const std::int64_t dayOfYear = (153 * ((month + 9) % 12) + 2) / 5 + day - 1;
  const std::int64_t dayOfEra = yearOfEra * 365 + yearOfEra / 4 - yearOfEra / 100 + dayOfYear;
  return era * kDaysPer400Years + dayOfEra - 719468;  // 719468: from 0000-03-01 to 1970-01-01
}

struct CalendarDay {
  int year;
  int month;
  int day;
};

CalendarDay DayFromDaysSinceEpoch(std::int64_t days) {
  days += 719468;
  const std::int64_t era = days / kDaysPer400Years;
  const std::int64_t dayOfEra = days % kDaysPer400Years;
  const std::int64_t yearOfEra = (dayOfEra - dayOfEra / 1460 + dayOfEra / 36524 - dayOfEra / 146096) / 365;
  const std::int64_t dayOfYear = dayOfEra - (365 * yearOfEra + yearOfEra / 4 - yearOfEra / 100);
  const std::int64_t marchMonth = (5 * dayOfYear + 2) / 153;
  const std::int64_t month = marchMonth < 10 ? marchMonth + 3 : marchMonth - 9;
  return {static_cast<int>(era * 400 + yearOfEra + (month <= 2 ? 1 : 0)), static_cast<int>(month),
          static_cast<int>(dayOfYear - (153 * marchMonth + 2) / 5 + 1)};
}

/// Which of the six fields a letter behind `%` means, or -1.
int FieldOf(char letter) {
  const std::size_t place = std::string_view("YmdHMS").find(letter);
  return place == std::string_view::npos ? -1 : static_cast<int>(place);
}

bool IsBlank(char c) { return c == ' ' || c == '\t'; }
void SkipBlanks(std::string_view& text) {
  while (!text.empty() && IsBlank(text.front())) text.remove_prefix(1);
}

/// Takes a number of at most `maxDigits` digits from the text's start.
bool TakeNumber(std::string_view& text, int maxDigits, int& number) {
  int digits = 0;
  for (number = 0; digits < maxDigits && !text.empty() && IsDigit(text.front()); ++digits) {
    number = number * 10 + (text.front() - '0');
    text.remove_prefix(1);
  }
  return digits > 0;
}

}  // namespace

CYbDateTimeSpan CYbDateTimeSpan::Days(double days) {
  // Longer than every calendar, and far from the end of the integer.
  constexpr double kMost = 1e15;
  const double seconds = days * static_cast<double>(kSecondsPerDay);
  if (std::isnan(seconds)) return {};
  return {std::llround(std::fmax(-kMost, std::fmin(kMost, seconds)))};
}

CYbDateTime CYbDateTime::Parse(std::string_view text, std::string_view format) {
  CYbDateTime date;
  SkipBlanks(text);
  for (std::size_t i = 0; i < format.size(); ++i) {
    const int field = format[i] == '%' && i + 1 < format.size() ? FieldOf(format[i + 1]) : -1;
    if (field >= 0) {
      ++i;
      if (!TakeNumber(text, field == 0 ? 4 : 2, date.fields_[static_cast<std::size_t>(field)])) return {};
    } else if (IsBlank(format[i])) {
      SkipBlanks(text);
    } else if (!text.empty() && text.front() == format[i]) {
      text.remove_prefix(1);
    } else {
      return {};
    }
  }
  return date;
}

bool CYbDateTime::IsValid() const {
  const auto within = [](int value, int low, int high) { return value >= low && value <= high; };
  return within(Year(), 1, 9999) && within(Month(), 1, 12) && within(Day(), 1, DaysInMonth(Year(), Month())) &&
         within(Hour(), 0, 23) && within(Minute(), 0, 59) && within(Second(), 0, 59);
}

std::string CYbDateTime::Format(std::string_view format) const {
  if (!IsValid()) return "Invalid DateTime.";
  std::string text;
  for (std::size_t i = 0; i < format.size(); ++i) {
    const int field = format[i] == '%' && i + 1 < format.size() ? FieldOf(format[i + 1]) : -1;
    if (field < 0) {
      text += format[i];
      continue;
    }
    ++i;
    text += fmt::format("{:0{}}", fields_[static_cast<std::size_t>(field)], field == 0 ? 4 : 2);
  }
  return text;
}

std::int64_t CYbDateTime::SecondsSinceEpoch() const {
  return DaysSinceEpoch(Year(), Month(), Day()) * kSecondsPerDay + Hour() * 3600 + Minute() * 60 + Second();
}

CYbDateTime CYbDateTime::FromSecondsSinceEpoch(std::int64_t seconds) {
  if (seconds < kFirstSecond || seconds > kLastSecond) return {};
  std::int64_t days = seconds / kSecondsPerDay;
  std::int64_t rest = seconds % kSecondsPerDay;
  if (rest < 0) {
    rest += kSecondsPerDay;
    --days;
  }
  const CalendarDay date = DayFromDaysSinceEpoch(days);
  const int second = static_cast<int>(rest);
  return {date.year, date.month, date.day, second / 3600, second / 60 % 60, second % 60};
}

CYbDateTime CYbDateTime::operator+(CYbDateTimeSpan span) const {
  if (!IsValid()) return *this;
  constexpr std::int64_t kWholeCalendar = kLastSecond - kFirstSecond;
  if (span.seconds > kWholeCalendar || span.seconds < -kWholeCalendar) return {};
  return FromSecondsSinceEpoch(SecondsSinceEpoch() + span.seconds);
}

CYbDateTimeSpan CYbDateTime::operator-(const CYbDateTime& other) const {
  if (!IsValid() || !other.IsValid()) return {};
  return {SecondsSinceEpoch() - other.SecondsSinceEpoch()};
}

std::weak_ordering CYbDateTime::operator<=>(const CYbDateTime& other) const {
  if (const auto order = IsValid() <=> other.IsValid(); order != 0) return order;
  return fields_ <=> other.fields_;
}

}  // namespace tervane
