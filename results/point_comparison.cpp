// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/point_comparison.h"

#include <cmath>
#include <set>

#include <fmt/format.h>

#include "data/series_block.h"
#include "platform/paths.h"

namespace tervane {

namespace {

/// Why an item is no time series that can be compared; empty when it is one.
std::string WhyNoSeries(const DataFile& file, int item) {
  const std::string_view name = FileNameOf(file.Path());
  if (item < 1 || static_cast<std::size_t>(item) > file.Items().size())
    return fmt::format("{} has no item {}: it has {}", name, item, file.Items().size());
  const DataItem& series = file.Items()[static_cast<std::size_t>(item - 1)];
  if (series.dimensions != 0) return fmt::format("item {} of {} is no time series", item, name);
  if (!series.hasTime || !file.Time().hasDates) return fmt::format("item {} of {} has no dates", item, name);
  return {};
}

const DataItem& ItemOf(const DataFile& file, int item) { return file.Items()[static_cast<std::size_t>(item - 1)]; }

/// The unit in which a point is compared.
struct ComparedUnit {
  std::optional<UnitScale> scale;
  std::string text;
};

/// The user's unit of the item's quantity, or the file's own where the quantity has none.
ComparedUnit UnitOfComparison(const DataItem& item, const DisplayUnits& units) {
  const ItemType* type = FindItemType(item.itemType);
  if (!type || type->code == quantity::kUndefined || !item.scale) return {item.scale, item.unitText};
  const Unit& unit = units.UnitOf(*type);
  if (!ConversionBetween(*item.scale, unit.scale)) return {item.scale, item.unitText};
  return {unit.scale, std::string(unit.abbreviation)};
}

/// Takes the values of a series, which `read` gives in the file's unit, in the unit. "" or why not.
template <class Read>
std::string TakeSeries(const DataFile& file, int number, const ComparedUnit& unit, PointSeries& series,
                       const Read& read) {
  const DataItem& item = ItemOf(file, number);
  std::optional<UnitConversion> conversion;
  if (unit.scale && item.scale) conversion = ConversionBetween(*item.scale, *unit.scale);
  if (!conversion && (unit.scale || item.scale || unit.text != item.unitText))
    return fmt::format("item {} of {} is in {}, which cannot be compared with {}", number, FileNameOf(file.Path()),
                       item.unitText.empty() ? "no unit" : item.unitText, unit.text.empty() ? "no unit" : unit.text);
  series.name = item.name;
  series.valueType = item.valueType;
  series.stamps = file.Time().stamps;
  if (file.Time().begin) series.begin = file.Time().begin->SecondsSinceEpoch();
  if (const std::string error = read(series.values); !error.empty() || !conversion) return error;
  for (float& value : series.values)
    if (value != kDeleteValue) value = static_cast<float>((*conversion)(static_cast<double>(value)));
  return {};
}

}  // namespace

PointComparer::PointComparer(const ComparedPeriod& period, const DisplayUnits& units) : units_(units) {
  if (!period.start.IsValid() || !period.end.IsValid()) return;
  start_ = period.start.SecondsSinceEpoch();
  end_ = period.end.SecondsSinceEpoch();
}

std::string PointComparer::OpenFile::Open(const std::string& wanted) {
  if (path == wanted) return {};
  path.reset();
  together.clear();
  file = DataFile();
  std::string error = file.Open(wanted);
  if (error.empty()) path = wanted;
  return error;
}

std::string PointComparer::OpenFile::Read(std::span<const DetailedPoint> coming, Place place,
                                          std::vector<float>& values, ProgressPart progress) {
  const int item = (coming.front().*place).item;
  const std::size_t steps = file.Time().steps;
  if (const auto found = together.find(item); found != together.end()) {
    values = found->second;
    return {};
  }
  // One after the other, few series are as soon read. Many are read in parts that leave room for others in memory.
  constexpr std::size_t kFew = 4, kMostValues = std::size_t{1} << 24;
  std::set<int> wanted;
  for (const DetailedPoint& point : coming) {
    if ((point.*place).path != path || (wanted.size() + 1) * steps > kMostValues) break;
    if (point.includesObserved && WhyNoSeries(file, (point.*place).item).empty()) wanted.insert((point.*place).item);
  }
  std::vector<std::vector<float>> series;
  const std::vector<int> items(wanted.begin(), wanted.end());
  // What is wrong with one of them is told by itself.
  if (items.size() > kFew && ReadSeriesTogether(*path, items, series, progress).empty()) {
    together.clear();
    for (std::size_t i = 0; i < items.size(); ++i) together.emplace(items[i], std::move(series[i]));
    values = together.at(item);
    return {};
  }
  values.resize(steps);
  return file.Read({item, 0, steps, {}}, values, {}, progress);
}

PointComparison PointComparer::CompareFirst(std::span<const DetailedPoint> coming, ProgressPart progress) {
  const DetailedPoint& point = coming.front();
  PointComparison comparison;
  comparison.point = point;
  std::string& problem = comparison.problem;
  problem = simulated_.Open(point.simulated.path);
  if (problem.empty()) problem = observed_.Open(point.observed.path);
  comparison.isUnreadable = !problem.empty();
  const DataFile &simulated = simulated_.file, &observed = observed_.file;
  if (problem.empty()) problem = WhyNoSeries(simulated, point.simulated.item);
  if (problem.empty()) problem = WhyNoSeries(observed, point.observed.item);
  if (!problem.empty()) return comparison;

  const ComparedUnit unit = UnitOfComparison(ItemOf(simulated, point.simulated.item), units_);
  comparison.unit = unit.text;
  const auto take = [&](OpenFile& open, Place place, PointSeries& series, ProgressPart part) {
    return TakeSeries(open.file, (point.*place).item, unit, series,
                      [&](std::vector<float>& values) { return open.Read(coming, place, values, part); });
  };
  problem = take(simulated_, &DetailedPoint::simulated, comparison.simulated, progress.Part(0, 0.5));
  if (problem.empty()) problem = take(observed_, &DetailedPoint::observed, comparison.observed, progress.Part(0.5, 1));
  if (!problem.empty()) return comparison;
  comparison.pairs = PairsOf(comparison.simulated.View(), comparison.observed.View(), start_, end_);
  comparison.figures = StatisticsOf(comparison.pairs);
  if (comparison.pairs.empty())
    problem = "in the period there is no observed value at whose time there is a simulated one";
  else if (comparison.pairs.size() == 1)
    problem = "in the period one observed value alone has a simulated one at its time";
  return comparison;
}

}  // namespace tervane
