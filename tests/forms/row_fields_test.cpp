// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "forms/row_fields.h"

#include <gmock/gmock.h>

#include "document/flow_model_document.h"
#include "simspec/extra_params.h"
#include "tests/support/table_page.h"

namespace tervane::row_fields_test {
namespace {

class FieldsOfARow : public testing::Test {
 protected:
  FieldsOfARow() { Open(test::TablePage::ThreeRows()); }
  void Open(std::vector<test::TableRow> rows) {
    page_.rows = std::move(rows);
    page_.Initialize();
  }
  Control& Field(std::string_view label) {
    for (const auto& control : page_.Form().Controls())
      if (control->label == label) return *control;
    throw std::runtime_error("no field " + std::string(label));
  }
  std::string Name() { return Field("Name of the season:").Text(); }

  CFlowModelDoc document_;
  NobodyToAsk host_;
  int syncs_ = 0;
  test::TablePage page_{{.document = document_, .host = host_, .updateDoc = {}, .syncSoon = [this] { ++syncs_; }}};
};

TEST_F(FieldsOfARow, ShowAndTakeTheValuesOfTheCurrentRow) {
  EXPECT_EQ(Name(), "Spring") << "a table that can be edited begins with its first row";
  page_.ChooseRow(page_.TableControl(), 2);
  EXPECT_EQ(syncs_, 1);
  page_.ChooseRow(page_.TableControl(), 2);
  EXPECT_EQ(syncs_, 1) << "it was the current row already";
  const struct {
    const char *label, *shown, *typed, *after;
  } cases[] = {
      {"Name of the season:", "Summer", "July", "July"},
      {"Length of the season:", "121.66666666666667", "2 weeks", "14"},
      {"Process of the season:", "1", "0", "0"},
      {"Is marked", "0", "1", "1"},
      {"Start of the season:", "2000/01/01  00:00", "2001-07-01", "2001/07/01  00:00"},
      {"File of the season:", "data/observed.nds0", "b.nds0", "b.nds0"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.label);
    EXPECT_EQ(Field(c.label).Text(), c.shown);
    EXPECT_EQ(page_.Enter(Field(c.label), c.typed), "");
    EXPECT_EQ(Field(c.label).Text(), c.after);
  }
  EXPECT_EQ(page_.rows[1].process, 1110);
  EXPECT_EQ(page_.rows[0].name, "Spring");
  EXPECT_THAT(page_.Enter(Field("Length of the season:"), "long"), testing::HasSubstr("expected"));
}

TEST_F(FieldsOfARow, StayWithTheirRowWhenOthersComeAndGo) {
  page_.ChooseRow(page_.TableControl(), 2);
  const struct {
    RowAction action;
    int first, last, current;
    const char* name;
  } cases[] = {
      {RowAction::Insert, 1, 1, 3, "Summer"},   {RowAction::MoveUp, 3, 3, 2, "Summer"},
      {RowAction::MoveDown, 1, 2, 3, "Summer"}, {RowAction::MoveUp, 4, 4, 4, "Summer"},
      {RowAction::Delete, 1, 1, 3, "Summer"},   {RowAction::Delete, 3, 3, 2, "Autumn"},
  };
  for (const auto& c : cases) {
    page_.ChangeRows(page_.TableControl(), c.action, c.first, c.last);
    EXPECT_EQ(page_.table->CurrentRow(), c.current);
    EXPECT_EQ(Name(), c.name);
  }
}

TEST_F(FieldsOfARow, AreDisabledWithoutARowAndWhereTheRowTakesNothing) {
  EXPECT_FALSE(Field("File of the season:").IsEnabled()) << "the first row wants no file";
  page_.ChooseRow(page_.TableControl(), 2);
  EXPECT_TRUE(Field("File of the season:").IsEnabled());
  page_.ChangeRows(page_.TableControl(), RowAction::Delete, 1, 3);
  page_.Form().ForEach([](Control& control) {
    if (control.kind == ControlKind::Table) return;
    EXPECT_FALSE(control.IsEnabled()) << control.label;
    EXPECT_EQ(control.Text(), "") << control.label;
  });
  EXPECT_NE(page_.Enter(Field("Name of the season:"), "x"), "");
  page_.ChangeRows(page_.TableControl(), RowAction::Insert, 0, 0);
  EXPECT_TRUE(Field("Name of the season:").IsEnabled());
}

TEST_F(FieldsOfARow, FollowAnItemThatAnotherPageMoved) {
  CExtraParamsKvf list(&document_.Root());
  list.SetItemCount(3, 1);
  TableOf<CExtraParamsItemKvf> table(list);
  table.Choose(3);
  const auto* item = table.Current();
  list.MoveItemUp(3, 1);
  list.DeleteItem(1, 1);
  table.Follow();
  EXPECT_EQ(table.CurrentRow(), 1);
  EXPECT_EQ(table.Current(), item);
}

}  // namespace
}  // namespace tervane::row_fields_test
