// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "access/ole_date.h"

#include <cmath>

namespace tervane {

namespace {

constexpr double kSecondsOfDay = 86400;
const CYbDateTime kOleOrigin(1899, 12, 30);

}  // namespace

double OleDateOf(const CYbDateTime& date) {
  const auto seconds = static_cast<double>(date.SecondsSinceEpoch() - kOleOrigin.SecondsSinceEpoch());
  const double days = std::floor(seconds / kSecondsOfDay), time = seconds / kSecondsOfDay - days;
  return days < 0 ? days - time : days + time;
}

CYbDateTime FromOleDate(double days) {
  constexpr double kFar = 4e6;  // more than the days of ten thousand years
  if (!(std::abs(days) < kFar)) return {};
  const double whole = std::trunc(days), time = std::abs(days - whole);
  const double seconds = std::round((whole + time) * kSecondsOfDay);
  return CYbDateTime::FromSecondsSinceEpoch(kOleOrigin.SecondsSinceEpoch() + static_cast<std::int64_t>(seconds));
}

}  // namespace tervane
