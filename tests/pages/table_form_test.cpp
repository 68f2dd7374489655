// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/table_form.h"

#include <gmock/gmock.h>

#include "tests/support/page_driver.h"
#include "tests/support/setup.h"

namespace tervane {
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

  CFlowModelDoc document;
  PageDriver page{document, "ExtraParams"};
};

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
    Table().List().SetItemCount(0, 1);
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
    EXPECT_EQ(Table().Columns()[2].kind(*Table().List().GetItemNode(1)), c.kind);
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

}  // namespace
}  // namespace tervane
