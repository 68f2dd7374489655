// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <string>
#include <vector>

#include "core/list.h"
#include "pages/page_form.h"

namespace tervane {

/// How a cell is edited.
enum class CellKind { Text, Number, Integer, Check, Choice, File };

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
};

// A value in a cell: as it is shown, and typed. A value that the cell refuses is told and does not reach the item.

std::string CellText(int value);
std::string CellText(double value);
std::string CellText(const std::string& value);
std::string CellText(const FileName& value);
std::string TakeCell(int& value, const std::string& typed, const CYbSEKvfBase& item);
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
    return column;
  }
  /// The same for a choice, stored by its number from 0.
  template <class Item, class Get>
  TableColumn& Choice(std::string head, int width, Get get, std::vector<std::string> choices) {
    TableColumn& column = Column<Item>(std::move(head), width, CellKind::Choice, get);
    column.choices = std::move(choices);
    return column;
  }

  CYbSEKvfListBaseInterface& List() const { return list_; }
  const std::vector<TableColumn>& Columns() const { return columns_; }
  int RowCount() const { return list_.GetItemCount(); }

  /// The text of a cell, rows and columns from 1; empty where there is none.
  std::string Cell(int row, int column) const;
  /// Types into a cell; gives what was expected when the cell refuses it, and then nothing reached the item.
  std::string Enter(int row, int column, const std::string& typed);

  // The rows are selected as a whole, from `first` to `last`; 0 for no whole row. Each gives the hint of the change, 0
  // when nothing was changed.

  int InsertRows(int first, int last);
  int DeleteRows(int first, int last);
  int MoveRowsUp(int first, int last);
  int MoveRowsDown(int first, int last);

 private:
  CYbSEKvfListBaseInterface& list_;
  std::vector<TableColumn> columns_;
};

/// A table as text: heads and rows, cells separated by " | ".
std::string TableText(const TableForm& table, int level);

}  // namespace tervane
