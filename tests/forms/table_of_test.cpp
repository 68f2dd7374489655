// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "forms/table_of.h"

#include <cmath>

#include <gmock/gmock.h>

#include "document/flow_model_document.h"
#include "tests/support/table_page.h"

namespace tervane::table_of_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;

/// The columns of the test page by their numbers.
enum Column { kName = 1, kStart, kDays, kEnd, kProcess, kSpecies, kX, kPick, kHasFile, kFile, kBrowse, kEdit };

class PlainTable : public testing::Test {
 protected:
  PlainTable() {
    page_.rows = test::TablePage::ThreeRows();
    page_.Initialize();
  }
  TableOf<test::TableRow>& Table() { return *page_.table; }
  test::TableRow& Row(int row) { return page_.rows[static_cast<std::size_t>(row - 1)]; }
  Control& Field(std::string_view label) {
    for (const auto& control : page_.Form().Controls())
      if (control->label == label) return *control;
    throw std::runtime_error("no field " + std::string(label));
  }

  CFlowModelDoc document_;
  NobodyToAsk host_;
  std::vector<std::string> changes_;
  test::TablePage page_{{document_, host_, [this](int hint, const std::string& action, const void*) {
                           changes_.push_back(std::to_string(hint) + " " + action);
                         }}};
};

TEST_F(PlainTable, TellsOfEveryKindOfCell) {
  EXPECT_THAT(
      FormText(page_.Form()),
      HasSubstr("  \"Name\" | \"Start\" date | \"Length [days]\" | \"End\" date read only | \"Process\" of [Porosity | "
                "Bulk density] | "
                "\"Species\" | \"X\" | \"\" button \"Select point in the plot\" | \"Incl. Obs. Data\" | "
                "\"Observed Data File\" over 3 columns | \"\" button | \"\" button\n"
                "  \"Sp\": Spring | 2000/01/01  00:00 | 30 | 2000/01/31  00:00 | Porosity |  of [Nitrate | "
                "Oxygen] |  | [find] | 0 | (read only) | [...] | [Edit...] (disabled)\n"
                "  \"Su\": Summer | 2000/01/01  00:00 | 121.667 | 2000/05/31  16:00 | Bulk density |  of [Sand | "
                "Clay] | 1234567.89 | [find] | 1 | data/observed.nds0 | [...] | [Edit...]\n"));
}

TEST_F(PlainTable, CellsTakeWhatTheyShowAndRefuseTheRest) {
  const struct {
    int row, column;
    const char *typed, *shown, *refused;
  } cases[] = {
      {1, kStart, "2001-02-03", "2001/02/03  00:00", "31.1.2000"},
      {1, kDays, "2 hours", "0.0833333", "long"},
      {1, kProcess, "1120", "Bulk density", "0"},
      {1, kSpecies, "Clay", "Clay", "Nitrate"},
      {1, kX, "3", "3.00", ""},
      {1, kHasFile, "1", "1", "2"},
      {1, kFile, "a.nds0", "a.nds0", "\xFF"},
      {2, kSpecies, "Sand", "Sand", "Oxygen"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.typed);
    EXPECT_EQ(page_.EnterCell(page_.TableControl(), c.row, c.column, c.typed), "");
    EXPECT_EQ(Table().ShownCell(c.row, c.column), c.shown);
    EXPECT_THAT(Table().Enter(c.row, c.column, c.refused), HasSubstr("expected"));
    EXPECT_EQ(Table().ShownCell(c.row, c.column), c.shown);
  }
  EXPECT_EQ(Row(1).process, 1120);
  EXPECT_EQ(Row(1).days, 1.0 / 12);
  EXPECT_EQ(Table().Enter(1, kEnd, "2001-02-03"), "the cell cannot be changed");
  EXPECT_EQ(Table().Enter(3, kFile, "a.nds0"), "the cell cannot be changed") << "no file is wanted there";
  EXPECT_EQ(page_.EnterCell(page_.TableControl(), 1, kName, "March"), "");
  EXPECT_EQ(changes_.back(), "9 Change Name") << "the column has a hint of its own";
  page_.enabled = false;
  EXPECT_EQ(page_.EnterCell(page_.TableControl(), 1, kName, "April"), "the cell cannot be changed");
  EXPECT_FALSE(page_.ChangeRow(page_.TableControl(), RowAction::Delete, 1));
}

TEST_F(PlainTable, WhatIsComputedFromTheRowsAboveFollowsThem) {
  EXPECT_EQ(Table().Cell(3, kEnd), "2000/06/30  16:00");
  Table().Enter(1, kDays, "31");
  EXPECT_EQ(Table().Cell(3, kEnd), "2000/07/01  16:00");
  Table().DeleteRows(2, 2);
  EXPECT_EQ(Table().Cell(2, kEnd), "2000/03/02  00:00");
}

