// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A table of a page without its class of rows: what views, texts and the clipboard ask. Pages make tables with
// `forms/table_of.h`.
#pragma once

#include <cstdint>
#include <deque>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "forms/cell_value.h"
#include "forms/page_form.h"
#include "forms/table_rows.h"

namespace tervane {

/// A rectangle of cells, all numbers from 1 and inclusive.
struct CellRange {
  int firstRow = 1, firstColumn = 1, lastRow = 1, lastColumn = 1;
};
inline CellRange OneCell(int row, int column) { return {row, column, row, column}; }

/// What is done with rows.
enum class RowAction { Insert, Delete, MoveUp, MoveDown };

/// What became of an operation on many cells.
struct CellsResult {
  int hint = 0;                      ///< Of the change; 0 when nothing was changed.
  int taken = 0;                     ///< Cells that now hold what they were given.
  int refused = 0;                   ///< Cells that kept their value, or that are not there.
  std::vector<std::string> reasons;  ///< "row 3, Value: a whole number was expected", for the first of them.
  CellRange cells;                   ///< What was written to, for the selection.

  /// The reasons for the user, a line each, and how many more there are; empty when every cell was taken.
  std::string Message() const;
  static constexpr std::size_t kMostReasons = 10;
};

/// A column: what its cells show and take, by the number of the row, which is there.
struct TableColumn {
  std::string head;
  std::string key;  ///< Of the rows; empty where a column shows no key, or another one in each row.
  int width = 100;
  int headSpan = 1;                 ///< Over how many columns the head goes, this one included.
  std::string toolTip;              ///< Of the head, and of the cells that have none of their own.
  std::string unit;                 ///< A fixed unit of the numbers, as of a control.
  int itemType = 0;                 ///< The numbers are quantities of that item type; 0 for none.
  std::string format;               ///< Numbers are shown by this printf format, such as "%.6g"; dates by "%Y-%m-%d".
  int hint = kDataChanged;          ///< Of a change in a cell.
  Host::FileQuestion fileQuestion;  ///< Of names of files.
  std::optional<CellKind> kind;     ///< Absent where it follows the value of each row.
  CellChoices choices;              ///< Of a choice, the same in all rows.
  std::function<CellChoices(int row)> rowChoices;  ///< Of a choice that differs from row to row.
  /// What is offered for a text; any other may be typed.
  std::function<std::vector<std::string>(int row)> offers;
  /// The value of a cell, or the text of a button.
  std::function<CellValue(int row)> get;
  /// Takes a value of the type that `get` gives; gives why it is refused. Absent where nothing can be changed.
  std::function<std::string(int row, const CellValue& value)> set;
  /// What a person sees of the value, where that is not what is typed.
  std::function<std::string(int row)> shown;
  std::function<bool(int row)> readOnly;  ///< Of a button: it cannot be pressed.
  std::function<bool()> shownWhen;        ///< Absent columns have no number; asked by `TableForm::Follow`.
  std::function<std::string(int row)> cellToolTip;
  /// The name of an icon in front of a cell's text, or on a button; empty for none.
  std::function<std::string(int row)> icon;
  /// What a click on a cell does: on a button, or on a text that is shown as a link.
  std::function<void(int row)> press;
  /// Forgets what was computed from the rows.
  std::function<void()> forget;

  bool IsButton() const { return kind == CellKind::Button; }
  /// Takes over what the declaration of the key tells.
  void Bind(const BoundKeys::Place& place);
};

/// A table: one row for each item of a list or each of some values. Inserting, deleting and moving rows come with it.
/// Rows and columns count from 1; absent columns do not count. What is not there gives nothing, a text, and is read
/// only.
class TableForm {
 public:
  explicit TableForm(std::shared_ptr<TableRows> rows) : rows_(std::move(rows)) {}
  virtual ~TableForm() = default;

  // ---- Making one

