// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "edits/resampling.h"

#include <algorithm>

#include <fmt/format.h>

namespace tervane {

namespace {

constexpr std::size_t kMostResampled = 10'000'000;
constexpr std::int64_t kDaySeconds = 86400;

std::int64_t MonthStart(std::int64_t month) {
  return CYbDateTime(static_cast<int>(month / 12), static_cast<int>(month % 12) + 1, 1).SecondsSinceEpoch();
}

/// The ends of steps that are not before a time.
class StepEnds {
 public:
  /// Steps that do not divide the day have no place in the calendar: they count from the first day.
  StepEnds(const ResamplingStep& step, std::int64_t first)
      : step_(step),
        origin_(step.seconds > 0 && kDaySeconds % step.seconds != 0 ? first - Rest(first, kDaySeconds) : 0) {}

  /// The last end that is not after the time.
  std::int64_t Before(std::int64_t stamp) const {
    if (step_.months > 0) {
      const CYbDateTime date = CYbDateTime::FromSecondsSinceEpoch(stamp);
      const std::int64_t month = std::int64_t{12} * date.Year() + date.Month() - 1;
      return MonthStart(month / step_.months * step_.months);
    }
    return stamp - Rest(stamp - origin_, step_.seconds);
  }
  std::int64_t Next(std::int64_t end) const {
    return step_.months > 0 ? MonthsLater(end, step_.months) : end + step_.seconds;
  }

 private:
  static std::int64_t Rest(std::int64_t stamp, std::int64_t step) {
    const std::int64_t rest = stamp % step;
    return rest < 0 ? rest + step : rest;
  }

  ResamplingStep step_;
  std::int64_t origin_;
};

/// Walks along one series while the new steps ascend.
class SeriesWalk {
 public:
  SeriesWalk(const SeriesRows& rows, std::int64_t begin, const std::vector<float>& values, ValueType type)
      : rows_(rows), begin_(begin), values_(values), type_(type) {}

  float At(std::int64_t from, std::int64_t to) {
    return type_ == ValueType::MeanStep || type_ == ValueType::StepAccumulated ? OfInterval(from, to) : OfMoment(to);
  }

 private:
  float OfInterval(std::int64_t from, std::int64_t to) {
    const std::vector<std::int64_t>& stamps = rows_.stamps;
    while (row_ < stamps.size() && stamps[row_] <= from) ++row_;
    double sum = 0;
    std::int64_t covered = 0;
    for (std::size_t row = row_; row < stamps.size(); ++row) {
      const std::int64_t start = row > 0 ? stamps[row - 1] : begin_;
      if (start >= to) break;
      const std::int64_t overlap = std::min(to, stamps[row]) - std::max(from, start);
      if (overlap <= 0) continue;
      if (values_[row] == kDeleteValue) return kDeleteValue;
      const double length =
          type_ == ValueType::MeanStep ? static_cast<double>(to - from) : static_cast<double>(stamps[row] - start);
      sum += static_cast<double>(values_[row]) * static_cast<double>(overlap) / length;
      covered += overlap;
    }
    return covered == to - from ? static_cast<float>(sum) : kDeleteValue;
  }

  float OfMoment(std::int64_t time) {
    const std::vector<std::int64_t>& stamps = rows_.stamps;
    while (row_ < stamps.size() && stamps[row_] < time) ++row_;
    if (row_ == stamps.size()) return kDeleteValue;
    if (stamps[row_] == time) return values_[row_];
    if (row_ == 0 || values_[row_] == kDeleteValue || values_[row_ - 1] == kDeleteValue) return kDeleteValue;
    const double part =
        static_cast<double>(time - stamps[row_ - 1]) / static_cast<double>(stamps[row_] - stamps[row_ - 1]);
    const auto before = static_cast<double>(values_[row_ - 1]), behind = static_cast<double>(values_[row_]);
    return static_cast<float>(before + (behind - before) * part);
  }

