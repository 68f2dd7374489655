// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/well_map.h"

#include <cmath>

#include <fmt/format.h>

#include "pages/parts/plot_content.h"

namespace tervane {

PointLayer PointsOf(const std::vector<CTvnWellData>& wells) {
  PointLayer layer;
  for (const CTvnWellData& well : wells) {
    if (!std::isfinite(well.place.x) || !std::isfinite(well.place.y)) continue;
    layer.points.push_back(well.place);
    layer.labels.push_back(well.name);
  }
  return layer;
}

void AddWells(MapContent& map, const std::vector<CTvnWellData>& wells) {
  PointLayer layer = PointsOf(wells);
  if (!layer.points.empty()) map.points.push_back(std::move(layer));
}

MapContent WellMap(const Library& library, std::size_t current) {
  MapContent map;
  const std::vector<CTvnWellData> wells = WellsOf(library);
  PointLayer layer = PointsOf(wells);
  if (layer.points.empty()) {
    map.message = "No well has a place.";
    return map;
  }
  // Wells without a place have no point.
  std::size_t number = 0;
  for (std::size_t i = 0; i < current && i < wells.size(); ++i)
    number += std::isfinite(wells[i].place.x) && std::isfinite(wells[i].place.y) ? 1 : 0;
  layer.highlighted.place = number;
  map.points.push_back(std::move(layer));
  return map;
}

SeriesContent WellChart(const Library& library, const LibraryEntry& well) {
  SeriesContent chart;
  chart.message = "No filter has a series.";
  int number = 0;
  for (const CTvnWellFilter& filter : WellOf(well, library.folder).filters) {
    ++number;
    if (filter.timeSeries.IsEmpty()) continue;
    const auto series = RecentSeries(filter.timeSeries.Absolute(), filter.item);
    if (const auto data = NowOrAwaited(series, chart.awaited)) {
      chart.series.push_back(*data);
      chart.series.back().name = fmt::format("Filter {}", number);
    } else if (series->IsDone()) {
      chart.message = series->Problem();
    }
  }
  return chart;
}

}  // namespace tervane