  TableColumn& AddColumn(std::string head);
  /// Takes all columns away, for a table whose columns follow what it shows.
  void ClearColumns();
  /// What a row is called in the names of actions: "Parameter" gives "Insert Parameter", "Delete 3 Parameters".
  /// `many` is said where an s does not make the plural.
  void ItemName(std::string one, std::string many = {});
  /// The cells of a row can be written into all rows, by a command of that name: "Apply to All Periods".
  void OfferToAllRows(std::string command) { toAllRows_ = std::move(command); }
  /// Nothing can be changed: the rows are made by the page.
  void ShowOnly() { isShownOnly_ = true; }
  /// Cells can be changed, but no rows come, go or move.
  void KeepRows() { keepsRows_ = true; }
  /// Rows come and go, but none is moved by the user.
  void KeepOrder() { keepsOrder_ = true; }
  /// Told the row that the user makes the current one.
  void OnChoose(std::function<void(int row)> chosen) { chosen_ = std::move(chosen); }
  /// Something on the page shows the current row, and so follows when it becomes another one.
  void ReportCurrentRow() { reportsCurrent_ = true; }
  /// Texts in front of the rows, instead of their numbers.
  void RowHeads(std::function<std::string(int row)> head) { rowHead_ = std::move(head); }
  void SetDisplayUnits(const DisplayUnits* units) { displayUnits_ = units; }
  /// The node of the page, whose folder names of files are relative to where rows are no nodes.
  void SetNode(const CYbSEKvfBase* node) { node_ = node; }

  // ---- What it shows

  /// Asks anew which columns there are, and which row is the current one when rows came, went or moved.
  void Follow();
  int RowCount() const { return rows_->Count(); }
  int ColumnCount() const { return static_cast<int>(shown_.size()); }
  /// A column that is there; null for other numbers.
  const TableColumn* Column(int column) const;
  /// Empty where no such command is offered.
  const std::string& ToAllRowsCommand() const { return toAllRows_; }
  /// All columns, also those that are absent now.
  const std::deque<TableColumn>& Columns() const { return columns_; }
  bool IsShownOnly() const { return isShownOnly_; }
  bool Allows(RowAction action) const;
  /// "Insert Row", "Move 3 Rows Up".
  std::string ActionName(RowAction action, int rows) const;

  // Another order, or a part, of rows that can be arranged; nothing but what is seen changes.

  bool CanArrange() const { return rows_->CanArrange(); }
  /// By the values of a column: ascending, again descending, and then in their own order.
  void SortBy(int column);
  /// The column by whose values the rows stand, 0 for none, and whether they descend.
  int SortedColumn() const;
  bool IsDescending() const { return isDescending_; }
  /// Only rows that hold a text in some cell, in any case; all for an empty one.
  void Filter(std::string text);
  const std::string& FilterText() const { return filter_; }
  /// Also of those that are left out.
  int AllRows() const { return allRows_; }

  // What a view asks for each cell that it draws: none costs more with more rows.

  /// The value of a cell as it is typed.
  std::string Cell(int row, int column) const;
  /// The same as a person sees it: of a choice the chosen text, of a number its format.
  std::string ShownCell(int row, int column) const;
  CellKind Kind(int row, int column) const;
  bool IsReadOnly(int row, int column) const;
  /// Whether the cell stands back behind others because it takes nothing.
  bool IsGrey(int row, int column) const;
  CellChoices Choices(int row, int column) const;
  std::vector<std::string> Offers(int row, int column) const;
  std::string ToolTip(int row, int column) const;
  std::string Icon(int row, int column) const;
  bool IsLink(int row, int column) const;
  /// The head of a column with the unit of its numbers: "Depth [m]".
  std::string Head(int column) const;
  /// Over how many of the columns that are there the head goes; 0 below the head of a column before.
  int HeadSpan(int column) const;
  /// The units that a user may choose for a column; empty where there is nothing to choose.
  std::vector<UnitChoice> UnitChoices(int column) const;
  bool HasRowHeads() const { return rowHead_ != nullptr; }
  std::string RowHead(int row) const;

  // The same of a column that need not be shown, for fields that stand below the table.

  std::string ShownCell(int row, const TableColumn& column) const;
  bool IsReadOnly(int row, const TableColumn& column) const;
  CellChoices Choices(int row, const TableColumn& column) const;
  std::string Enter(int row, const TableColumn& column, const std::string& typed);
  std::string ToolTip(int row, const TableColumn& column) const;

  // ---- Changing it

  /// Types into a cell; gives what was expected when the cell refuses it, and then nothing reached the row.
  std::string Enter(int row, int column, const std::string& typed);
  /// What a click on a cell does; false where that is nothing.
  bool Press(int row, int column) const;

