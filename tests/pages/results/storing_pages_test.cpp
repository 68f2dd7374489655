// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/results/storing_pages.h"

#include <algorithm>
#include <set>

#include <gmock/gmock.h>

#include "forms/table_form.h"
#include "results/grid_series.h"
#include "results/storing.h"
#include "simspec/model_components.h"
#include "tests/support/page_driver.h"

namespace tervane::storing_pages_test {
namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Not;

struct GridSeriesPage : testing::Test {
  CFlowModelDoc document;
  CStoringResultsKvf& storing = *document.Root().Important(kStoringResults);
  test::PageDriver page{document, "StoringOfResults/GridSeriesOutput"};

  TableForm& Table() {
    TableForm* found = nullptr;
    page.Page().Form().ForEach([&](Control& control) {
      if (control.table) found = control.table.get();
    });
    if (!found) throw std::runtime_error("the page has no table");
    found->Follow();
    return *found;
  }
  /// The items that the user has ticked himself.
  std::set<std::string> Ticked() {
    std::set<std::string> names;
    for (const GridSeriesRow& row : storing.GridSeries().Rows())
      if (row.isTicked) names.insert(std::string(row.type->name));
    return names;
  }
  int RowOf(const std::string& item) {
    TableForm& table = Table();
    for (int row = 1; row <= table.RowCount(); ++row)
      if (table.Cell(row, 2) == item) return row;
    throw std::runtime_error("there is no row " + item);
  }
};

TEST_F(GridSeriesPage, APresetTicksItsTypesAsOneStepAndNothingWhereAllStand) {
  const std::string heads = "head elevation in saturated zone";
  EXPECT_THAT(Ticked(), IsEmpty());
  page.Find("For a Later Water Quality Run").press();
  const std::set<std::string> forQuality = Ticked();
  EXPECT_FALSE(forQuality.empty());
  EXPECT_THAT(page.Changes(), ElementsAre(testing::HasSubstr("Tick Types for Water Quality")));
  page.Find("For a Later Water Quality Run").press();
  EXPECT_EQ(page.Changes().size(), 1) << "nothing is left to change";
  // The water balance adds its own.
  page.Find("For the Water Balance").press();
  const std::set<std::string> both = Ticked();
  EXPECT_TRUE(std::ranges::includes(both, forQuality));
  EXPECT_GT(both.size(), forQuality.size());
  page.Find("Heads Only").press();
  EXPECT_THAT(Ticked(), ElementsAre(heads));
  EXPECT_EQ(Table().Cell(RowOf(heads), 1), "1");
  page.Find("None").press();
  EXPECT_THAT(Ticked(), IsEmpty());
  EXPECT_EQ(page.Changes().size(), 4);
}

TEST_F(GridSeriesPage, WhatIsRequiredIsTickedAndStays) {
  storing.WaterBalance = 1;
  TableForm& table = Table();
  int required = 0;
  for (int row = 1; row <= table.RowCount(); ++row) {
    EXPECT_EQ(table.IsReadOnly(row, 1), !table.Cell(row, 3).empty()) << table.Cell(row, 2);
    if (table.Cell(row, 3).empty()) continue;
    ++required;
    EXPECT_EQ(table.Cell(row, 1), "1");
  }
  EXPECT_GT(required, 5);
  EXPECT_THAT(Ticked(), IsEmpty()) << "they are stored without a tick of the user";
}

}  // namespace
}  // namespace tervane::storing_pages_test
