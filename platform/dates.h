// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Dates of a simulation: a moment of the proleptic Gregorian calendar with a resolution of one second, without zone.
#pragma once

#include <array>
#include <compare>
#include <cstdint>
#include <string>
#include <string_view>

namespace tervane {

/// A length of time in whole seconds.
struct CYbDateTimeSpan {
  std::int64_t seconds = 0;

  /// A span of days, rounded to the nearest second.
  static CYbDateTimeSpan Days(double days);
  double InDays() const { return static_cast<double>(seconds) / 86400.0; }
  auto operator<=>(const CYbDateTimeSpan&) const = default;
};

/// A date and time. It keeps the numbers that it was given, also when they name no date (month 13), so that a file's
/// text survives; such a date is not valid (valid are the years 1 to 9999), formats as "Invalid DateTime." and sorts
/// before every valid one.
class CYbDateTime {
 public:
  /// Year 0, month 0, day 0: not valid.
  CYbDateTime() = default;
  CYbDateTime(int year, int month, int day, int hour = 0, int minute = 0, int second = 0)
      : fields_{year, month, day, hour, minute, second} {}

  /// Reads a text by a format of %Y %m %d %H %M %S and literal characters; blanks in front, fewer digits and more or
  /// fewer blanks between are fine, and further text that the format does not cover is ignored. What cannot be read
  /// gives a date that is not valid.
  static CYbDateTime Parse(std::string_view text, std::string_view format);

  bool IsValid() const;
  int Year() const { return fields_[0]; }
  int Month() const { return fields_[1]; }
  int Day() const { return fields_[2]; }
  int Hour() const { return fields_[3]; }
  int Minute() const { return fields_[4]; }
  int Second() const { return fields_[5]; }

  /// The date by a format of %Y %m %d %H %M %S and literal characters, or "Invalid DateTime.".
  std::string Format(std::string_view format) const;

  /// Seconds since 1970-01-01 00:00; only of a valid date.
  std::int64_t SecondsSinceEpoch() const;
  static CYbDateTime FromSecondsSinceEpoch(std::int64_t seconds);

  /// A date that is not valid stays as it is; the difference to one is 0. A sum outside the years 1 to 9999 is not
  /// valid.
  CYbDateTime operator+(CYbDateTimeSpan span) const;
  CYbDateTimeSpan operator-(const CYbDateTime& other) const;
  std::weak_ordering operator<=>(const CYbDateTime& other) const;
  bool operator==(const CYbDateTime& other) const { return (*this <=> other) == 0; }

 private:
  std::array<int, 6> fields_{};
};

}  // namespace tervane
