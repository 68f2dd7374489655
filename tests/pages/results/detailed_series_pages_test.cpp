// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/results/detailed_series_pages.h"

#include <gmock/gmock.h>

#include "forms/plots.h"
#include "forms/table_form.h"
#include "results/detailed_series.h"
#include "tests/support/page_driver.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::detailed_series_pages_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

/// The columns of points, and of points of rivers.
enum Column { kName = 1, kType, kPlot, kX, kY, kDepth, kPick, kHasObserved, kObserved, kBrowse };
constexpr int kRiverHasObserved = 5, kRiverObserved = 6;

constexpr const char* kPoints = "StoringOfResults/DetailedTimeseriesOutput";
constexpr const char* kRiverPoints = "StoringOfResults/DetailedFvrTimeseriesOutput";

struct DetailedSeriesPage : testing::Test {
  test::TempFolder folder;
  CFlowModelDoc document;
  std::unique_ptr<test::PageDriver> page;

  void Open(const char* path, const std::string& sections = {}) {
    ASSERT_TRUE(document.OnOpenDocument(folder.Write("karup.tvd", test::SetupText(14, sections)))) << document.Error();
    page = std::make_unique<test::PageDriver>(document, path);
  }
  Control& The(ControlKind kind) {
    for (const auto& control : page->Page().Form().Controls())
      if (control->kind == kind) return *control;
    throw std::runtime_error("there is no such control");
  }
  TableForm& Table() {
    TableForm& table = *The(ControlKind::Table).table;
    table.Follow();
    return table;
  }
  void Import(const std::string& text) {
    page->Outside().Expect("Import Points", std::optional<std::string>(folder.Write("points.txt", text)));
    page->Find("Import...").press();
  }
};

std::string Points(const std::string& items) {
  return "section StoringOfResults {\nsection DetailedTimeseriesOutput {\nNumberOfItems = 2\n" + items + "}\n}\n";
}

TEST_F(DetailedSeriesPage, APointIsPlacedByAClickAndTheButtonPressedAgainGivesUp) {
  Open(kPoints,
       Points("section Item_1 {\nName = \"Mill\"\nHydrComp = 61\nGroup = 0\n}\nsection Item_2 {\nX = 7.0\n}\n"));
  TableForm& table = Table();
  EXPECT_TRUE(table.Press(2, kPick));
  ASSERT_TRUE(The(ControlKind::Map).map().request);
  EXPECT_THAT(The(ControlKind::Map).map().request->prompt, HasSubstr("point 2"));
  EXPECT_TRUE(table.Press(2, kPick));
  EXPECT_FALSE(The(ControlKind::Map).map().request);
  EXPECT_TRUE(table.Press(1, kPick));
  const MapContent map = The(ControlKind::Map).map();
  EXPECT_THAT(map.request->prompt, HasSubstr("point Mill"));
  EXPECT_THAT(map.points.front().labels, ElementsAre("Mill", "2"));
  // The row may have moved meanwhile: the point is meant, not its number.
  page->Page().ChangeRow(The(ControlKind::Table), RowAction::MoveDown, 1);
  map.request->taken({{1234.5, 678}});
  EXPECT_EQ(Table().Cell(2, kName), "Mill");
  EXPECT_EQ(Table().Cell(2, kX), "1234.5");
  EXPECT_EQ(Table().Cell(2, kY), "678");
  EXPECT_EQ(Table().Cell(1, kX), "7");
  EXPECT_THAT(page->Changes().back(), HasSubstr("Select Place of Point"));
  EXPECT_FALSE(The(ControlKind::Map).map().request);
}

