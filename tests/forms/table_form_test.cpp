// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "forms/table_form.h"

#include <gmock/gmock.h>

#include "forms/table_of.h"
#include "platform/text.h"
#include "simspec/extra_params.h"
#include "tests/support/page_driver.h"
#include "tests/support/setup.h"

namespace tervane::table_form_test {
namespace {

using test::PageDriver;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;

class ExtraParamsTable : public testing::Test {
 protected:
  TableForm& Table() { return *page.Page().Form().Controls().front()->table; }
  std::string Names() {
    std::string names;
    for (int row = 1; row <= Table().RowCount(); ++row) names += Table().Cell(row, 1);
    return names;
  }
  void Fill(std::string_view names) {
    for (const char name : names) {
      Table().InsertRows(0, 0);
      Table().Enter(Table().RowCount(), 1, std::string(1, name));
    }
  }

  CExtraParamsKvf& List() { return static_cast<CExtraParamsKvf&>(page.Page().Node()); }

  CFlowModelDoc document;
  PageDriver page{document, "ExtraParams"};
};

TEST_F(ExtraParamsTable, TheFirstSelectedRowIsTheCurrentOneWhereTheSelectionHasLeftIt) {
  EXPECT_EQ(Table().FirstSelected(), 0);
  Fill("abcd");
  Table().Choose(3);
  EXPECT_EQ(Table().FirstSelected(), 3);
  Table().Select(2, 3);
  EXPECT_EQ(Table().FirstSelected(), 2);
  Table().Choose(4);
  EXPECT_EQ(Table().FirstSelected(), 4);
}

TEST_F(ExtraParamsTable, RowsAreInsertedDeletedAndMovedAsAWhole) {
  using Operation = int (TableForm::*)(int, int);
  struct Case {
    Operation operation;
    int first, last, hint;
    const char* names;
  };
  const Case cases[] = {
      {&TableForm::InsertRows, 0, 0, kItemAdded, "abcd "},
      {&TableForm::InsertRows, 1, 2, kItemAdded | kOrderChanged, "  abcd"},
      {&TableForm::InsertRows, 3, 3, kItemAdded, "ab cd"},
      {&TableForm::DeleteRows, 2, 3, kItemDeleted, "ad"},
      {&TableForm::DeleteRows, 0, 0, 0, "abcd"},
      {&TableForm::MoveRowsUp, 2, 3, kOrderChanged, "bcad"},
      {&TableForm::MoveRowsUp, 1, 2, 0, "abcd"},
      {&TableForm::MoveRowsDown, 1, 2, kOrderChanged, "cabd"},
      {&TableForm::MoveRowsDown, 3, 4, 0, "abcd"},
  };
  for (const Case& c : cases) {
    List().SetItemCount(0, 1);
    Fill("abcd");
    EXPECT_EQ((Table().*c.operation)(c.first, c.last), c.hint);
    std::string names;
    for (int row = 1; row <= Table().RowCount(); ++row)
      names += Table().Cell(row, 1).empty() ? " " : Table().Cell(row, 1);
    EXPECT_EQ(names, c.names);
  }
}

TEST_F(ExtraParamsTable, AValueCellFollowsTheTypeOfItsRow) {
  Fill("a");
  struct Case {
    const char *type, *typed, *shown, *refused;
    CellKind kind;
  };
  const Case cases[] = {{"0", "0.25", "0.25", "x", CellKind::Number},
                        {"1", "7", "7", "7.5", CellKind::Integer},
                        {"2", "1", "1", "yes", CellKind::Check},
                        {"3", "a, \"b\"", "a, \"b\"", "\xFF", CellKind::Text},
                        {"4", "x/y.bin", "x/y.bin", "\xFF", CellKind::File}};
  for (const Case& c : cases) {
    ASSERT_EQ(Table().Enter(1, 2, c.type), "");
    EXPECT_EQ(Table().Kind(1, 3), c.kind);
    EXPECT_EQ(Table().Enter(1, 3, c.typed), "");
    EXPECT_EQ(Table().Cell(1, 3), c.shown);
    EXPECT_THAT(Table().Enter(1, 3, c.refused), HasSubstr("expected"));
    EXPECT_EQ(Table().Cell(1, 3), c.shown);
  }
  // Each type has kept its value.
  for (const Case& c : cases) {
    Table().Enter(1, 2, c.type);
    EXPECT_EQ(Table().Cell(1, 3), c.shown);
  }
}

TEST_F(ExtraParamsTable, ACellThatIsNotThereShowsNothingAndTakesNothing) {
  Fill("a");
  const std::pair<int, int> places[] = {{0, 1}, {2, 1}, {1, 0}, {1, 4}};
  for (const auto& [row, column] : places) {
    EXPECT_EQ(Table().Cell(row, column), "");
    EXPECT_THAT(Table().Enter(row, column, "x"), Not(IsEmpty()));
  }
  EXPECT_EQ(page.Page().EnterCell(*page.Page().Form().Controls().front(), 1, 1, "b"), "");
  EXPECT_EQ(Names(), "b");
  EXPECT_THAT(page.Changes(), testing::ElementsAre("1 Change Name"));
}

/// All cells of the extra parameters, as they are copied, with '|' for the tab.
std::string Cells(const TableForm& table) { return Replaced(table.CopyText({1, 1, table.RowCount(), 99}), "\t", "|"); }

TEST_F(ExtraParamsTable, WhatIsCopiedIsPastedAgain) {
  const char* text =
      "plain\tText\ttwo\twords\n"
      "\"a\ttab\"\ttext\t\"two\nlines \"\"quoted\"\"\"\n"
      "n\tInteger\t7\nx\t0\t0.25\nflag\tbool\tYES\nfile\tFilename\ta/b.bin\n";
  const CellsResult result = Table().Paste(OneCell(1, 1), text);
  EXPECT_EQ(result.Message(), "row 1, column 4: the table has 3 columns");
  EXPECT_EQ(result.taken, 18);
  EXPECT_EQ(result.hint, kDataChanged | kItemAdded | kOrderChanged);
  EXPECT_EQ(Table().Cell(2, 3), "two\nlines \"quoted\"");
  EXPECT_EQ(Table().Cell(5, 3), "1");
  const std::string copied = Table().CopyText({1, 1, 99, 99});
  List().SetItemCount(0, 1);
  EXPECT_EQ(Table().Paste(OneCell(9, 1), Replaced(copied, "\n", "\r\n")).refused, 0);
  EXPECT_EQ(Table().Cell(2, 3), "two\r\nlines \"quoted\"");
  EXPECT_EQ(Replaced(Table().CopyText({1, 1, 99, 99}), "\r\n", "\n"), copied);
}

TEST_F(ExtraParamsTable, APasteTakesWhatItCanAndTellsTheRest) {
  struct Case {
    CellRange selected;
    const char *text, *cells, *message;
    int hint;
  };
  const char* start = "a|Float|0\nb|Integer|0\n";
  const int added = kDataChanged | kItemAdded;
  const Case cases[] = {
      {OneCell(1, 1), "A\nB\n", "A|Float|0\nB|Integer|0\n", "", kDataChanged},
      {OneCell(2, 1), "B\r\nC", "a|Float|0\nB|Integer|0\nC|Float|0\n", "", added},
      {{1, 1, 2, 1}, "z", "z|Float|0\nz|Integer|0\n", "", kDataChanged},
      {{1, 2, 2, 3}, "1", "a|Integer|1\nb|Integer|1\n", "", kDataChanged},
      {OneCell(2, 3), "8\nx\n", "a|Float|0\nb|Integer|8\n",
       "row 3, Value: a number with a point, such as 0.5 or 1e-4, was expected", kDataChanged},
      {OneCell(1, 2), "7\nBOOL\tmaybe", "a|Float|0\nb|Bool|0\n",
       "row 1, Type: one of Float, Integer, Bool, Text, Filename was expected\n"
       "row 2, Value: 1 or 0, true or false, yes or no, on or off was expected",
       kDataChanged},
      {OneCell(2, 1), "b\tInteger", start, "", 0},
      {OneCell(1, 4), "x\ny\nz", start,
       "row 1, column 4: the table has 3 columns\nrow 2, column 4: the table has 3 columns\n"
       "row 3, column 4: the table has 3 columns",
       0},
      {OneCell(1, 1), "\"open\tText", "\"\"\"open\"|Text|\nb|Integer|0\n", "", kDataChanged},
      {OneCell(1, 1), "", start, "", 0},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.text);
    List().SetItemCount(0, 1);
    Fill("ab");
    Table().Enter(2, 2, "1");
    const CellsResult result = Table().Paste(c.selected, c.text);
    EXPECT_EQ(Cells(Table()), c.cells);
    EXPECT_EQ(result.Message(), c.message);
    EXPECT_EQ(result.hint, c.hint);
  }
  std::string many;
  for (int row = 0; row < 25; ++row) many += "x\n";
  EXPECT_THAT(Table().Paste(OneCell(1, 2), many).Message(), testing::EndsWith("\nand 15 more"));
}

TEST_F(ExtraParamsTable, FillingDownAndClearingLeaveWhatDoesNotSuit) {
  Table().Paste(OneCell(1, 1), "a\tText\tlong\nb\tInteger\t5\nc\tText\tx\n");
  EXPECT_THAT(Table().FillDown({1, 3, 3, 3}).Message(), HasSubstr("row 2, Value: a whole number"));
  EXPECT_EQ(Cells(Table()), "a|Text|long\nb|Integer|5\nc|Text|long\n");
  EXPECT_EQ(Table().FillDown({1, 2, 3, 3}).Message(), "");
  EXPECT_EQ(Cells(Table()), "a|Text|long\nb|Text|long\nc|Text|long\n");
  Table().Enter(2, 2, "1");
  EXPECT_EQ(Table().Clear({2, 1, 3, 3}).taken, 3);
  EXPECT_EQ(Cells(Table()), "a|Text|long\n|Integer|5\n|Text|\n");
  EXPECT_EQ(Table().Clear({3, 1, 3, 3}).hint, 0);
}

TEST_F(ExtraParamsTable, EachOperationOnThePageIsOneChangeWithItsName) {
  const Control& table = *page.Page().Form().Controls().front();
  CYbSEDlgBase& p = page.Page();
  EXPECT_FALSE(p.ChangeRow(table, RowAction::Insert, 1));  // an empty table has no current row
  EXPECT_TRUE(p.ChangeRows(table, RowAction::Insert, 0, 0));
  EXPECT_TRUE(p.ChangeRow(table, RowAction::Insert, 1));
  EXPECT_FALSE(p.ChangeRow(table, RowAction::MoveUp, 1));
  EXPECT_FALSE(p.ChangeRow(table, RowAction::MoveDown, 2));
  EXPECT_TRUE(p.ChangeRow(table, RowAction::MoveDown, 1));
  p.Paste(table, OneCell(1, 1), "a\nb\nc");
  EXPECT_TRUE(p.ChangeRows(table, RowAction::MoveUp, 2, 3));
  EXPECT_EQ(Names(), "bca");
  p.FillDown(table, {1, 1, 3, 1});
  p.ClearCells(table, {1, 2, 3, 3});  // nothing there can be empty
  p.ClearCells(table, {1, 1, 1, 1});
  EXPECT_TRUE(p.ChangeRows(table, RowAction::Delete, 2, 99));
  EXPECT_TRUE(p.ChangeRow(table, RowAction::Delete, 1));
  EXPECT_EQ(Table().RowCount(), 0);
  EXPECT_THAT(page.Changes(),
              testing::ElementsAre("18 Insert Parameter", "2 Insert Parameter", "16 Move Parameter Down", "3 Paste",
                                   "16 Move 2 Parameters Up", "1 Fill Down", "1 Clear", "4 Delete 2 Parameters",
                                   "4 Delete Parameter"));
}

TEST_F(ExtraParamsTable, ANumberColumnWithAUnitIsShownAndTypedInIt) {
  constexpr int kThickness = 100367, kFoot = 1003;
  using Item = CExtraParamsItemKvf;
  Fill("ab");
  TableOf<Item> table(List());
  table.Value("Depth", &Item::FloatValue).Quantity(kThickness);
  table.Value("Depth", &Item::FloatValue).Unit("[mm]");
  table.Value("Depth", &Item::FloatValue).GreyWhen([](Item&) { return true; });
  DisplayUnits units;
  ASSERT_TRUE(units.Choose(kThickness, kFoot));
  table.SetDisplayUnits(&units);
  EXPECT_EQ(table.Head(1) + ", " + table.Head(2) + ", " + table.Head(3), "Depth [ft], Depth [mm], Depth");
  double& stored = List().GetItem(1)->FloatValue;
  EXPECT_EQ(table.Enter(1, 1, "1"), "");
  EXPECT_EQ(stored, 0.3048);
  EXPECT_EQ(table.Enter(1, 2, "2 m"), "");
  EXPECT_EQ(stored, 2000);
  EXPECT_THAT(table.Enter(1, 3, "3"), HasSubstr("cannot be changed"));
  stored = 1.0 / 3;
  table.FillDown({1, 1, 2, 1});
  EXPECT_EQ(List().GetItem(2)->FloatValue, 1.0 / 3);
  EXPECT_GT(table.UnitChoices(1).size(), 1u);
  EXPECT_THAT(table.UnitChoices(2), IsEmpty());
}

}  // namespace
}  // namespace tervane::table_form_test
