// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/subsurface/boundary_value.h"

#include "pages/parts/file_controls.h"
#include "pages/parts/further_series.h"
#include "pages/parts/plot_content.h"
#include "pages/parts/series_controls.h"

namespace tervane {

namespace {

void DescribeWays(PageForm& form, const BoundaryValue& told, const BoundaryValue::Words& words) {
  std::vector<std::string> texts(kBoundaryValueTypes + words.first, kBoundaryValueTypes + words.last + 1);
  if (words.first == ValuedBoundary::kConstant) texts.front() = "Constant";
  form.Choice(
          told.typeLabel, [type = &told.boundary.Type, first = words.first] { return *type - first; },
          [type = &told.boundary.Type, first = words.first](int choice) { *type = choice + first; }, std::move(texts))
      .Key("Type")
      .ShownWhen(Is(told.boundary.BoundaryType, words.boundaries))
      .Revalidates();
}

}  // namespace

void DescribeBoundaryValue(PageForm& form, const CYbSEDlgBase& page, const BoundaryValue& told) {
  for (const BoundaryValue::Words& words : told.words) DescribeWays(form, told, words);
  std::vector<int> all;
  for (const BoundaryValue::Words& words : told.words) {
    const Condition isMeant = Is(told.boundary.BoundaryType, words.boundaries);
    form.Number(words.value, told.boundary.FixedValue)
        .QuantityBy(told.itemType)
        .ShownWhen(isMeant && Is(told.boundary.Type, ValuedBoundary::kConstant));
    DescribeSeriesFile(form, page, words.series, told.boundary.SeriesFile(),
                       {.value = told.boundary.FixedValue,
                        .itemTypesBy = [itemType = told.itemType] { return std::vector{itemType()}; }},
                       isMeant && Is(told.boundary.Type, ValuedBoundary::kSeries));
    all.insert(all.end(), words.boundaries.begin(), words.boundaries.end());
  }
  // A file may hold it for a kind of boundary that does not offer it.
  const Condition byGrid = Is(told.boundary.Type, ValuedBoundary::kGridSeries) && Is(told.boundary.BoundaryType, all);
  form.DataFile("Time varying nds2 file:", told.boundary.GridFile())
      .Filter(told.gridFilter)
      .DefaultExtension("nds2")
      .ShownWhen(byGrid);
  form.Button("Edit...",
              [&page, grid = &told.boundary.GridFile()] { EditDataFile(page.Context(), page.Node(), grid->File); })
      .ShownWhen(byGrid);
}

void ChartOfBoundary(PageForm& form, const BoundaryValue& told) {
  std::vector<int> all;
  for (const BoundaryValue::Words& words : told.words)
    all.insert(all.end(), words.boundaries.begin(), words.boundaries.end());
  form.Chart(WithFurtherSeries([series = &told.boundary.SeriesFile()] { return FileChart(*series); },
                               [series = &told.boundary.SeriesFile()] { return OffersBeside(*series, {}, {}); }))
      .ShownWhen(Is(told.boundary.BoundaryType, all) && Is(told.boundary.Type, ValuedBoundary::kSeries));
}

}  // namespace tervane