  /// The row of the current cell, 0 for none. It stays the same row when others come, go or move, as far as rows can
  /// be told apart.
  int CurrentRow() const { return current_; }
  /// Tells the current row from others.
  std::uintptr_t CurrentSubject() const {
    return identity_ ? reinterpret_cast<std::uintptr_t>(identity_) : static_cast<std::uintptr_t>(current_);
  }
  /// Makes a row the current one; false where that changes nothing for anybody.
  bool Choose(int row);
  /// The rows in which a view has selected cells.
  void Select(int first, int last) { selectedFirst_ = first, selectedLast_ = last; }
  /// The first of the selected rows, 0 for none; the current one where the selection has left it.
  int FirstSelected() const {
    return selectedFirst_ <= current_ && current_ <= selectedLast_ ? selectedFirst_ : current_;
  }

  // Many cells at once, as in a spreadsheet: rows of cells that tabs separate. Buttons are passed over.

  /// The cells as they are typed, choices by their texts, rows ended by LF; a cell with a tab, line end or quote stands
  /// in quotes, its quotes doubled.
  std::string CopyText(const CellRange& cells) const;
  /// Writes such a text into the cells from the first of the selection on; one cell alone fills the whole selection.
  /// Choices go by their shown text in any case, or by their stored value; checks take 1, true, yes, on and 0, false,
  /// no, off. Rows are added at the end of the list. Cells that can be taken are; the others keep their values and are
  /// told.
  CellsResult Paste(const CellRange& selected, std::string_view text);
  /// Writes the cells of the first row into those below them, but in columns that are computed.
  CellsResult FillDown(const CellRange& cells);
  /// Writes the cells of the first row into those of all other rows.
  CellsResult FillAll(const CellRange& cells);
  /// Empties texts and file names; cells that have no empty value or cannot be changed are left alone.
  CellsResult Clear(const CellRange& cells);

  /// The row of the current cell alone; gives the hint of the change, 0 when nothing was changed.
  int ChangeRow(RowAction action, int row);

  // The rows are selected as a whole, from `first` to `last`; 0 for no whole row. Each gives the hint of the change, 0
  // when nothing was changed.

  int ChangeRows(RowAction action, int first, int last);
  int InsertRows(int first, int last);
  int DeleteRows(int first, int last);
  int MoveRowsUp(int first, int last);
  int MoveRowsDown(int first, int last);

 private:
  bool IsThere(int row) const { return row >= 1 && row <= RowCount(); }
  FieldUnit UnitOf(const TableColumn& column) const { return {column.unit, column.itemType, displayUnits_}; }
  CellKind Kind(int row, const TableColumn& column) const;
  std::string Cell(int row, const TableColumn& column) const;
  std::string Set(int row, const TableColumn& column, const CellValue& value);
  /// Puts the current row where its row went.
  void MoveCurrent(RowAction action, int first, int last);
  void Forget();
  void Arrange();
  void FollowColumns();
  void FollowCurrent();

  // Of many cells.

  /// Types the shown text of a cell; gives what was expected.
  std::string EnterShown(int row, int column, const std::string& shown);
  /// The same, counted in the result.
  void Put(CellsResult& result, int row, int column, const std::string& shown);
  /// Gives a cell the value of another one of its column, with all digits of a number.
  void PutCopy(CellsResult& result, int row, int column, int sourceRow);
  void Refuse(CellsResult& result, int row, int column, const std::string& expected) const;
  /// The columns from `first` on that a text is pasted into, as many as it needs or those up to the last.
  std::vector<int> PastedColumns(int first, int last, std::size_t count) const;

  std::shared_ptr<TableRows> rows_;
  std::deque<TableColumn> columns_;
  /// A column that is there, and over how many its head goes.
  struct ShownColumn {
    const TableColumn* column;
    int headSpan;
  };
  std::vector<ShownColumn> shown_;
  const DisplayUnits* displayUnits_ = nullptr;
  const CYbSEKvfBase* node_ = nullptr;
  std::string itemName_ = "Row", itemNames_ = "Rows";
  bool isShownOnly_ = false, keepsRows_ = false, keepsOrder_ = false;
  std::function<std::string(int)> rowHead_;
  std::string toAllRows_;
  std::function<void(int)> chosen_;
  bool reportsCurrent_ = false;
  int selectedFirst_ = 0, selectedLast_ = 0;
  const TableColumn* sortedBy_ = nullptr;
  bool isDescending_ = false;
  std::string filter_;
  int allRows_ = 0;
  int current_ = 0;
  const void* identity_ = nullptr;  ///< Of the current row.
};

/// A table as text: heads and rows, cells separated by " | ".
std::string TableText(TableForm& table, int level);

}  // namespace tervane
