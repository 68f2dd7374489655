// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/cf_time.h"

#include <charconv>
#include <cmath>
#include <vector>

#include <fmt/format.h>

#include "platform/dates.h"
#include "platform/text.h"
#include "platform/text_fields.h"

namespace tervane {

namespace {

constexpr std::string_view kSince = " since ";

struct TimeUnit {
  std::string_view names;  ///< Separated by blanks, with one at both ends.
  double seconds;
};
// Months and years have no fixed length: they are not among these.
constexpr TimeUnit kTimeUnits[] = {
    {" milliseconds millisecond millisec millisecs msecs msec ms ", 0.001},
    {" seconds second sec secs s ", 1},
    {" minutes minute min mins ", 60},
    {" hours hour hr hrs h ", 3600},
    {" days day d ", 86400},
    {" weeks week ", 604800},
};

/// Takes the text apart, number by number.
class Scanner {
 public:
  explicit Scanner(std::string_view text) : rest_(text) {}

  std::optional<double> Number() {
    double number = 0;
    const auto [end, error] = std::from_chars(rest_.data(), rest_.data() + rest_.size(), number);
    if (error != std::errc() || rest_.starts_with('-') || !std::isfinite(number)) return std::nullopt;
    rest_.remove_prefix(static_cast<std::size_t>(end - rest_.data()));
    return number;
  }
  std::optional<int> Whole() {
    int number = 0;
    const auto [end, error] = std::from_chars(rest_.data(), rest_.data() + rest_.size(), number);
    if (error != std::errc() || rest_.starts_with('-')) return std::nullopt;
    rest_.remove_prefix(static_cast<std::size_t>(end - rest_.data()));
    return number;
  }
  bool Take(char c) {
    if (!rest_.starts_with(c)) return false;
    rest_.remove_prefix(1);
    return true;
  }
  void SkipBlanks() {
    while (Take(' ')) continue;
  }
  std::string_view Rest() const { return Trimmed(rest_); }

 private:
  std::string_view rest_;
};

/// Days from 1970-01-01 of the Gregorian calendar to a date of the Julian one, by the Julian day number (Explanatory
/// Supplement to the Astronomical Almanac, section 15.11).
std::int64_t DaysOfJulianDate(int year, int month, int day) {
  const std::int64_t beforeMarch = (14 - month) / 12;
  const std::int64_t y = year + 4800 - beforeMarch;
  const std::int64_t m = month + 12 * beforeMarch - 3;
  return day + (153 * m + 2) / 5 + 365 * y + y / 4 - 32083 - 2440588;
}

/// Seconds of a zone such as "Z", "UTC", "+02:00", "-0530", "+1"; nothing when it is none.
std::optional<double> ZoneOffset(std::string_view zone) {
  if (zone.empty() || zone == "Z" || zone == "UTC" || zone == "GMT") return 0;
  if (zone.starts_with("UTC")) zone = Trimmed(zone.substr(3));
  const double sign = zone.starts_with('-') ? -1 : 1;
  Scanner scanner(zone.substr(zone.starts_with('-') || zone.starts_with('+') ? 1 : 0));
  const std::optional<int> first = scanner.Whole();
  if (!first) return std::nullopt;
  int hours = *first, minutes = 0;
  if (scanner.Take(':')) {
    minutes = scanner.Whole().value_or(60);
  } else if (hours >= 100) {
    minutes = hours % 100;
    hours /= 100;
  }
  if (!scanner.Rest().empty() || hours > 14 || minutes > 59) return std::nullopt;
  return sign * (hours * 3600 + minutes * 60);
}

/// Seconds of the moment that a text tells; nothing when it tells none.
std::optional<double> ParseMoment(std::string_view text, bool isMixed) {
  Scanner scanner(text);
  const std::optional<int> year = scanner.Whole();
  if (!year || !scanner.Take('-')) return std::nullopt;
  const std::optional<int> month = scanner.Whole();
  if (!month || !scanner.Take('-')) return std::nullopt;
  const std::optional<int> day = scanner.Whole();
  if (!day) return std::nullopt;
  double hour = 0, minute = 0, second = 0;
  const bool isT = scanner.Take('T');
  scanner.SkipBlanks();
  Scanner zone = scanner;
  if (const std::optional<int> first = scanner.Whole()) {
    hour = *first;
    if (scanner.Take(':')) {
      const std::optional<int> minutes = scanner.Whole();
      if (!minutes) return std::nullopt;
      minute = *minutes;
      if (scanner.Take(':')) {
        const std::optional<double> seconds = scanner.Number();
        if (!seconds) return std::nullopt;
        second = *seconds;
      }
    }
    zone = scanner;
  } else if (isT) {
    return std::nullopt;
  }
  const std::optional<double> offset = ZoneOffset(zone.Rest());
  if (!offset || hour > 24 || minute > 59 || second >= 61) return std::nullopt;
  if (*year < 1 || *month < 1 || *month > 12 || *day < 1 || *day > 31) return std::nullopt;

  const bool isJulian = isMixed && (*year < 1582 || (*year == 1582 && (*month < 10 || (*month == 10 && *day < 15))));
  const CYbDateTime date(*year, *month, *day);
  if (!isJulian && !date.IsValid()) return std::nullopt;
  const double days = isJulian ? static_cast<double>(DaysOfJulianDate(*year, *month, *day))
                               : static_cast<double>(date.SecondsSinceEpoch()) / 86400;
  return days * 86400 + hour * 3600 + minute * 60 + second - *offset;
}

}  // namespace

std::optional<std::int64_t> CfTimeUnits::SecondsSinceEpoch(double value) const {
  const double seconds = std::round(epoch + value * secondsPerUnit);
  constexpr double kFirst = -62135596800.0, kLast = 253402300799.0;  // The years 1 and 9999.
  if (!(seconds >= kFirst && seconds <= kLast)) return std::nullopt;
  return static_cast<std::int64_t>(seconds);
}

bool AreTimeUnits(std::string_view units) { return LowerCase(units).find(kSince) != std::string::npos; }

CfTimeUnits ParseCfTimeUnits(std::string_view units, std::string_view calendar) {
  CfTimeUnits result;
  const std::string kind = LowerCase(Trimmed(calendar));
  const bool isMixed = kind.empty() || kind == "standard" || kind == "gregorian";
  if (!isMixed && kind != "proleptic_gregorian") {
    result.error = fmt::format(
        "its times are of the calendar \"{}\", whose days are not those of real dates; convert the file to the "
        "standard calendar",
        Shown(calendar));
    return result;
  }
  const std::string lower = LowerCase(units);
  const std::size_t since = lower.find(kSince);
  result.error = fmt::format("its times have the units \"{}\"; units such as \"days since 2000-01-01\" were expected",
                             Shown(units));
  if (since == std::string::npos) return result;
  const std::string name = fmt::format(" {} ", Trimmed(std::string_view(lower).substr(0, since)));
  for (const TimeUnit& unit : kTimeUnits) {
    if (unit.names.find(name) == std::string_view::npos) continue;
    const std::optional<double> moment = ParseMoment(Trimmed(units.substr(since + kSince.size())), isMixed);
    if (!moment) return result;
    return {unit.seconds, *moment, {}};
  }
  if (name.find("month") != std::string::npos || name.find("year") != std::string::npos) {
    result.error = fmt::format(
        "its times have the units \"{}\", and a month or year has no fixed length; convert the times to days",
        Shown(units));
  }
  return result;
}

}  // namespace tervane
