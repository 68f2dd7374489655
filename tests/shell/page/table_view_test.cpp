// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/page/table_view.h"

#include <QHeaderView>
#include <QTableView>
#include <QToolButton>

#include <gmock/gmock.h>

#include "tests/shell/opened_setup.h"

namespace tervane {
namespace {

/// Rows of extra parameters with the names that are given, one letter each.
std::string Parameters(std::string_view names) {
  std::string text = "section ExtraParams {\nNoOfParams = " + std::to_string(names.size()) + "\n";
  int number = 0;
  for (const char name : names)
    text += "section ExtraParam_" + std::to_string(++number) + " {\nName = \"" + name + "\"\nType = 3\nValue = \"" +
            name + "\"\n}\n";
  return text + "}";
}

class OpenedTable : public test::OpenedSetup {
 public:
  explicit OpenedTable(std::string_view names) : OpenedSetup(Parameters(names)) {
    GoTo("ExtraParams");
    table_ = Frame().findChild<TableView*>();
    view_ = table_->findChild<QTableView*>();
    view_->setFocus();
  }
  TableView& Table() { return *table_; }
  QTableView& View() { return *view_; }
  std::string Names() {
    std::string names;
    for (int row = 0; row < view_->model()->rowCount(); ++row)
      names += view_->model()->index(row, 0).data().toString().toStdString();
    return names;
  }
  void SelectCells(int firstRow, int firstColumn, int lastRow, int lastColumn) {
    const auto index = [&](int row, int column) { return view_->model()->index(row - 1, column - 1); };
    view_->setCurrentIndex(index(firstRow, firstColumn));
    view_->selectionModel()->select(QItemSelection(index(firstRow, firstColumn), index(lastRow, lastColumn)),
                                    QItemSelectionModel::ClearAndSelect);
  }
  void PressButton(const QString& text) {
    for (QToolButton* button : table_->findChildren<QToolButton*>())
      if (button->text() == text) button->click();
  }

 private:
  TableView* table_;
  QTableView* view_;
};

TEST(TableView, KeysWithControlActOnTheRowOfTheCurrentCell) {
  const struct {
    const char* names;
    int row;
    Qt::Key key;
    const char* after;
    int rowAfter;
  } cases[] = {
      {"abc", 2, Qt::Key_Up, "bac", 1},   {"abc", 1, Qt::Key_Up, "abc", 1},    {"abc", 2, Qt::Key_Down, "acb", 3},
      {"abc", 3, Qt::Key_Down, "abc", 3}, {"abc", 2, Qt::Key_Delete, "ac", 2}, {"abc", 3, Qt::Key_Delete, "ab", 2},
      {"", 0, Qt::Key_Insert, "", 0},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(std::string(c.names) + " to " + c.after);
    OpenedTable table(c.names);
    if (c.row > 0) table.Table().SelectCell(c.row, 1);
    table.Press(c.key, Qt::ControlModifier);
    EXPECT_EQ(table.Names(), c.after);
    EXPECT_EQ(table.View().currentIndex().row() + 1, c.rowAfter);
    const bool changed = std::string(c.names) != c.after;
    EXPECT_EQ(table.Session().Steps().CanUndo(), changed);
    table.Frame().Undo();
    EXPECT_EQ(table.Names(), c.names);
  }
}

TEST(TableView, ButtonsActOnWholeRowsThatAreSelected) {
  OpenedTable table("abcd");
  table.SelectCells(2, 1, 3, 3);
  table.PressButton("Up");
  EXPECT_EQ(table.Names(), "bcad");
  table.PressButton("Down");
  table.PressButton("Down");
  EXPECT_EQ(table.Names(), "adbc");
  table.PressButton("Delete");
  EXPECT_EQ(table.Names(), "ad");
  EXPECT_EQ(table.Session().Steps().UndoName(), "Delete 2 Parameters");
  table.View().clearSelection();
  table.PressButton("Insert");
  EXPECT_EQ(table.View().model()->rowCount(), 3);
  for (int i = 0; i < 5; ++i) table.Frame().Undo();
  EXPECT_EQ(table.Names(), "abcd");
}

TEST(TableView, CellsAreCopiedPastedAndFilledDownAsInASpreadsheet) {
  OpenedTable table("abc");
  table.SelectCells(1, 1, 2, 2);
  table.Press(Qt::Key_C, Qt::ControlModifier);
  EXPECT_EQ(QApplication::clipboard()->text(), "a\tText\nb\tText\n");
  QApplication::clipboard()->setText("x\tInteger\t7\r\ny\tFloat\t0.5\r\n");
  table.SelectCells(3, 1, 3, 1);
  table.Press(Qt::Key_V, Qt::ControlModifier);
  EXPECT_EQ(table.Names(), "abxy");
  EXPECT_EQ(table.Value("ExtraParams/ExtraParam_4:Value"), "0.5");
  table.SelectCells(1, 1, 3, 1);
  table.Press(Qt::Key_D, Qt::ControlModifier);
  EXPECT_EQ(table.Names(), "aaay");
  table.Press(Qt::Key_Delete);
  EXPECT_EQ(table.Names(), "y");
  for (int i = 0; i < 3; ++i) table.Frame().Undo();
  EXPECT_EQ(table.Names(), "abc");
}

TEST(TableView, AValueThatTheCellRefusesStaysInItsEditor) {
  OpenedTable table("a");
  table.View().setCurrentIndex(table.View().model()->index(0, 1));
  table.View().model()->setData(table.View().currentIndex(), "1", Qt::EditRole);
  ASSERT_EQ(table.Value("ExtraParams/ExtraParam_1:Type"), "1");
  table.View().setCurrentIndex(table.View().model()->index(0, 2));
  table.View().edit(table.View().currentIndex());
  auto* editor = table.View().findChild<QLineEdit*>();
  ASSERT_TRUE(editor);
  editor->setText("many");
  QTest::keyClick(editor, Qt::Key_Return);
  ASSERT_TRUE(editor->isVisible());
  EXPECT_EQ(editor->text(), "many");
  EXPECT_EQ(table.Value("ExtraParams/ExtraParam_1:Value"), "0");
  editor->setText("12");
  QTest::keyClick(editor, Qt::Key_Return);
  EXPECT_EQ(table.Value("ExtraParams/ExtraParam_1:Value"), "12");
}

TEST(TableView, WhatIsOnlyShownHasLinksAndNothingToChange) {
  test::OpenedSetup setup;
  setup.Command("Data Coverage");
  // The board is computed beside the window.
  auto* table = setup.Frame().findChild<TableView*>();
  ASSERT_TRUE(table);
  auto* view = table->findChild<QTableView*>();
  ASSERT_TRUE(QTest::qWaitFor([&] { return view->model()->rowCount() > 0; }));
  EXPECT_EQ(view->model()->index(0, 0).data().toString(), "Model Domain and Grid");
  EXPECT_FALSE(view->model()->flags(view->model()->index(0, 0)) & Qt::ItemIsEditable);
  for (const QToolButton* button : table->findChildren<QToolButton*>()) EXPECT_FALSE(button->isVisible());
  QTest::mouseClick(view->viewport(), Qt::LeftButton, {}, view->visualRect(view->model()->index(0, 0)).center());
  EXPECT_TRUE(QTest::qWaitFor([&] { return setup.Frame().CurrentPath() == "Catchment"; }));
}

}  // namespace
}  // namespace tervane
