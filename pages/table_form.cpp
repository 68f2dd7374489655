// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/table_form.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "pages/entry.h"
#include "platform/text.h"

namespace tervane {

std::string CellText(int value) { return std::to_string(value); }
std::string CellText(double value) { return ShortestNumber(value); }
std::string CellText(const std::string& value) { return value; }
std::string CellText(const FileName& value) { return value.Text(); }

std::string TakeCell(int& value, const std::string& typed, const CYbSEKvfBase&) { return EnterValue(value, typed); }
std::string TakeCell(double& value, const std::string& typed, const CYbSEKvfBase&) { return EnterValue(value, typed); }
std::string TakeCell(std::string& value, const std::string& typed, const CYbSEKvfBase&) {
  return EnterValue(value, typed);
}
std::string TakeCell(FileName& value, const std::string& typed, const CYbSEKvfBase& item) {
  return EnterValue(value, typed, item);
}

namespace {

bool HasColumn(const TableForm& table, int column) {
  return column >= 1 && column <= static_cast<int>(table.Columns().size());
}

}  // namespace

std::string TableForm::Cell(int row, int column) const {
  CYbSEKvfBase* item = list_.GetItemNode(row);
  return item && HasColumn(*this, column) ? columns_[static_cast<std::size_t>(column - 1)].text(*item) : std::string();
}

std::string TableForm::Enter(int row, int column, const std::string& typed) {
  CYbSEKvfBase* item = list_.GetItemNode(row);
  if (!item || !HasColumn(*this, column)) return "there is no such cell";
  const TableColumn& target = columns_[static_cast<std::size_t>(column - 1)];
  if (target.readOnly && target.readOnly(*item)) return "the cell cannot be changed";
  return target.enter(*item, typed);
}

int TableForm::InsertRows(int first, int last) {
  if (first < 1) {
    list_.AddItemNode();
    return kItemAdded | (list_.GetItemCount() == 1 ? kOrderChanged : 0);
  }
  for (int row = first; row <= last; ++row) list_.InsertItem(first, 1);
  return kItemAdded | (first == 1 ? kOrderChanged : 0);
}

int TableForm::DeleteRows(int first, int last) {
  if (first < 1 || first > list_.GetItemCount()) return 0;
  for (int row = first; row <= last; ++row) list_.DeleteItem(first, 1);
  return kItemDeleted;
}

int TableForm::MoveRowsUp(int first, int last) {
  if (first <= 1) return 0;
  for (int row = first; row <= last; ++row) list_.MoveItemUp(row, 1);
  return kOrderChanged;
}

int TableForm::MoveRowsDown(int first, int last) {
  if (first < 1 || last >= list_.GetItemCount()) return 0;
  for (int row = last; row >= first; --row) list_.MoveItemDown(row, 1);
  return kOrderChanged;
}

namespace {

/// A cell as a person sees it: of a choice the chosen text.
std::string ShownCell(const TableForm& table, int row, int column) {
  const std::string cell = table.Cell(row, column);
  const std::vector<std::string>& choices = table.Columns()[static_cast<std::size_t>(column - 1)].choices;
  for (std::size_t i = 0; i < choices.size(); ++i)
    if (cell == std::to_string(i)) return choices[i];
  return cell;
}

}  // namespace

std::string TableText(const TableForm& table, int level) {
  const std::string indent(2 * static_cast<std::size_t>(level), ' ');
  std::string text = indent;
  for (const TableColumn& column : table.Columns()) {
    text += fmt::format("{}\"{}\"", &column == table.Columns().data() ? "" : " | ", Replaced(column.head, "\n", " "));
    if (!column.choices.empty()) text += fmt::format(" of [{}]", fmt::join(column.choices, " | "));
  }
  text += '\n';
  for (int row = 1; row <= table.RowCount(); ++row) {
    text += indent;
    for (int column = 1; column <= static_cast<int>(table.Columns().size()); ++column)
      text += fmt::format("{}{}", column == 1 ? "" : " | ", ShownCell(table, row, column));
    text += '\n';
  }
  return text;
}

}  // namespace tervane
