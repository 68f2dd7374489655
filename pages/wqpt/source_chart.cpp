// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/wqpt/source_chart.h"

#include <algorithm>
#include <cmath>
#include <map>

#include <fmt/format.h>

#include "data/datafile_facts.h"
#include "pages/parts/plot_content.h"
#include "platform/item_types.h"
#include "platform/units.h"
#include "simspec/periods.h"

namespace tervane {

namespace {

constexpr std::size_t kMostCurves = 20;

const Unit& BaseOf(int itemType) { return BaseUnit(*FindItemType(itemType)); }

bool IsDrawn(int itemType) {
  return itemType == quantity::kConcentration || itemType == quantity::kMass || itemType == quantity::kMassRate;
}

/// A series with its values in the base unit of the quantity.
Series InBaseUnit(const DrawnSource& source) {
  Series series = *source.series;
  const Unit* unit = FindUnit(source.unit);
  const Unit& base = BaseOf(source.itemType);
  if (unit && AllowsUnit(*FindItemType(source.itemType), unit->key))
    for (double& value : series.values.Change()) value = Convert(value, *unit, base);
  series.name = source.name;
  series.unit = base.abbreviation;
  return series;
}

/// What a series gives in the interval that ends at a time: its value there, nothing outside its own time.
double ValueUpTo(const Series& series, const CYbDateTime& time) {
  const auto& times = series.times;
  const auto next = std::ranges::lower_bound(times, time);
  if (next == times.end()) return 0;
  const auto place = static_cast<std::size_t>(next - times.begin());
  if (series.isStepped) {
    // The first interval is taken to be as long as the second.
    const bool isBefore = place == 0 && times.size() > 1 && (times[0] - time).seconds >= (times[1] - times[0]).seconds;
    return isBefore ? 0 : series.values[place];
  }
  if (place == 0) return time == times[0] ? series.values[0] : 0;
  const double part = static_cast<double>((time - times[place - 1]).seconds) /
                      static_cast<double>((times[place] - times[place - 1]).seconds);
  return series.values[place - 1] + part * (series.values[place] - series.values[place - 1]);
}

}  // namespace

std::vector<Series> SumsOfMass(const std::vector<DrawnSource>& sources, const CYbDateTime& start,
                               const CYbDateTime& end, std::vector<std::string>& left) {
  std::vector<Series> sums;
  for (const int itemType : {quantity::kMassRate, quantity::kMass}) {
    double constant = 0;
    std::vector<Series> series;
    bool hasAny = false;
    for (const DrawnSource& source : sources) {
      if (source.itemType != itemType) continue;
      hasAny = true;
      if (source.series)
        series.push_back(InBaseUnit(source));
      else
        constant += source.constant;
    }
    if (!hasAny) continue;
    // What comes within a step can be added to that of the same step alone.
    if (itemType == quantity::kMass &&
        std::ranges::any_of(series, [&](const Series& each) { return each.times != series.front().times; })) {
      left.emplace_back("the sum of masses: their time steps differ");
      continue;
    }
    Series sum;
    sum.name = "Sum of mass sources";
    sum.unit = BaseOf(itemType).abbreviation;
    sum.isStepped = true;
    std::vector<CYbDateTime> times;
    if (start.IsValid() && end.IsValid()) times = {start, end};
    for (const Series& each : series) times.insert(times.end(), each.times.begin(), each.times.end());
    std::ranges::sort(times);
    times.erase(std::unique(times.begin(), times.end()), times.end());
    for (const CYbDateTime& time : times) {
      const bool isSimulated = time >= start && time <= end;
      double value = isSimulated ? constant : 0;
      for (const Series& each : series) value += ValueUpTo(each, time);
      sum.values.push_back(value);
    }
    sum.times = std::move(times);
    sums.push_back(std::move(sum));
  }
  return sums;
}

SeriesContent SourceChart::Content(const CSourcesWQListKvf& list) {
  SeriesContent chart;
  CYbDateTime start, end;
  if (const auto* period = list.Important(kSimulationPeriod)) {
    start = period->GetSimStartDate();
    end = period->SIMEND;
    chart.period = {start, end};
  }
  std::vector<DrawnSource> drawn;
  left_.clear();
  for (int number = 1; number <= list.GetItemCount(); ++number) {
    const CSourceWQItemKvf& source = *list.GetItem(number);
    const CStrengthWQKvf& strength = source.Strength();
    const auto leave = [&](const std::string& why) { left_.push_back(fmt::format("{}: {}", source.SourceName, why)); };
    TimeBar bar{source.SourceName, start, end};
    DrawnSource made{source.SourceName, strength.GetItemType()};
    if (strength.DistributionType == C2DStationBasedDataKvf::kFullyDistributed) {
      leave("its strength differs from cell to cell");
    } else if (strength.DistributionType == C2DStationBasedDataKvf::kStationBased) {
      leave("its strength differs from station to station");
    } else if (strength.Global().TYPE == CGlobalKvf::kConstant) {
      made.constant = static_cast<double>(strength.Global().FIXED_VALUE);
      drawn.push_back(std::move(made));
    } else {
      const CFMData0DFile& file = strength.Global().SeriesFile();
      if (file.File.IsEmpty()) {
        leave("no file is chosen");
        continue;
      }
      const std::string path = file.File.Absolute();
      const auto series = RecentSeries(path, file.SelectedItem());
      made.series = NowOrAwaited(series, chart.awaited);
      if (!made.series || made.series->times.empty()) {
        if (series->IsDone()) leave(series->Problem().empty() ? "its file has no values" : series->Problem());
        continue;
      }
      const auto facts = DataFileFactsOf(path);
      if (const DataItem* item = facts->Item(file.SelectedItem())) {
        made.itemType = item->itemType;
        made.unit = item->unitKey;
      }
      if (!IsDrawn(made.itemType)) {
        leave("its file holds neither a mass nor a concentration");
        continue;
      }
      bar.start = made.series->times.front();
      bar.end = made.series->times.back();
      if (start.IsValid() && bar.end > start) bar.start = std::max(bar.start, start);
      if (end.IsValid() && bar.start < end) bar.end = std::min(bar.end, end);
      drawn.push_back(std::move(made));
    }
    chart.bars.push_back(std::move(bar));
  }
  std::ranges::stable_sort(chart.bars, {}, &TimeBar::start);
  if (!chart.awaited.empty()) return chart;

  if (drawn != drawn_ || start != start_ || end != end_) {
    leftOfSums_.clear();
    sums_ = SumsOfMass(drawn, start, end, leftOfSums_);
    drawn_ = drawn;
    start_ = start;
    end_ = end;
  }
  left_.insert(left_.end(), leftOfSums_.begin(), leftOfSums_.end());
  chart.series = sums_;
  const int below = sums_.empty() ? 0 : 1;
  for (const DrawnSource& source : drawn) {
    if (source.itemType != quantity::kConcentration) continue;
    if (chart.series.size() >= kMostCurves) {
      left_.push_back(fmt::format("{}: there are more than {} curves", source.name, kMostCurves));
      continue;
    }
    Series curve;
    if (source.series) {
      curve = InBaseUnit(source);
    } else {
      curve.name = source.name;
      curve.unit = BaseOf(source.itemType).abbreviation;
      curve.times = {start, end};
      curve.values = {source.constant, source.constant};
    }
    curve.panel = below;
    chart.series.push_back(std::move(curve));
  }
  if (chart.series.empty())
    chart.message = list.GetItemCount() == 0 ? "The setup has no sources." : "No source has a strength to be drawn.";
  return chart;
}

}  // namespace tervane