TEST_F(DetailedSeriesPage, ADepthBelongsToATypeThatHasOneAndTheFirstRowStartsAPlot) {
  Open(kPoints, Points("section Item_1 {\nName = \"Mill\"\nHydrComp = 61\nGroup = 0\nZ = 4.0\n}\nsection Item_2 {\n"
                       "HydrComp = 102\n}\n"));
  TableForm& table = Table();
  EXPECT_TRUE(table.IsReadOnly(1, kDepth));
  EXPECT_EQ(table.ShownCell(1, kDepth), "");
  EXPECT_FALSE(table.IsReadOnly(2, kDepth));
  EXPECT_TRUE(table.IsReadOnly(1, kPlot));
  EXPECT_FALSE(table.IsReadOnly(2, kPlot));
  EXPECT_EQ(test::ValueOf(document, std::string(kPoints) + "/Item_1:Z"), "4") << "it is kept while it has no meaning";
  // An observed file is asked for where there is one.
  EXPECT_TRUE(table.IsReadOnly(1, kObserved));
  EXPECT_EQ(page->Page().EnterCell(The(ControlKind::Table), 1, kHasObserved, "1"), "");
  EXPECT_FALSE(table.IsReadOnly(1, kObserved));
}

TEST_F(DetailedSeriesPage, AnImportAddsItsPointsAsOneStepAlsoWhereALineStopsIt) {
  Open(kPoints);
  Import("A\t61\t0\t10\t20\t0\t1\tobs/a\t2\r\nB\t102\t1\t30\t40\t5\t0\tb\t1\r\n");
  TableForm& table = Table();
  ASSERT_EQ(table.RowCount(), 2);
  EXPECT_EQ(table.Cell(1, kName) + table.Cell(2, kName), "AB");
  EXPECT_EQ(table.Cell(2, kDepth), "5");
  EXPECT_EQ(table.ShownCell(1, kObserved), "obs/a.nds0");
  EXPECT_EQ(page->Changes().size(), 1);
  // A line with too few columns: the points before it stay, as one step too.
  page->Outside().Expect("Import Points",
                         std::optional<std::string>(folder.Write("short.txt", "C\t61\t0\t1\t2\t0\t0\tc\t1\nD\t61\n")));
  page->Outside().Expect("short.txt, line 2: 2 columns", Host::Answer::Ok);
  page->Find("Import...").press();
  EXPECT_EQ(Table().RowCount(), 3);
  EXPECT_EQ(page->Changes().size(), 2);
  EXPECT_TRUE(page->Outside().IsDone());
}

TEST_F(DetailedSeriesPage, NothingIsImportedIntoASetupThatHasNoPlace) {
  page = std::make_unique<test::PageDriver>(document, kRiverPoints);
  page->Outside().Expect("Import Points",
                         std::optional<std::string>(folder.Write("r.txt", "Mill\t1\tOdense\t12.5\t0\tmill\t2\n")));
  page->Outside().Expect("Document is not saved. Please save document first.", Host::Answer::Ok);
  page->Find("Import...").press();
  EXPECT_EQ(Table().RowCount(), 0);
  EXPECT_THAT(page->Changes(), IsEmpty());
  EXPECT_TRUE(page->Outside().IsDone());

  Open(kRiverPoints);
  Import("Mill\t1\tOdense\t12.5\t1\tmill\t2\n");
  TableForm& table = Table();
  ASSERT_EQ(table.RowCount(), 1);
  EXPECT_EQ(table.ShownCell(1, 2), "Discharge");
  EXPECT_EQ(table.Cell(1, kRiverHasObserved), "1");
  EXPECT_EQ(table.ShownCell(1, kRiverObserved), "mill.nds0");
}

TEST_F(DetailedSeriesPage, PointsOfATableTakeTheTypeOfTheCurrentRow) {
  Open(kPoints, Points("section Item_1 {\nHydrComp = 61\n}\nsection Item_2 {\nHydrComp = 102\n}\n"));
  Table().Choose(2);
  page->Outside().Expect("Points from File", std::optional<std::string>(folder.Write(
                                                 "p.csv", "name,x,y\nMill,10,20\nnowhere,x,1\nBridge,30,40\n")));
  page->Outside().Expect("2 points are added. Not taken", Host::Answer::Ok);
  page->Find("Points from File...").press();
  TableForm& table = Table();
  ASSERT_EQ(table.RowCount(), 4);
  EXPECT_EQ(table.Cell(3, kName) + " " + table.Cell(4, kName), "Mill Bridge");
  EXPECT_EQ(table.Cell(4, kType), "102");
  EXPECT_EQ(table.Cell(4, kY), "40");
  EXPECT_THAT(page->Changes(), ElementsAre(HasSubstr("Add Points of File")));
}

}  // namespace
}  // namespace tervane::detailed_series_pages_test
