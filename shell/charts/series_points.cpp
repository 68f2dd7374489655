// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/charts/series_points.h"

#include <algorithm>
#include <cmath>

#include "shell/charts/chart_axis.h"

namespace tervane {

std::size_t PlaceCount(const Series& series) {
  return series.positions.empty() ? series.times.size() : series.positions.size();
}

/// On the horizontal axis; NaN where a value has no place.
double ValueCoordinate(const Series& series, std::size_t number) {
  if (!series.positions.empty()) return series.positions[number];
  return series.times[number].IsValid() ? AxisCoordinate(series.times[number]) : std::nan("");
}

/// From the first to the last place of a value; nothing without one.
std::optional<std::pair<double, double>> PlacesOf(const SeriesContent& content) {
  std::optional<std::pair<double, double>> all;
  const bool isLogarithmic = content.numbers && content.numbers->isLogarithmic;
  for (const Series& series : content.series) {
    const std::size_t count = std::min(PlaceCount(series), series.values.size());
    for (std::size_t i = 0; i < count; ++i) {
      if (std::isnan(series.values[i])) continue;
      const double place = ValueCoordinate(series, i);
      if (std::isnan(place) || (isLogarithmic && place <= 0)) continue;
      all = all ? std::pair(std::min(all->first, place), std::max(all->second, place)) : std::pair(place, place);
    }
  }
  return all;
}

QSharedPointer<QCPGraphDataContainer> PointsOf(const Series& series, bool hasLogarithmicPlaces,
                                               bool hasLogarithmicValues) {
  QVector<QCPGraphData> points;
  const std::size_t count = std::min(PlaceCount(series), series.values.size());
  points.reserve(static_cast<qsizetype>(count));
  bool isSorted = true;
  for (std::size_t i = 0; i < count; ++i) {
    const double place = ValueCoordinate(series, i);
    if (std::isnan(place) || (hasLogarithmicPlaces && place <= 0)) continue;
    isSorted = isSorted && (points.isEmpty() || points.back().key <= place);
    const bool hasPlace = !hasLogarithmicValues || series.values[i] > 0;
    const double value = hasPlace ? series.values[i] : std::nan("");
    // The value holds since the time before. (The chart's own steps lose all that stands behind a gap.)
    if (series.isStepped && !points.isEmpty()) points.push_back({points.back().key, value});
    points.push_back({place, value});
  }
  const auto shown = QSharedPointer<QCPGraphDataContainer>::create();
  shown->set(points, isSorted);
  return shown;
}

}  // namespace tervane