  const SeriesRows& rows_;
  std::int64_t begin_;
  const std::vector<float>& values_;
  ValueType type_;
  std::size_t row_ = 0;  ///< The first that may still count.
};

}  // namespace

std::optional<std::int64_t> SeriesRows::Begin() const {
  if (begin || stamps.size() < 2) return begin;
  return stamps[0] - (stamps[1] - stamps[0]);
}

std::int64_t MonthsLater(std::int64_t stamp, int months) {
  const CYbDateTime date = CYbDateTime::FromSecondsSinceEpoch(stamp);
  const std::int64_t month = std::int64_t{12} * date.Year() + date.Month() - 1 + months;
  // Outside the years that dates have, the caller is told by a date that is not valid.
  if (month < 12 || month / 12 > 9999) return CYbDateTime(9999, 12, 31).SecondsSinceEpoch() + 1'000'000'000;
  const int year = static_cast<int>(month / 12), ofYear = static_cast<int>(month % 12) + 1;
  int day = date.Day();
  while (!CYbDateTime(year, ofYear, day).IsValid()) --day;
  return CYbDateTime(year, ofYear, day, date.Hour(), date.Minute(), date.Second()).SecondsSinceEpoch();
}

std::string Resample(const SeriesRows& rows, const std::vector<ValueType>& types, const ResamplingStep& step,
                     SeriesRows& resampled) {
  if (rows.stamps.empty()) return "there are no rows";
  if ((step.seconds > 0) == (step.months > 0)) return "a step is a number of seconds or of months, above 0";
  const bool hasIntervals = std::ranges::any_of(
      types, [](ValueType type) { return type == ValueType::MeanStep || type == ValueType::StepAccumulated; });
  const std::optional<std::int64_t> begin = rows.Begin();
  if (hasIntervals && !begin) return "a single value does not tell how long its step is";
  const std::int64_t first = hasIntervals ? std::min(*begin, rows.stamps.front()) : rows.stamps.front();
  const StepEnds ends(step, first);
  const std::int64_t last = rows.stamps.back();
  std::int64_t from = ends.Before(first);
  const double seconds = step.months > 0 ? 28.0 * 86400 * step.months : static_cast<double>(step.seconds);
  if (static_cast<double>(last - from) / seconds > static_cast<double>(kMostResampled))
    return fmt::format("that would be more than {} rows; choose a longer step", kMostResampled);
  std::vector<SeriesWalk> walks;
  for (std::size_t i = 0; i < types.size(); ++i)
    walks.emplace_back(rows, begin.value_or(rows.stamps.front()), rows.values[i], types[i]);
  SeriesRows made;
  made.values.resize(types.size());
  const auto add = [&](std::int64_t start, std::int64_t end) {
    bool hasValue = false;
    for (std::size_t i = 0; i < walks.size(); ++i) {
      made.values[i].push_back(walks[i].At(start, end));
      hasValue = hasValue || made.values[i].back() != kDeleteValue;
    }
    made.stamps.push_back(end);
    if (!hasValue && made.stamps.size() == 1) {
      // In front of the first value there is nothing.
      made.stamps.clear();
      for (auto& values : made.values) values.clear();
    } else if (made.stamps.size() == 1) {
      made.begin = start;
    }
  };
  if (from == rows.stamps.front()) add(ends.Before(from - 1), from);
  for (std::int64_t end = ends.Next(from); end <= last; from = end, end = ends.Next(end)) add(from, end);
  while (!made.stamps.empty() &&
         std::ranges::all_of(made.values, [](const auto& values) { return values.back() == kDeleteValue; })) {
    made.stamps.pop_back();
    for (auto& values : made.values) values.pop_back();
  }
  if (made.stamps.empty()) return "no whole step lies within the series; choose a shorter one";
  resampled = std::move(made);
  return {};
}

}  // namespace tervane