TEST_F(PlainTable, AnAbsentColumnLeavesItsNumberToTheNextOne) {
  EXPECT_EQ(Table().HeadSpan(kFile), 3);
  page_.withX = false;
  page_.UpdateDoc(kDataChanged, "Leave X Out");
  EXPECT_EQ(Table().ColumnCount(), 11);
  EXPECT_TRUE(Table().Column(kX)->IsButton());
  EXPECT_EQ(Table().Head(kFile - 1), "Observed Data File");
  EXPECT_EQ(Table().HeadSpan(kFile - 1), 3);
  EXPECT_EQ(Table().HeadSpan(kFile), 0);
}

TEST_F(PlainTable, ButtonsAreCalledInTheirRowAndPassedOverByTheClipboard) {
  EXPECT_TRUE(Table().Press(2, kEdit));
  EXPECT_FALSE(Table().Press(1, kEdit)) << "it is disabled";
  EXPECT_TRUE(Table().Press(3, kPick));
  EXPECT_FALSE(Table().Press(3, kName));
  EXPECT_THAT(page_.pressed, ElementsAre("edit Summer", "pick Autumn"));

  Row(1).x = 1.0 / 3;
  const std::string copied = Table().CopyText({1, kProcess, 2, kEdit});
  EXPECT_EQ(copied, "Porosity\t\t0.3333333333333333\t0\t\nBulk density\t\t1234567.891\t1\tdata/observed.nds0\n");
  EXPECT_EQ(Table().CopyText({1, kBrowse, 2, kEdit}), "");
  Row(2).process = 1110;
  Row(2).file = {};
  // The cell of the first row's file is empty and takes nothing.
  EXPECT_EQ(Table().Paste(OneCell(1, kProcess), copied).Message(), "");
  EXPECT_EQ(Row(1).x, 1.0 / 3);
  EXPECT_EQ(Row(2).process, 1120);
  EXPECT_EQ(Row(2).file.Text(), "data/observed.nds0");
  EXPECT_EQ(Table().Paste(OneCell(1, kPick), "yes\tq.nds0").Message(), "");
  EXPECT_EQ(Row(1).file.Text(), "q.nds0") << "the text goes on behind the button";
}

TEST_F(PlainTable, FillingDownKeepsAllDigitsAndWhatTheRowsOffer) {
  Row(1).days = 1.0 / 3;
  Row(1).start = CYbDateTime(1999, 12, 31, 6);
  Row(1).species = "Oxygen";
  const CellsResult result = Table().FillDown({1, kStart, 3, kEdit});
  EXPECT_EQ(Row(3).days, 1.0 / 3);
  EXPECT_EQ(Row(3).start, CYbDateTime(1999, 12, 31, 6));
  EXPECT_EQ(Row(2).process, 1110);
  EXPECT_EQ(Row(2).species, "Oxygen") << "the process that offers it was filled before";
  EXPECT_EQ(Row(2).hasFile, false);
  EXPECT_TRUE(std::isnan(Row(2).x));
  EXPECT_EQ(result.Message(), "row 2, Observed Data File: the cell cannot be changed");
  EXPECT_EQ(Table().Clear({1, 1, 3, 99}).taken, 3) << "names alone: the files are grey now";
}

TEST_F(PlainTable, ValuesAreInsertedDeletedAndMovedUnlessTheyAreToStay) {
  EXPECT_EQ(Table().ChangeRow(RowAction::MoveUp, 3), kOrderChanged);
  EXPECT_EQ(Table().InsertRows(1, 2), kItemAdded | kOrderChanged);
  EXPECT_EQ(Table().RowCount(), 5);
  EXPECT_EQ(Table().Cell(4, kName) + Table().Cell(5, kName), "AutumnSummer");
  EXPECT_EQ(Table().ChangeRow(RowAction::MoveDown, 5), 0);
  Table().KeepOrder();
  EXPECT_EQ(Table().ChangeRow(RowAction::MoveUp, 5), 0);
  EXPECT_EQ(Table().DeleteRows(1, 2), kItemDeleted);
  Table().KeepRows();
  EXPECT_EQ(Table().DeleteRows(1, 1) + Table().InsertRows(0, 0), 0);
  EXPECT_EQ(Table().Paste(OneCell(3, kName), "a\nb").Message(), "row 4, Name: the list takes no further rows");
  EXPECT_EQ(Table().Cell(3, kName), "a");
}

}  // namespace
}  // namespace tervane::table_of_test
