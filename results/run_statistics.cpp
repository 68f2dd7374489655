// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/run_statistics.h"

#include <algorithm>
#include <cmath>
#include <functional>

namespace tervane {

namespace {

bool IsGap(float value) { return !std::isfinite(value) || value == kDeleteValue; }

/// Whether a value stands for the interval that ends with its stamp.
bool HoldsOverInterval(ValueType type) { return type == ValueType::MeanStep || type == ValueType::StepAccumulated; }

/// Simulated values at times that mostly ascend.
class SimulatedAt {
 public:
  explicit SimulatedAt(const ComparedSeries& series)
      : series_(series), holdsOverInterval_(HoldsOverInterval(series.valueType)) {
    if (series.begin)
      begin_ = *series.begin;
    else if (series.stamps.size() > 1)
      begin_ = series.stamps[0] - (series.stamps[1] - series.stamps[0]);
    else if (!series.stamps.empty())
      begin_ = series.stamps[0] - 1;
  }

  std::optional<double> operator()(std::int64_t time) {
    const auto& stamps = series_.stamps;
    if (next_ > 0 && time <= stamps[next_ - 1])  // Times that fall.
      next_ = static_cast<std::size_t>(std::lower_bound(stamps.begin(), stamps.end(), time) - stamps.begin());
    while (next_ < stamps.size() && stamps[next_] < time) ++next_;
    if (next_ == stamps.size()) return std::nullopt;
    const float value = series_.values[next_];
    if (IsGap(value)) return std::nullopt;
    if (stamps[next_] == time) return value;
    if (holdsOverInterval_) {
      const std::int64_t from = next_ > 0 ? stamps[next_ - 1] : begin_;
      return time > from ? std::optional<double>(value) : std::nullopt;
    }
    if (next_ == 0 || IsGap(series_.values[next_ - 1])) return std::nullopt;
    const double before = series_.values[next_ - 1];
    const double part =
        static_cast<double>(time - stamps[next_ - 1]) / static_cast<double>(stamps[next_] - stamps[next_ - 1]);
    return before + (static_cast<double>(value) - before) * part;
  }

 private:
  const ComparedSeries& series_;
  bool holdsOverInterval_;
  std::int64_t begin_ = 0;
  std::size_t next_ = 0;  ///< The first stamp that is not before the latest time.
};

/// The quotient; nothing where it is no number.
std::optional<double> Quotient(double numerator, double denominator) {
  if (denominator == 0) return std::nullopt;
  const double quotient = numerator / denominator;
  return std::isfinite(quotient) ? std::optional(quotient) : std::nullopt;
}

}  // namespace

std::vector<ComparedPair> PairsOf(const ComparedSeries& simulated, const ComparedSeries& observed, std::int64_t start,
                                  std::int64_t end) {
  std::vector<ComparedPair> pairs;
  pairs.reserve(observed.stamps.size());
  SimulatedAt simulatedAt(simulated);
  for (std::size_t i = 0; i < observed.stamps.size(); ++i) {
    const std::int64_t time = observed.stamps[i];
    if (time < start || time > end || IsGap(observed.values[i])) continue;
    if (const auto value = simulatedAt(time)) pairs.push_back({time, static_cast<double>(observed.values[i]), *value});
  }
  return pairs;
}

RunStatistics StatisticsOf(std::span<const ComparedPair> pairs) {
  RunStatistics figures;
  figures.pairs = pairs.size();
  if (pairs.size() < 2) return figures;
  const double n = static_cast<double>(pairs.size());
  double sumObserved = 0, sumSimulated = 0, sumError = 0, sumAbsolute = 0, sumSquares = 0;
  for (const ComparedPair& pair : pairs) {
    const double error = pair.observed - pair.simulated;
    sumObserved += pair.observed;
    sumSimulated += pair.simulated;
    sumError += error;
    sumAbsolute += std::abs(error);
    sumSquares += error * error;
  }
  const double meanObserved = sumObserved / n, meanSimulated = sumSimulated / n, meanError = sumError / n;
  // Deviations from the means in a second walk: sums of squares of levels far from 0 would lose them. What rounding
  // leaves of values that are all equal is no variance.
  const bool observedVaries = std::any_of(
      pairs.begin(), pairs.end(), [&](const ComparedPair& pair) { return pair.observed != pairs.front().observed; });
  const bool simulatedVaries = std::any_of(
      pairs.begin(), pairs.end(), [&](const ComparedPair& pair) { return pair.simulated != pairs.front().simulated; });
  double ofObserved = 0, ofSimulated = 0, ofBoth = 0, ofErrors = 0;
  for (const ComparedPair& pair : pairs) {
    const double observed = pair.observed - meanObserved, simulated = pair.simulated - meanSimulated;
    const double error = pair.observed - pair.simulated - meanError;
    ofObserved += observed * observed;
    ofSimulated += simulated * simulated;
    ofBoth += observed * simulated;
    ofErrors += error * error;
  }
  figures.meanError = meanError;
  figures.meanAbsoluteError = sumAbsolute / n;
  figures.rootMeanSquareError = std::sqrt(sumSquares / n);
  figures.residualDeviation = std::sqrt(ofErrors / (n - 1));
  if (!observedVaries) ofObserved = 0;
  if (!simulatedVaries) ofSimulated = 0;
  if (const auto correlation = Quotient(ofBoth, std::sqrt(ofObserved) * std::sqrt(ofSimulated)))
    figures.correlation = std::clamp(*correlation, -1.0, 1.0);
  if (const auto unexplained = Quotient(sumSquares, ofObserved)) figures.nashSutcliffe = 1 - *unexplained;
  const auto spread = Quotient(std::sqrt(ofSimulated), std::sqrt(ofObserved));
  const auto level = Quotient(meanSimulated, meanObserved);
  if (figures.correlation && spread && level)
    figures.klingGupta = 1 - std::hypot(*figures.correlation - 1, *spread - 1, *level - 1);
  figures.percentBias = Quotient(100 * sumError, sumObserved);
  return figures;
}

DurationCurve DurationCurveOf(std::vector<double> values) {
  DurationCurve curve;
  std::sort(values.begin(), values.end(), std::greater<>());
  curve.percent.reserve(values.size());
  for (std::size_t i = 0; i < values.size(); ++i)
    curve.percent.push_back(100 * static_cast<double>(i + 1) / static_cast<double>(values.size() + 1));
  curve.values = std::move(values);
  return curve;
}

}  // namespace tervane
