// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/surface/stress_period_grid_pages.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "pages/page_table.h"
#include "simspec/basic_parameters.h"
#include "simspec/stress_periods.h"
#include "surface/climate.h"
#include "surface/pages.h"
#include "surface/stress_period_grids.h"
#include "tests/support/page_driver.h"

namespace tervane::stress_period_grid_pages_test {
namespace {

using testing::ElementsAre;

TEST(StressPeriodGridPages, SpansFollowEachOtherInTheTable) {
  CFlowModelDoc document;
  auto& root = document.Root();
  root.Important(kBasicParameters)->ModelType = kEngineModflowSurfact;
  root.Important(kModflowComponents)->Recharge = 1;
  root.Important(kClimate)->RechargeOption = CPrecipitationRelatedKvf::kGivenLayer;
  root.Important(kStressPeriods)->MakeEqualPeriods(31, {});
  auto& spans = *root.Important(kClimate)->Child<CRechargeAndPondingModListKvf>();
  test::ScriptedHost host;
  std::vector<std::string> changes;
  const auto page =
      MakePage(kStressPeriodGridsPage, spans, {document, host, [&](int hint, const std::string& action, const void*) {
                                                 root.Validate();
                                                 changes.push_back(fmt::format("{} {}", hint, action));
                                               }});
  const Control& control = *page->Form().Controls().front();
  TableForm& table = *control.table;
  const auto row = [&](int number) {
    std::vector<std::string> cells;
    for (int column = 1; column <= 3; ++column) cells.push_back(table.ShownCell(number, column));
    return cells;
  };
  EXPECT_TRUE(page->ChangeRows(control, RowAction::Insert, 0, 0));
  EXPECT_THAT(row(1), ElementsAre("1", "31", "From 2000-01-01 00:00 to 2000-02-01 00:00"));
  EXPECT_TRUE(page->ChangeRows(control, RowAction::Insert, 1, 1));
  EXPECT_EQ(page->EnterCell(control, 1, 2, "10"), "");
  EXPECT_EQ(changes.back(), "9 Change To Stress Period");
  EXPECT_THAT(row(1), ElementsAre("1", "10", "From 2000-01-01 00:00 to 2000-01-11 00:00"));
  EXPECT_THAT(row(2), ElementsAre("11", "31", "From 2000-01-11 00:00 to 2000-02-01 00:00"));
  EXPECT_EQ(spans.GetItem(2)->GetAbbreviatedTitle(), "StressP. 11-31");
  EXPECT_NE(page->EnterCell(control, 1, 2, "-1"), "");
  EXPECT_NE(page->EnterCell(control, 1, 1, "2"), "");
  // A page that is open follows the number of periods.
  root.Important(kStressPeriods)->SetItemCount(20, 1);
  root.Validate();
  EXPECT_THAT(row(2), ElementsAre("11", "20", "From 2000-01-11 00:00 to 2000-02-01 00:00"));
  EXPECT_TRUE(page->ChangeRows(control, RowAction::Delete, 1, 1));
  EXPECT_THAT(row(1), ElementsAre("1", "20", "From 2000-01-01 00:00 to 2000-02-01 00:00"));
}

}  // namespace
}  // namespace tervane::stress_period_grid_pages_test
