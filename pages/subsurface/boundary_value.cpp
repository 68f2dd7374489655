// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/subsurface/boundary_value.h"

#include "pages/parts/file_controls.h"
#include "pages/parts/further_series.h"
#include "pages/parts/plot_content.h"
#include "pages/parts/series_controls.h"

namespace tervane {

namespace {

enum Way : int { kInitialValue = 0, kConstant = 1, kSeries = 2, kGridSeries = 3 };

void DescribeWays(PageForm& form, const BoundaryValue& boundary, const BoundaryValue::Words& words) {
  std::vector<std::string> texts(kBoundaryValueTypes + words.first, kBoundaryValueTypes + words.last + 1);
  if (words.first == kConstant) texts.front() = "Constant";
  form.Choice(
          boundary.typeLabel, [type = &boundary.type, first = words.first] { return *type - first; },
          [type = &boundary.type, first = words.first](int choice) { *type = choice + first; }, std::move(texts))
      .Key("Type")
      .ShownWhen(Is(boundary.boundary, words.boundaries))
      .Revalidates();
}

}  // namespace

void DescribeBoundaryValue(PageForm& form, const CYbSEDlgBase& page, const BoundaryValue& boundary) {
  for (const BoundaryValue::Words& words : boundary.words) DescribeWays(form, boundary, words);
  std::vector<int> all;
  for (const BoundaryValue::Words& words : boundary.words) {
    const Condition isMeant = Is(boundary.boundary, words.boundaries);
    form.Number(words.value, boundary.value)
        .QuantityBy(boundary.itemType)
        .ShownWhen(isMeant && Is(boundary.type, kConstant));
    DescribeSeriesFile(form, page, words.series, boundary.series, {boundary.value, {boundary.itemType()}},
                       isMeant && Is(boundary.type, kSeries));
    all.insert(all.end(), words.boundaries.begin(), words.boundaries.end());
  }
  // A file may hold it for a kind of boundary that does not offer it.
  const Condition byGrid = Is(boundary.type, kGridSeries) && Is(boundary.boundary, all);
  form.DataFile("Time varying nds2 file:", boundary.grid)
      .Filter(boundary.gridFilter)
      .DefaultExtension("nds2")
      .ShownWhen(byGrid);
  form.Button("Edit...", [&page, grid = &boundary.grid] { EditDataFile(page.Context(), page.Node(), grid->File); })
      .ShownWhen(byGrid);
}

void ChartOfBoundary(PageForm& form, const BoundaryValue& boundary) {
  std::vector<int> all;
  for (const BoundaryValue::Words& words : boundary.words)
    all.insert(all.end(), words.boundaries.begin(), words.boundaries.end());
  form.Chart(WithFurtherSeries([series = &boundary.series] { return FileChart(*series); },
                               [series = &boundary.series] { return OffersBeside(*series, {}, {}); }))
      .ShownWhen(Is(boundary.boundary, all) && Is(boundary.type, kSeries));
}

}  // namespace tervane
