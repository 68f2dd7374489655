// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Series brought to equal steps.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "data/datafile.h"

namespace tervane {

/// Series over one axis of times, in seconds since 1970-01-01. Missing values are kDeleteValue.
struct SeriesRows {
  std::vector<std::int64_t> stamps;
  std::vector<std::vector<float>> values;  ///< Of each series, as many as stamps.
  std::optional<std::int64_t> begin;       ///< Of the interval that ends with the first stamp.

  /// Where that interval begins, as long as the second one where nobody has told; nothing with a single stamp.
  std::optional<std::int64_t> Begin() const;
};

/// A whole number of seconds or of months. Steps divide the day, or begin at the first of a month;
/// those of several days count from the first day of the series.
struct ResamplingStep {
  std::int64_t seconds = 0;
  int months = 0;
};

/// Brings series to equal steps by their value types: means and sums of the steps that overlap, by their share; values
/// of a moment, and sums since the start, by straight lines between them. A step is missing where any part of it is.
/// "" or why not.
std::string Resample(const SeriesRows& rows, const std::vector<ValueType>& types, const ResamplingStep& step,
                     SeriesRows& resampled);

/// A date some months later; the last day of a month that is too short.
std::int64_t MonthsLater(std::int64_t stamp, int months);

}  // namespace tervane
