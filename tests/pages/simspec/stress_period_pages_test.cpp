// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/simspec/stress_period_pages.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "data/datafile.h"
#include "data/series_file.h"
#include "forms/plots.h"
#include "pages/page_table.h"
#include "simspec/basic_parameters.h"
#include "simspec/pages.h"
#include "simspec/periods.h"
#include "simspec/stress_periods.h"
#include "subsurface/saturated_zone.h"
#include "subsurface/wells.h"
#include "surface/climate.h"
#include "tests/support/page_driver.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::stress_period_pages_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::Not;

/// The pages of January 2000 in three periods, with precipitation and a well.
class StressPeriodPage : public testing::Test {
 protected:
  StressPeriodPage() {
    const std::string text =
        "section SimSpec {\nModelType = 1\nsection ModModelComp {\nRecharge = 1\n}\nsection STRESSPERIODS "
        "{\nYbSEKvfListItemCount = 3\nsection Item_1 {\nDates = 2000, 1, 11, 0, 0\n}\nsection Item_2 {\nDates = 2000, "
        "1, 21, 0, 0\n}\nsection Item_3 {\nDates = 2000, 2, 1, 0, 0\n}\n}\n}";
    if (!document.OpenText(test::SetupText(14, text), folder.File("a.tvd"))) throw std::runtime_error("no setup");
    MakePage(kStressPeriodsPage, periods);
  }
  void MakePage(const PageClass& pageClass, CYbSEKvfBase& node) {
    PageContext context{document, host, [this](int, const std::string& action, const void*) {
                          changes.push_back(action);
                          document.Root().Validate();
                        }};
    context.displayUnits = &units;
    page = tervane::MakePage(pageClass, node, context);
  }
  void ShowProperties(int engine) {
    document.Root().Important(kBasicParameters)->ModelType = engine;
    MakePage(kStressPeriodPropertiesPage, *periods.Child<CStressPeriodsPropListKvf>());
  }
  Control& Find(std::string_view label, ControlKind kind) {
    Control* found = nullptr;
    page->Form().ForEach([&](Control& control) {
      if (control.kind == kind && control.label == label && !found) found = &control;
    });
    if (!found) throw std::runtime_error("no " + std::string(label));
    return *found;
  }
  Control& Table() { return Find("", ControlKind::Table); }
  TableForm& Cells() {
    Table().table->Follow();
    return *Table().table;
  }
  SeriesContent Chart() { return Finished(Find("", ControlKind::Chart).chart); }
  std::vector<std::string> Ends() const {
    std::vector<std::string> ends;
    for (int number = 1; number <= periods.GetItemCount(); ++number) ends.push_back(periods.GetDateText(number));
    return ends;
  }

  test::TempFolder folder;
  test::ScriptedHost host;
  std::vector<std::string> changes;
  CFlowModelDoc document;
  CStressPeriodsKvf& periods = *document.Root().Important(kStressPeriods);
  DisplayUnits units;
  std::unique_ptr<CYbSEDlgBase> page;
};

TEST_F(StressPeriodPage, TheTableTakesDatesWithinTheSimulation) {
  EXPECT_EQ(Cells().ShownCell(1, 1), "2000-01-11 00:00");
  EXPECT_EQ(page->EnterCell(Table(), 1, 1, "1990-01-01"), "");
  EXPECT_EQ(periods.GetDateText(1), "2000-01-01 00:00");
  EXPECT_EQ(periods.Findings().size(), 1U);
  EXPECT_EQ(page->EnterCell(Table(), 2, 1, "2040-01-01"), "");
  EXPECT_EQ(periods.GetDateText(2), "2000-02-01 00:00");
  // The last period ends with the simulation.
  EXPECT_TRUE(Cells().IsGrey(3, 1));
  EXPECT_FALSE(Cells().IsGrey(2, 1));
  EXPECT_NE(page->EnterCell(Table(), 3, 1, "2000-01-31"), "");
}

TEST_F(StressPeriodPage, PeriodsComeAndGo) {
  EXPECT_TRUE(page->ChangeRows(Table(), RowAction::Insert, 2, 2));
  EXPECT_THAT(Ends(), ElementsAre("2000-01-11 00:00", "2000-02-01 00:00", "2000-01-21 00:00", "2000-02-01 00:00"));
  EXPECT_TRUE(page->ChangeRows(Table(), RowAction::Delete, 1, 4));
  EXPECT_EQ(Cells().RowCount(), 0);
  EXPECT_TRUE(page->ChangeRows(Table(), RowAction::Insert, 0, 0));
  EXPECT_THAT(Ends(), ElementsAre("2000-02-01 00:00"));
}

TEST_F(StressPeriodPage, ASteadyStateHasNoPeriodsToEdit) {
  EXPECT_TRUE(Table().IsShown());
  page->Enter(Find("", ControlKind::Radio), "1");
  EXPECT_EQ(test::ValueOf(document, "SimSpec/STRESSPERIODS:MfSteadyState"), "1");
  EXPECT_FALSE(Table().IsShown());
  EXPECT_FALSE(Find("Make Stress Periods...", ControlKind::Button).IsShown());
  EXPECT_FALSE(Find("", ControlKind::Chart).IsShown());
}

