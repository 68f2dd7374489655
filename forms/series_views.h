// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Other ways to look at a series of a chart.
#pragma once

#include "forms/plots.h"

namespace tervane {

/// How a chart shows its series.
enum class SeriesView {
  AsGiven,
  Cumulated,  ///< Sums from the first value on: of a rate over the time for which it holds, else of the values.
  Monthly,    ///< A value for each month: the mean of what is there, or the sum of amounts.
};

/// The series in that way. One over numbers stays as it is. A gap adds nothing to a sum, and a month without any value
/// is a gap.
Series ViewOf(const Series& series, SeriesView view);

/// The stretches of time in which a series has no values, from the last time with a value to the next one with one;
/// at most `most` of them.
std::vector<std::pair<CYbDateTime, CYbDateTime>> GapsOf(const Series& series, std::size_t most);

}  // namespace tervane
