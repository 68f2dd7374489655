// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/point_comparison.h"

#include <cmath>

#include <fmt/format.h>

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

/// Reads a series in the unit. "" or why not.
std::string ReadSeries(const DataFile& file, int number, const ComparedUnit& unit, PointSeries& series,
                       ProgressPart progress) {
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
  series.values.resize(file.Time().steps);
  if (const std::string error = file.Read({number, 0, file.Time().steps, {}}, series.values, {}, progress);
      !error.empty())
    return error;
  if (!conversion) return {};
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
  file = DataFile();
  std::string error = file.Open(wanted);
  if (error.empty()) path = wanted;
  return error;
}

PointComparison PointComparer::Compare(const DetailedPoint& point, ProgressPart progress) {
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
  problem = ReadSeries(simulated, point.simulated.item, unit, comparison.simulated, progress.Part(0, 0.5));
  if (problem.empty())
    problem = ReadSeries(observed, point.observed.item, unit, comparison.observed, progress.Part(0.5, 1));
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
