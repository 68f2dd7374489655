// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/page/table_view.h"

#include <QAbstractItemView>
#include <QCalendarWidget>
#include <QComboBox>
#include <QCompleter>
#include <QDropEvent>
#include <QHeaderView>
#include <QMimeData>
#include <QRegularExpression>
#include <QTableView>
#include <QToolButton>
#include <QUrl>
#include <algorithm>

#include <gmock/gmock.h>

#include "tests/shell/opened_setup.h"
#include "tests/support/table_page.h"

namespace tervane::table_view_test {
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

/// The columns of the test page by their numbers.
enum Column { kName = 1, kStart, kDays, kEnd, kProcess, kSpecies, kX, kPick, kHasFile, kFile, kBrowse, kEdit };

/// The page with every kind of cell, worked as a user works it.
class ShownTable {
 public:
  explicit ShownTable(std::vector<test::TableRow> rows = test::TablePage::ThreeRows(), QSize size = {1400, 640},
                      const CellChoices& furtherProcesses = {}) {
    page_.rows = std::move(rows);
    page_.processes.insert(page_.processes.end(), furtherProcesses.begin(), furtherProcesses.end());
    page_.Initialize();
    shown_ = std::make_unique<PageView>(page_);
    page_.FollowItself([this] { shown_->Sync(); }, [this] { shown_->Sync(); });
    shown_->resize(size);
    shown_->show();
    shown_->activateWindow();
    QApplication::processEvents();
    table_ = shown_->findChild<TableView*>();
    cells_ = table_->findChild<QTableView*>();
    cells_->setFocus();
  }
  test::TablePage& Page() { return page_; }
  PageView& Shown() { return *shown_; }
  QTableView& Cells() { return *cells_; }
  test::TableRow& Row(int row) { return page_.rows[static_cast<std::size_t>(row - 1)]; }
  void GoTo(int row, int column) { table_->SelectCell(row, column); }
  std::pair<int, int> Current() const {
    return {cells_->currentIndex().row() + 1, cells_->currentIndex().column() + 1};
  }
  /// Presses a key where the keyboard is: in an editor, or in the table.
  void Press(Qt::Key key, Qt::KeyboardModifiers modifiers = Qt::NoModifier) {
    QTest::keyClick(shown_->focusWidget(), key, modifiers);
    QApplication::processEvents();
  }
  void Type(const QString& text) {
    for (const QChar& letter : text) QTest::keyClicks(shown_->focusWidget(), QString(letter));
  }
  void PressButton(const QString& text) {
    for (QToolButton* button : table_->findChildren<QToolButton*>())
      if (button->text() == text) button->click();
  }
  void Click(int row, int column) {
    const QModelIndex index = cells_->model()->index(row - 1, column - 1);
    cells_->scrollTo(index);
    QTest::mouseClick(cells_->viewport(), Qt::LeftButton, {}, cells_->visualRect(index).center());
    QApplication::processEvents();
  }
  std::string Names() {
    std::string names;
    for (const test::TableRow& row : page_.rows) names += row.name + " ";
    return names;
  }

