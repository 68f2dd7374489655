// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Times of data files, as the CF conventions tell them: "days since 2000-01-01", section 4.4 of
// https://cfconventions.org/Data/cf-conventions/cf-conventions-1.8/cf-conventions.html.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace tervane {

/// How the numbers of a time variable mean moments.
struct CfTimeUnits {
  double secondsPerUnit = 1;
  /// Seconds from 1970-01-01 00:00 of the proleptic Gregorian calendar.
  double epoch = 0;
  std::string error;  ///< Why the units cannot be read; empty when they can.

  /// Rounded to the nearest second; nothing outside the years 1 to 9999.
  std::optional<std::int64_t> SecondsSinceEpoch(double value) const;
};

/// True for units that tell of moments, whether or not they can be read.
bool AreTimeUnits(std::string_view units);

/// Reads "UNIT since DATE [TIME] [ZONE]" with units from milliseconds to weeks. An empty calendar is the standard one,
/// in which dates before 1582-10-15 are of the Julian calendar. Calendars of other days than ours are refused.
CfTimeUnits ParseCfTimeUnits(std::string_view units, std::string_view calendar);

}  // namespace tervane