TEST_F(StressPeriodPage, AnEndIsPickedOrDraggedOnTheChart) {
  EXPECT_FALSE(Find("", ControlKind::Chart).IsShown());
  EXPECT_FALSE(Table().table->Press(1, 2));
  periods.StressPeriodRadio = CStressPeriodsKvf::kSeparatePlots;
  EXPECT_TRUE(Find("", ControlKind::Chart).IsShown());
  EXPECT_FALSE(Table().table->Press(3, 2));
  EXPECT_EQ(Cells().ToolTip(1, 2), "Select point in the plot");
  ASSERT_TRUE(Table().table->Press(2, 2));
  ASSERT_TRUE(Chart().request);
  EXPECT_EQ(Chart().request->prompt, "Click the end of stress period 2.");
  Chart().request->taken({2000, 1, 25, 13, 30, 10});
  EXPECT_EQ(periods.GetDateText(2), "2000-01-25 13:30");
  EXPECT_FALSE(Chart().request);
  EXPECT_EQ(changes.back(), "Change End Date");

  page->ChooseRow(Table(), 2);
  const auto markers = Chart().markers;
  ASSERT_EQ(markers.size(), 3U);
  EXPECT_TRUE(markers[1].standsOut);
  EXPECT_FALSE(markers[0].standsOut);
  EXPECT_FALSE(markers[2].moved);
  markers[0].moved({1999, 1, 1});
  EXPECT_EQ(periods.GetDateText(1), "2000-01-01 00:00");
}

TEST_F(StressPeriodPage, SeriesThatDriveTheModelStandBelowEachOther) {
  periods.StressPeriodRadio = CStressPeriodsKvf::kSeparatePlots;
  EXPECT_THAT(Chart().message, HasSubstr("There are no series"));
  ASSERT_TRUE(WriteSeriesFile(folder.File("rain.nds0"), {.name = "rain",
                                                         .itemType = quantity::kPrecipitationRate,
                                                         .valueType = static_cast<int>(ValueType::MeanStep),
                                                         .times = {{2000, 1, 1}, {2000, 1, 10}, {2000, 2, 1}},
                                                         .values = {1, 1, 3}})
                  .Ok());
  auto& rain = *document.Root().Important(kPrecipitation);
  rain.Global().TYPE = CGlobalKvf::kTimeVarying;
  rain.Global().SeriesFile().Choose(FileName(folder.File("rain.nds0"), ""));
  // A file of wells that is gone has nothing to show.
  document.Root().Important(kSaturatedZone)->Wells = 1;
  document.Root().Important(kWells)->Filename = FileName(folder.File("none.WEL"), "");
  EXPECT_THAT(Chart().panelTitles, ElementsAre("Precipitation"));
  EXPECT_EQ(Chart().series.front().values.size(), 3U);
  EXPECT_EQ(Chart().series.front().unit, "mm/day");
  ASSERT_TRUE(units.Choose(quantity::kPrecipitationRate, 2000));
  EXPECT_EQ(Chart().series.front().unit, "m/s");
  EXPECT_DOUBLE_EQ(Chart().series.front().values.back(), 0.003 / 86400);
  EXPECT_EQ(Chart().period->second, CYbDateTime(2000, 2, 1));
}

TEST_F(StressPeriodPage, EachEngineHasItsColumns) {
  struct Case {
    int engine;
    std::vector<std::string> heads;
  };
  const Case cases[] = {{1,
                         {"End Date", "First time step size", "Min step size", "Max step size", "Time step multiplier",
                          "Reduction factor", "Length [days]"}},
                        {2,
                         {"End Date", "Number of time steps", "Time step multiplier", "Length [days]",
                          "First time step [days]", "Last time step [days]"}},
                        {3,
                         {"End Date", "Steady state time step", "Number of time steps", "Time step multiplier",
                          "Length [days]", "First time step [days]", "Last time step [days]"}}};
  for (const Case& c : cases) {
    ShowProperties(c.engine);
    std::vector<std::string> heads;
    for (int column = 1; column <= Cells().ColumnCount(); ++column) heads.push_back(Cells().Head(column));
    EXPECT_EQ(heads, c.heads);
    EXPECT_TRUE(Cells().IsGrey(1, 1));
    EXPECT_FALSE(Cells().Allows(RowAction::Insert));
  }
}

TEST_F(StressPeriodPage, TimeStepsAreWholeAndTellTheirLengths) {
  ShowProperties(kEngineModflow96);
  auto& period = *periods.GetItem(1);
  period.NSTP = 2.5;
  EXPECT_EQ(Cells().ShownCell(1, 2), "2.5");
  EXPECT_NE(page->EnterCell(Table(), 1, 2, "3.5"), "");
  EXPECT_EQ(period.NSTP, 2.5);
  EXPECT_EQ(page->EnterCell(Table(), 1, 2, "4"), "");
  EXPECT_EQ(page->EnterCell(Table(), 1, 3, "1"), "");
  EXPECT_EQ(Cells().ShownCell(1, 4), "10");
  EXPECT_EQ(Cells().ShownCell(1, 5), "2.5");
  EXPECT_EQ(page->EnterCell(Table(), 1, 3, "3"), "");
  EXPECT_EQ(Cells().ShownCell(1, 5), "0.25");
  EXPECT_EQ(Cells().ShownCell(1, 6), "6.75");
  EXPECT_EQ(Find("Total:", ControlKind::Shown).Text(), "31 days in 3 periods with 6 time steps");
  const CellRange steps{1, 2, 1, 3};
  EXPECT_EQ(page->FillAll(Table(), steps).taken, 4);
  EXPECT_EQ(periods.GetItem(3)->NSTP, 4);
  EXPECT_EQ(periods.GetItem(2)->TSMULT, 3);
  EXPECT_EQ(changes.back(), "Apply to All Periods");
  period.NSTP = 0;
  EXPECT_EQ(Cells().ShownCell(1, 5), "");
  ShowProperties(kEngineModflow2000);
  EXPECT_EQ(Cells().Kind(1, 2), CellKind::Check);
  EXPECT_EQ(page->EnterCell(Table(), 1, 2, "1"), "");
  EXPECT_EQ(period.SSTR, 1);
}

}  // namespace
}  // namespace tervane::stress_period_pages_test