 private:
  CFlowModelDoc document_;
  NobodyToAsk host_;
  test::TablePage page_{{document_, host_, {}}};
  std::unique_ptr<PageView> shown_;
  TableView* table_;
  QTableView* cells_;
};

TEST(TableView, ATableThatIsOnlyReadHasNoStripAboveItAndNoCutHeads) {
  test::OpenedSetup setup(
      "section SimSpec {\nsection ModelComp {\nWQ = 1\n}\n}\nsection Species {\nNumberOfSpecies = 2\n}\n", {900, 700});
  setup.GoTo("Species");
  const auto tables = setup.Frame().findChildren<TableView*>();
  ASSERT_EQ(tables.size(), 2);
  QTableView* matrix = tables.back()->findChild<QTableView*>();
  EXPECT_EQ(matrix->y(), 0);
  EXPECT_GT(tables.front()->findChild<QTableView*>()->y(), 0) << "one with buttons has them";
  const QFontMetrics metrics(matrix->font());
  for (int column = 0; column < matrix->model()->columnCount(); ++column)
    for (const QString& word :
         matrix->model()->headerData(column, Qt::Horizontal).toString().split(QRegularExpression("\\s")))
      EXPECT_LT(metrics.horizontalAdvance(word), matrix->columnWidth(column)) << FromQt(word);
}

TEST(TableView, KeysGoOnAsInASpreadsheet) {
  using Cell = std::pair<int, int>;
  const struct {
    Cell from;
    Qt::Key key;
    Qt::KeyboardModifiers modifiers;
    Cell to;
  } cases[] = {
      {{1, 1}, Qt::Key_Tab, Qt::NoModifier, {1, 2}},         {{1, kEdit}, Qt::Key_Tab, Qt::NoModifier, {2, 1}},
      {{2, 1}, Qt::Key_Backtab, Qt::ShiftModifier, {1, 12}}, {{1, 1}, Qt::Key_Return, Qt::NoModifier, {2, 1}},
      {{3, 2}, Qt::Key_Enter, Qt::ShiftModifier, {2, 2}},    {{3, 2}, Qt::Key_Return, Qt::NoModifier, {3, 2}},
  };
  for (const auto& c : cases) {
    ShownTable table;
    table.GoTo(c.from.first, c.from.second);
    table.Press(c.key, c.modifiers);
    EXPECT_EQ(table.Current(), c.to);
  }
  // The same out of an editor, which hands its value over.
  ShownTable table;
  table.GoTo(1, kName);
  table.Press(Qt::Key_F2);
  table.Press(Qt::Key_End);
  table.Type("!");
  table.Press(Qt::Key_Return);
  table.Type("July");
  table.Press(Qt::Key_Tab);
  EXPECT_EQ(table.Names(), "Spring! July Autumn ");
  EXPECT_EQ(table.Current(), Cell(2, kStart));
  table.Type("2001-02-03");
  table.Press(Qt::Key_Tab);
  table.Type("many");
  table.Press(Qt::Key_Tab);
  EXPECT_EQ(table.Row(2).start, CYbDateTime(2001, 2, 3));
  EXPECT_EQ(table.Current(), Cell(2, kDays)) << "what is refused stays";
  table.Press(Qt::Key_Escape);
  // At its end the table gives the keyboard away.
  table.GoTo(3, kEdit);
  table.Press(Qt::Key_Tab);
  EXPECT_FALSE(table.Cells().hasFocus());
}

TEST(TableView, ANewRowTakesWhatIsTyped) {
  ShownTable table;
  table.PressButton("Insert");
  table.Type("Winter");
  table.Press(Qt::Key_Return);
  EXPECT_EQ(table.Names(), "Spring Summer Autumn Winter ");
  table.GoTo(2, kDays);
  table.Press(Qt::Key_Insert, Qt::ControlModifier);
  table.Type("May");
  table.Press(Qt::Key_Return);
  EXPECT_EQ(table.Names(), "Spring May Summer Autumn Winter ");
  table.Cells().selectRow(0);
  table.PressButton("Insert");
  table.PressButton("Insert");
  table.Type("March");
  table.Press(Qt::Key_Return);
  EXPECT_EQ(table.Names(), "March  Spring May Summer Autumn Winter ") << "rows that are selected stay so";
}

TEST(TableView, ButtonsActOnTheRowOfTheCurrentCellWhereNoRowIsSelected) {
  ShownTable table;
  table.GoTo(2, kDays);
  table.PressButton("Up");
  EXPECT_EQ(table.Names(), "Summer Spring Autumn ");
  EXPECT_EQ(table.Current(), std::pair(1, static_cast<int>(kDays)));
  table.PressButton("Down");
  table.PressButton("Down");
  EXPECT_EQ(table.Names(), "Spring Autumn Summer ");
  table.PressButton("Delete");
  EXPECT_EQ(table.Names(), "Spring Autumn ");
  EXPECT_EQ(table.Current().first, 2);
}

TEST(TableView, TheCurrentRowOfThoseSelectedIsAppliedToAllRows) {
  ShownTable table;
  table.GoTo(2, kDays);
  const auto index = [&](int row, int column) { return table.Cells().model()->index(row - 1, column - 1); };
  table.Cells().selectionModel()->select(QItemSelection(index(1, kDays), index(3, kProcess - 1)),
                                         QItemSelectionModel::ClearAndSelect);
  table.Press(Qt::Key_D, Qt::ControlModifier | Qt::AltModifier);
  for (const int row : {1, 2, 3}) EXPECT_EQ(table.Row(row).days, 365.0 / 3);
  EXPECT_EQ(table.Row(1).process, 1110);
  EXPECT_EQ(table.Names(), "Spring Summer Autumn ");
}

TEST(TableView, ButtonsInCellsArePressedByMouseAndKeyboard) {
  ShownTable table;
  table.Click(2, kEdit);
  table.Click(1, kEdit);  // it is disabled
  table.Click(3, kPick);
  table.GoTo(1, kBrowse);
  table.Press(Qt::Key_Space);
  EXPECT_THAT(table.Page().pressed, testing::ElementsAre("edit Summer", "pick Autumn", "browse Spring"));
}

TEST(TableView, ADateIsChosenInTheCalendarOfItsCell) {
  ShownTable table;
  table.GoTo(3, kStart);
  table.Press(Qt::Key_Down, Qt::AltModifier);
  auto* calendar = table.Cells().findChild<QCalendarWidget*>();
  ASSERT_TRUE(calendar);
  EXPECT_EQ(calendar->selectedDate(), QDate(2000, 9, 1));
  emit calendar->activated(QDate(2002, 3, 4));
  EXPECT_EQ(table.Row(3).start, CYbDateTime(2002, 3, 4, 12, 30)) << "the time of day stays";
}

TEST(TableView, ATextOffersWhatItsRowKnowsAndTakesAnyOther) {
  ShownTable table;
  const auto open = [&](int row) {
    table.GoTo(row, kName);
    table.Press(Qt::Key_F2);
    // One that was closed may still be there.
    const auto editors = table.Cells().findChildren<QLineEdit*>();
    return editors.isEmpty() ? nullptr : editors.last();
  };
  QLineEdit* edit = open(2);
  ASSERT_TRUE(edit && edit->completer());
  edit->actions().constLast()->trigger();
  EXPECT_TRUE(edit->completer()->popup()->isVisible());
  EXPECT_EQ(edit->completer()->model()->index(0, 0).data().toString(), "Half-year");
  EXPECT_EQ(edit->completer()->completionCount(), 2) << "all of them, whatever the cell holds";
  emit edit->completer()->activated(QString("Winter"));
  EXPECT_EQ(table.Row(2).name, "Winter");
  edit = open(2);
  edit->selectAll();
  table.Type("alf");
  EXPECT_EQ(edit->completer()->completionCount(), 1) << "those that hold what is typed";
  table.Type("red");
  table.Press(Qt::Key_Return);
  EXPECT_EQ(table.Row(2).name, "alfred");
}

TEST(TableView, AChoiceOffersWhatItsRowHas) {
  ShownTable table;
  const auto open = [&](int row, int column) {
    table.GoTo(row, column);
    table.Press(Qt::Key_F2);
    return table.Cells().findChild<QComboBox*>();
  };
  auto* list = open(2, kSpecies);
  ASSERT_TRUE(list);
  EXPECT_EQ(list->itemText(0) + list->itemText(1), "SandClay");
  EXPECT_EQ(list->currentIndex(), -1) << "none is chosen yet";
  table.Type("c");
  EXPECT_EQ(table.Row(2).species, "Clay");
  QApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
  list = open(2, kProcess);
  ASSERT_TRUE(list);
  EXPECT_EQ(list->currentText(), "Bulk density");
  table.Type("p");
  EXPECT_EQ(table.Row(2).process, 1110);
}

TEST(TableView, AChoiceOfManyIsFoundByItsNameWhileTyping) {
  CellChoices rates;
  for (int code = 1; code <= 14; ++code) rates.push_back({code, "Rate " + std::to_string(code)});
  rates.push_back({77, "Rate 14"});
  ShownTable table(test::TablePage::ThreeRows(), {1400, 640}, rates);
  const auto open = [&] {
    QApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    table.GoTo(1, kProcess);
    table.Press(Qt::Key_F2);
    return table.Cells().findChild<QLineEdit*>();
  };
  QLineEdit* edit = open();
  ASSERT_TRUE(edit && edit->completer());
  EXPECT_EQ(edit->text(), "Porosity");
  edit->selectAll();
  table.Type("E 1");
  EXPECT_EQ(edit->completer()->completionCount(), 7) << "1, 10 to 13, and 14 twice";
  table.Press(Qt::Key_Return);
  EXPECT_EQ(table.Row(1).process, 1110) << "that means none of them";
  EXPECT_TRUE(edit->isVisible());
  table.Type("2");
  table.Press(Qt::Key_Return);
  EXPECT_EQ(table.Row(1).process, 12);
  edit = open();
  edit->selectAll();
  table.Type("rate 1");
  table.Press(Qt::Key_Return);
  EXPECT_EQ(table.Row(1).process, 1) << "a whole name, though others begin with it";
  // Of two with one name each can be told.
  edit = open();
  edit->completer()->setCompletionPrefix("14");
  EXPECT_EQ(edit->completer()->completionCount(), 2);
  emit edit->completer()->activated(QString("Rate 14 (77)"));
  EXPECT_EQ(table.Row(1).process, 77);
  // As any other cell, it opens by the first letter.
  QApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
  table.GoTo(1, kProcess);
  table.Type("bulk");
  table.Press(Qt::Key_Return);
  EXPECT_EQ(table.Row(1).process, 1120);
}

TEST(TableView, AFileIsDroppedOnItsCellOrOnAButtonBesideIt) {
  ShownTable table;
  const auto drop = [&](int row, int column, const QList<QUrl>& urls) {
    const QModelIndex index = table.Cells().model()->index(row - 1, column - 1);
    const QPointF place = table.Cells().visualRect(index).center();
    QMimeData dragged;
    dragged.setUrls(urls);
    QDragEnterEvent enter(place.toPoint(), Qt::CopyAction, &dragged, Qt::LeftButton, Qt::NoModifier);
    QApplication::sendEvent(table.Cells().viewport(), &enter);
    QDropEvent event(place, Qt::CopyAction, &dragged, Qt::LeftButton, Qt::NoModifier);
    QApplication::sendEvent(table.Cells().viewport(), &event);
    return event.isAccepted();
  };
  const QList<QUrl> file{QUrl::fromLocalFile("/data/flow.nds0")};
  EXPECT_TRUE(drop(2, kEdit, file));
  EXPECT_EQ(table.Row(2).file.Absolute(), "/data/flow.nds0");
  EXPECT_TRUE(drop(2, kFile, {QUrl::fromLocalFile("/data/level.nds0")}));
  EXPECT_EQ(table.Row(2).file.Absolute(), "/data/level.nds0");
  EXPECT_FALSE(drop(1, kBrowse, file)) << "its file is not asked for";
  EXPECT_FALSE(drop(2, kPick, file)) << "this button is that of a place";
  EXPECT_FALSE(drop(2, kFile, file + file));
  EXPECT_EQ(table.Row(2).file.Absolute(), "/data/level.nds0");
}

TEST(TableView, ColumnsComeAndGoAndHeadsGoOverThem) {
  ShownTable table;
  QHeaderView& head = *table.Cells().horizontalHeader();
  EXPECT_GE(head.height(), 2 * head.fontMetrics().height()) << "a head of two lines is seen as a whole";
  EXPECT_EQ(head.sectionResizeMode(kEdit - 1), QHeaderView::Fixed);
  table.GoTo(2, kName);
  table.Page().withX = false;
  table.Shown().Sync();
  EXPECT_EQ(table.Cells().model()->columnCount(), 11);
  EXPECT_EQ(table.Current().first, 2) << "the row stays";
  EXPECT_EQ(head.sectionResizeMode(kEdit - 2), QHeaderView::Fixed);
  // One head lies over three columns: no line parts it.
  const QImage picture = head.grab().toImage();
  const int border = head.sectionViewportPosition(kBrowse - 2), y = picture.height() / 2;
  for (int x = border - 2; x <= border + 2; ++x) EXPECT_EQ(picture.pixel(x, y), picture.pixel(border - 3, y)) << x;
}

TEST(TableView, FieldsBelowFollowTheCurrentRow) {
  ShownTable table;
  const auto field = [&](const QString& name) {
    for (QLineEdit* line : table.Shown().findChildren<QLineEdit*>())
      if (line->accessibleName() == name) return line;
    return static_cast<QLineEdit*>(nullptr);
  };
  QLineEdit* length = field("Length of the season:");
  ASSERT_TRUE(length);
  EXPECT_EQ(length->text(), "30");
  table.Click(2, kName);
  EXPECT_EQ(length->text(), "121.66666666666667");
  length->setFocus();
  length->selectAll();
  table.Type("long");
  table.Press(Qt::Key_Return);
  EXPECT_EQ(length->text(), "long") << "what is refused stays";
  table.Click(3, kName);
  EXPECT_EQ(length->text(), "30") << "in its row alone";
  table.PressButton("Up");
  length->setFocus();
  length->selectAll();
  table.Type("7");
  table.Press(Qt::Key_Return);
  EXPECT_EQ(table.Names() + std::to_string(table.Row(2).days), "Spring Autumn Summer 7.000000");
  for (int i = 0; i < 3; ++i) table.PressButton("Delete");
  EXPECT_FALSE(length->isEnabled());
  EXPECT_EQ(length->text(), "");
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

TEST(TableView, RowsOfAllStationsAreFilteredSortedAndOpened) {
  test::OpenedSetup setup(test::Example{"rhone", "rhone.tvd"});
  setup.GoTo("Climate/PrecipitationRate");
  const auto tables = setup.Frame().findChildren<TableView*>();
  const auto shown = std::ranges::find_if(tables, &TableView::isVisible);
  ASSERT_NE(shown, tables.end());
  TableView& table = **shown;
  const auto& cells = *static_cast<QTableView*>(table.FocusTarget())->model();
  const auto text = [&cells](int row, int column) { return FromQt(cells.index(row, column).data().toString()); };
  ASSERT_EQ(cells.rowCount(), 50);
  // The areas await the ground, the means the series.
  EXPECT_TRUE(QTest::qWaitFor([&] { return !text(0, 5).empty() && !text(0, 8).empty(); }, 20000));
  auto* filter = table.findChild<QLineEdit*>();
  QTest::keyClicks(filter, "gauge 1");
  EXPECT_LT(cells.rowCount(), 50);
  EXPECT_TRUE(setup.Shows(QString("%1 of 50").arg(cells.rowCount())));
  auto& head = *static_cast<QTableView*>(table.FocusTarget())->horizontalHeader();
  const QPoint cellsHead(head.sectionViewportPosition(6) + 5, head.height() / 2);
  for (const bool isDescending : {false, true}) {
    QTest::mouseClick(head.viewport(), Qt::LeftButton, {}, cellsHead);
    EXPECT_EQ(std::stoi(text(0, 6)) > std::stoi(text(1, 6)), isDescending);
  }
  const std::string first = text(0, 1);
  filter->clear();
  EXPECT_EQ(cells.rowCount(), 50);
  QTest::keyClicks(filter, ToQt(first));
  auto* view = static_cast<QTableView*>(table.FocusTarget());
  QTest::mouseClick(view->viewport(), Qt::LeftButton, {}, view->visualRect(cells.index(0, 0)).center());
  EXPECT_TRUE(QTest::qWaitFor([&] { return setup.Frame().CurrentPath().find("TIME_SERIES_") != std::string::npos; }));
}

}  // namespace
}  // namespace tervane::table_view_test
