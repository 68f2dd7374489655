// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "forms/series_views.h"

#include <cmath>
#include <limits>
#include <optional>
#include <string_view>

namespace tervane {

namespace {

constexpr double kNothing = std::numeric_limits<double>::quiet_NaN();

/// A unit of an amount for each unit of time.
struct Rate {
  std::string amount;
  double seconds;
};

std::optional<Rate> RateOf(const std::string& unit) {
  constexpr std::pair<std::string_view, double> kTimes[] = {{"/day", 86400}, {"/h", 3600}, {"/s", 1}};
  for (const auto& [ending, seconds] : kTimes)
    if (unit.size() > ending.size() && unit.ends_with(ending))
      return Rate{unit.substr(0, unit.size() - ending.size()), seconds};
  return std::nullopt;
}

/// The interval for which a value holds: since the value before. The first one's is as long as the next one's.
double SecondsOf(const Series& series, std::size_t number) {
  const std::size_t from = number > 0 ? number - 1 : 0, to = number > 0 ? number : 1;
  return to < series.times.size() ? static_cast<double>((series.times[to] - series.times[from]).seconds) : 0.0;
}

Series Cumulated(const Series& series) {
  Series sums = series;
  const std::optional<Rate> rate = RateOf(series.unit);
  if (rate) sums.unit = rate->amount;
  sums.isStepped = false;
  std::vector<double>& values = sums.values.Change();
  double sum = 0;
  for (std::size_t i = 0; i < series.values.size() && i < series.times.size(); ++i) {
    const double value = series.values[i];
    if (!std::isnan(value)) sum += rate ? value * SecondsOf(series, i) / rate->seconds : value;
    values[i] = sum;
  }
  return sums;
}

CYbDateTime NextMonth(const CYbDateTime& time) {
  return time.Month() == 12 ? CYbDateTime(time.Year() + 1, 1, 1) : CYbDateTime(time.Year(), time.Month() + 1, 1);
}

Series Monthly(const Series& series) {
  Series months = series;
  months.times = {};
  months.values = {};
  const bool isAmount = series.isStepped && !RateOf(series.unit);
  double sum = 0;
  std::size_t count = 0;
  std::optional<CYbDateTime> end;
  const auto close = [&] {
    months.times.push_back(*end);
    months.values.push_back(count == 0 ? kNothing : isAmount ? sum : sum / static_cast<double>(count));
    sum = 0;
    count = 0;
  };
  for (std::size_t i = 0; i < series.values.size() && i < series.times.size(); ++i) {
    if (!series.times[i].IsValid()) continue;
    // What holds until midnight belongs to the day before.
    const CYbDateTime inside = series.isStepped ? series.times[i] + CYbDateTimeSpan{-1} : series.times[i];
    if (!end) {
      // A step is drawn from the stamp before: the begin of the first month.
      months.times.push_back(CYbDateTime(inside.Year(), inside.Month(), 1));
      months.values.push_back(kNothing);
      end = NextMonth(inside);
    }
    while (inside >= *end) {
      close();
      end = NextMonth(*end);
    }
    if (std::isnan(series.values[i])) continue;
    sum += series.values[i];
    ++count;
  }
  if (end) close();
  months.isStepped = true;
  return months;
}

}  // namespace

Series ViewOf(const Series& series, SeriesView view) {
  if (!series.positions.empty() || view == SeriesView::AsGiven) return series;
  return view == SeriesView::Cumulated ? Cumulated(series) : Monthly(series);
}

std::vector<std::pair<CYbDateTime, CYbDateTime>> GapsOf(const Series& series, std::size_t most) {
  std::vector<std::pair<CYbDateTime, CYbDateTime>> gaps;
  std::optional<std::size_t> before;
  for (std::size_t i = 0; i < series.values.size() && i < series.times.size() && gaps.size() < most; ++i) {
    if (std::isnan(series.values[i])) continue;
    if (before && i > *before + 1) gaps.emplace_back(series.times[*before], series.times[i]);
    before = i;
  }
  return gaps;
}

}  // namespace tervane
