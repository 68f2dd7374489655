// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// How well a simulated series agrees with an observed one.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <vector>

#include "data/datafile.h"

namespace tervane {

/// A series as statistics see it. Stamps ascend, in seconds since 1970-01-01; a value that is missing or no finite
/// number is a gap.
struct ComparedSeries {
  std::span<const std::int64_t> stamps;
  std::span<const float> values;  ///< As many.
  ValueType valueType = ValueType::Instantaneous;
  std::optional<std::int64_t> begin;  ///< Of the first interval; a step before the first stamp when nothing is said.
};

/// An observed value and what was simulated at its time.
struct ComparedPair {
  std::int64_t time = 0;
  double observed = 0, simulated = 0;

  bool operator==(const ComparedPair&) const = default;
};

/// Pairs at the times of the observed values, from the start of a period to its end, both included. A simulated mean is
/// that of the interval which contains the time; between other values it is linear. A gap on either side gives no pair.
std::vector<ComparedPair> PairsOf(const ComparedSeries& simulated, const ComparedSeries& observed, std::int64_t start,
                                  std::int64_t end);

/// The figures over n pairs of observed values o and simulated ones s, with residuals e = o - s. Fewer than two pairs
/// have none; a figure that divides by what is 0 is left out.
struct RunStatistics {
  std::size_t pairs = 0;
  std::optional<double> meanError;            ///< ME: sum(e) / n. Above 0 where the model is too low.
  std::optional<double> meanAbsoluteError;    ///< MAE: sum(|e|) / n.
  std::optional<double> rootMeanSquareError;  ///< RMSE: sqrt(sum(e^2) / n).
  std::optional<double> residualDeviation;    ///< STDres: sqrt(sum((e - ME)^2) / (n - 1)).
  /// R: the correlation coefficient of K. Pearson (1896), Philosophical Transactions of the Royal Society A 187,
  /// 253-318: sum((o - mean o)(s - mean s)) / sqrt(sum((o - mean o)^2) sum((s - mean s)^2)).
  std::optional<double> correlation;
  /// R2: the efficiency of J. E. Nash and J. V. Sutcliffe (1970), Journal of Hydrology 10, 282-290:
  /// 1 - sum(e^2) / sum((o - mean o)^2).
  std::optional<double> nashSutcliffe;
  /// The efficiency of H. V. Gupta, H. Kling, K. K. Yilmaz and G. F. Martinez (2009), Journal of Hydrology 377, 80-91:
  /// 1 - sqrt((R - 1)^2 + (sd s / sd o - 1)^2 + (mean s / mean o - 1)^2).
  std::optional<double> klingGupta;
  /// Percent bias of H. V. Gupta, S. Sorooshian and P. O. Yapo (1999), Journal of Hydrologic Engineering 4, 135-143:
  /// 100 sum(e) / sum(o). Above 0 where the model is too low.
  std::optional<double> percentBias;
};

RunStatistics StatisticsOf(std::span<const ComparedPair> pairs);

/// Values from the largest to the smallest, each with the percentage of time in which it is reached or exceeded, by the
/// plotting position of W. Weibull (1939): 100 rank / (n + 1).
struct DurationCurve {
  std::vector<double> percent, values;
};
DurationCurve DurationCurveOf(std::vector<double> values);

}  // namespace tervane
