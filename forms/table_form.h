// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <string>
#include <variant>
#include <vector>

#include "core/list.h"
#include "forms/page_form.h"

namespace tervane {

/// How a cell is edited.
enum class CellKind { Text, Number, Integer, Check, Choice, File };

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

/// A column of a table over a list: what its cells show and take, by the row's item.
struct TableColumn {
  std::string head;
  int width = 100;
  std::function<CellKind(CYbSEKvfBase& item)> kind;
  std::function<std::string(CYbSEKvfBase& item)> text;
  /// Takes a typed value; gives what was expected when it is none.
  std::function<std::string(CYbSEKvfBase& item, const std::string& typed)> enter;
  std::vector<std::string> choices;
  std::function<bool(CYbSEKvfBase& item)> readOnly;
  std::string toolTip;
  std::string unit;  ///< A fixed unit of the numbers, as of a control.
  int itemType = 0;  ///< The numbers are quantities of that item type; 0 for none.
  /// The number of a cell, where the column holds numbers.
  std::function<std::variant<float*, double*>(CYbSEKvfBase&)> number;
  /// The name of an icon in front of a cell's text; empty for none.
  std::function<std::string(CYbSEKvfBase& item)> icon;
  /// What a click on a cell does, which is shown as a link.
  std::function<void(CYbSEKvfBase& item)> press;

  /// The numbers are shown and typed in a unit, which then goes before `text` and `enter`.
  bool HasUnit() const { return number && (itemType != 0 || !unit.empty()); }
};

// A value in a cell: as it is shown, and typed. A value that the cell refuses is told and does not reach the item.

std::string CellText(int value);
std::string CellText(float value);
std::string CellText(double value);
std::string CellText(const std::string& value);
std::string CellText(const FileName& value);
std::string TakeCell(int& value, const std::string& typed, const CYbSEKvfBase& item);
std::string TakeCell(float& value, const std::string& typed, const CYbSEKvfBase& item);
std::string TakeCell(double& value, const std::string& typed, const CYbSEKvfBase& item);
std::string TakeCell(std::string& value, const std::string& typed, const CYbSEKvfBase& item);
std::string TakeCell(FileName& value, const std::string& typed, const CYbSEKvfBase& item);

/// A table over a list: one row for each item. Inserting, deleting and moving rows come with it.
class TableForm {
 public:
  explicit TableForm(CYbSEKvfListBaseInterface& list) : list_(list) {}

  TableColumn& Add(std::string head, int width) {
    TableColumn& column = columns_.emplace_back();
    column.head = std::move(head);
    column.width = width;
    return column;
  }
  /// A column over a member of the items, which are of one class: `get(item)` gives a reference to it.
  template <class Item, class Get>
  TableColumn& Column(std::string head, int width, CellKind kind, Get get) {
    TableColumn& column = Add(std::move(head), width);
    column.kind = [kind](CYbSEKvfBase&) { return kind; };
    column.text = [get](CYbSEKvfBase& item) { return CellText(get(static_cast<Item&>(item))); };
    column.enter = [get](CYbSEKvfBase& item, const std::string& typed) {
      return TakeCell(get(static_cast<Item&>(item)), typed, item);
    };
    if constexpr (std::is_floating_point_v<std::remove_reference_t<decltype(get(std::declval<Item&>()))>>)
      column.number = [get](CYbSEKvfBase& item) -> std::variant<float*, double*> {
        return &get(static_cast<Item&>(item));
      };
    return column;
  }
  /// The same for a choice, stored by its number from 0.
  template <class Item, class Get>
  TableColumn& Choice(std::string head, int width, Get get, std::vector<std::string> choices) {
    TableColumn& column = Column<Item>(std::move(head), width, CellKind::Choice, get);
    column.choices = std::move(choices);
    return column;
  }

