// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/library_views.h"

#include <algorithm>

#include <fmt/format.h>

#include "libraries/soils.h"
#include "libraries/wells.h"
#include "pages/parts/soil_curves.h"
#include "pages/parts/well_map.h"

namespace tervane {

namespace {

constexpr LibraryView kViews[] = {
    {&kWellLibrary, WellChart, WellMap},
    {&kSoilLibrary, SoilChart, nullptr, DescribeTextures},
};

/// The columns of an entry over its first one.
SeriesContent ChartOfRows(const LibraryKind& kind, const LibraryEntry& entry) {
  SeriesContent chart;
  chart.numbers = {fmt::format("{}. {}", kind.columns[0].head, kind.between), std::string(kind.columns[0].unit), false};
  if (entry.rows.size() < 2) {
    chart.message = fmt::format("Two {} make a curve.", kind.rowNames);
    return chart;
  }
  std::vector<const LibraryRow*> rows;
  for (const LibraryRow& row : entry.rows) rows.push_back(&row);
  std::ranges::stable_sort(rows, {}, [](const LibraryRow* row) { return row->values[0]; });
  for (std::size_t column = 1; column < kind.columns.size(); ++column) {
    Series series;
    series.name = kind.columns[column].head;
    series.unit = kind.columns[column].unit;
    series.panel = static_cast<int>(column) - 1;
    for (const LibraryRow* row : rows) {
      series.positions.push_back(row->values[0]);
      series.values.push_back(row->values[column]);
    }
    chart.series.push_back(std::move(series));
  }
  return chart;
}

}  // namespace

const LibraryView* ViewOf(const LibraryKind& kind) {
  const auto found = std::ranges::find(kViews, &kind, &LibraryView::kind);
  return found == std::end(kViews) ? nullptr : &*found;
}

SeriesContent ChartOf(const Library& library, const LibraryEntry& entry) {
  const LibraryView* view = ViewOf(*library.kind);
  return view && view->chart ? view->chart(library, entry) : ChartOfRows(*library.kind, entry);
}

}  // namespace tervane