  /// What a row is called in the names of actions: "Parameter" gives "Insert Parameter", "Delete 3 Parameters".
  /// `many` is said where an s does not make the plural.
  void ItemName(std::string one, std::string many = {});
  /// "Insert Row", "Move 3 Rows Up".
  std::string ActionName(RowAction action, int rows) const;
  void SetDisplayUnits(const DisplayUnits* units) { displayUnits_ = units; }
  /// Nothing can be changed: the rows are made by the page. `chosen` is told the row of the current cell, from 1.
  void ShowOnly(std::function<void(int row)> chosen = {}) {
    isShownOnly_ = true;
    chosen_ = std::move(chosen);
  }
  bool IsShownOnly() const { return isShownOnly_; }
  void Choose(int row) const {
    if (chosen_ && row >= 1 && row <= RowCount()) chosen_(row);
  }
  /// Takes all columns away, for a table whose columns follow what it shows.
  void ClearColumns() { columns_.clear(); }

  CYbSEKvfListBaseInterface& List() const { return list_; }
  const std::vector<TableColumn>& Columns() const { return columns_; }
  int RowCount() const { return list_.GetItemCount(); }

  /// The text of a cell, rows and columns from 1; empty where there is none.
  std::string Cell(int row, int column) const;
  /// Types into a cell; gives what was expected when the cell refuses it, and then nothing reached the item.
  std::string Enter(int row, int column, const std::string& typed);

  // What a view asks for each cell that it draws: none costs more with more rows. Rows and columns from 1; what is not
  // there gives nothing, a text, and is read only.

  CellKind Kind(int row, int column) const;
  bool IsReadOnly(int row, int column) const;
  const std::string& ToolTip(int column) const;
  std::string Icon(int row, int column) const;
  bool IsLink(int row, int column) const;
  /// What a click on a cell does; false where that is nothing.
  bool Press(int row, int column) const;
  const std::vector<std::string>& Choices(int column) const;
  /// The cell as a person sees it: of a choice the chosen text.
  std::string ShownCell(int row, int column) const;
  /// The head of a column with the unit of its numbers: "Depth [m]".
  std::string Head(int column) const;
  /// The units that a user may choose for a column; empty where there is nothing to choose.
  std::vector<UnitChoice> UnitChoices(int column) const;

  // Many cells at once, as in a spreadsheet: rows of cells that tabs separate.

  /// The cells as shown, rows ended by LF; a cell with a tab, line end or quote stands in quotes, its quotes doubled.
  std::string CopyText(const CellRange& cells) const;
  /// Writes such a text into the cells from the first of the selection on; one cell alone fills the whole selection.
  /// Choices go by their shown text in any case, or by their number; checks take 1, true, yes, on and 0, false, no,
  /// off. Rows are added at the end of the list. Cells that can be taken are; the others keep their values and are
  /// told.
  CellsResult Paste(const CellRange& selected, std::string_view text);
  /// Writes the cells of the first row into those below them.
  CellsResult FillDown(const CellRange& cells);
  /// Empties texts and file names; other cells, which have no empty value, are left alone.
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
  const TableColumn* ColumnAt(int column) const;
  FieldUnit UnitOf(const TableColumn& column) const { return {column.unit, column.itemType, displayUnits_}; }
  /// Types the shown text of a cell; gives what was expected.
  std::string EnterShown(int row, int column, const std::string& shown);
  /// The same, counted in the result.
  void Put(CellsResult& result, int row, int column, const std::string& shown);
  void Refuse(CellsResult& result, int row, int column, const std::string& expected) const;

  CYbSEKvfListBaseInterface& list_;
  std::vector<TableColumn> columns_;
  const DisplayUnits* displayUnits_ = nullptr;
  std::string itemName_ = "Row", itemNames_ = "Rows";
  bool isShownOnly_ = false;
  std::function<void(int)> chosen_;
};

/// A table as text: heads and rows, cells separated by " | ".
std::string TableText(const TableForm& table, int level);

}  // namespace tervane
