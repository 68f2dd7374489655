// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "forms/table_form.h"

#include <algorithm>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "forms/entry.h"
#include "platform/text.h"

namespace tervane {

std::string CellText(int value) { return std::to_string(value); }
std::string CellText(float value) { return ShortestNumber(value); }
std::string CellText(double value) { return ShortestNumber(value); }
std::string CellText(const std::string& value) { return value; }
std::string CellText(const FileName& value) { return value.Text(); }

std::string TakeCell(int& value, const std::string& typed, const CYbSEKvfBase&) { return EnterValue(value, typed); }
std::string TakeCell(float& value, const std::string& typed, const CYbSEKvfBase&) { return EnterValue(value, typed); }
std::string TakeCell(double& value, const std::string& typed, const CYbSEKvfBase&) { return EnterValue(value, typed); }
std::string TakeCell(std::string& value, const std::string& typed, const CYbSEKvfBase&) {
  return EnterValue(value, typed);
}
std::string TakeCell(FileName& value, const std::string& typed, const CYbSEKvfBase& item) {
  return EnterValue(value, typed, item);
}

const TableColumn* TableForm::ColumnAt(int column) const {
  return column >= 1 && column <= static_cast<int>(columns_.size()) ? &columns_[static_cast<std::size_t>(column - 1)]
                                                                    : nullptr;
}

std::string TableForm::Cell(int row, int column) const {
  CYbSEKvfBase* item = list_.GetItemNode(row);
  const TableColumn* shown = ColumnAt(column);
  if (!item || !shown) return {};
  if (!shown->HasUnit()) return shown->text(*item);
  return std::visit([&](auto* number) { return ShownNumber(*number, UnitOf(*shown)); }, shown->number(*item));
}

std::string TableForm::Enter(int row, int column, const std::string& typed) {
  CYbSEKvfBase* item = list_.GetItemNode(row);
  const TableColumn* target = ColumnAt(column);
  if (!item || !target) return "there is no such cell";
  if (IsReadOnly(row, column)) return "the cell cannot be changed";
  if (!target->HasUnit()) return target->enter(*item, typed);
  return std::visit([&](auto* number) { return EnterNumber(*number, typed, UnitOf(*target)); }, target->number(*item));
}

// ---- What a view asks

CellKind TableForm::Kind(int row, int column) const {
  CYbSEKvfBase* item = list_.GetItemNode(row);
  const TableColumn* shown = ColumnAt(column);
  return item && shown && shown->kind ? shown->kind(*item) : CellKind::Text;
}

bool TableForm::IsReadOnly(int row, int column) const {
  CYbSEKvfBase* item = list_.GetItemNode(row);
  const TableColumn* shown = ColumnAt(column);
  return !item || !shown || isShownOnly_ || (shown->readOnly && shown->readOnly(*item));
}

std::string TableForm::Icon(int row, int column) const {
  CYbSEKvfBase* item = list_.GetItemNode(row);
  const TableColumn* shown = ColumnAt(column);
  return item && shown && shown->icon ? shown->icon(*item) : std::string();
}

bool TableForm::IsLink(int row, int column) const {
  const TableColumn* shown = ColumnAt(column);
  return list_.GetItemNode(row) && shown && shown->press;
}

bool TableForm::Press(int row, int column) const {
  if (!IsLink(row, column)) return false;
  ColumnAt(column)->press(*list_.GetItemNode(row));
  return true;
}

const std::string& TableForm::ToolTip(int column) const {
  static const std::string none;
  const TableColumn* shown = ColumnAt(column);
  return shown ? shown->toolTip : none;
}

const std::vector<std::string>& TableForm::Choices(int column) const {
  static const std::vector<std::string> none;
  const TableColumn* shown = ColumnAt(column);
  return shown ? shown->choices : none;
}

std::string TableForm::ShownCell(int row, int column) const {
  std::string cell = Cell(row, column);
  const std::vector<std::string>& choices = Choices(column);
  for (std::size_t i = 0; i < choices.size(); ++i)
    if (cell == std::to_string(i)) return choices[i];
  return cell;
}

std::string TableForm::Head(int column) const {
  const TableColumn* shown = ColumnAt(column);
  if (!shown) return {};
  const std::string unit = UnitOf(*shown).Text();
  if (unit.empty()) return shown->head;
  return unit.starts_with('[') ? fmt::format("{} {}", shown->head, unit) : fmt::format("{} [{}]", shown->head, unit);
}

std::vector<UnitChoice> TableForm::UnitChoices(int column) const {
  const TableColumn* shown = ColumnAt(column);
  return shown ? UnitOf(*shown).Choices() : std::vector<UnitChoice>();
}

void TableForm::ItemName(std::string one, std::string many) {
  itemNames_ = many.empty() ? one + "s" : std::move(many);
  itemName_ = std::move(one);
}

std::string TableForm::ActionName(RowAction action, int rows) const {
  const std::string items = rows == 1 ? itemName_ : fmt::format("{} {}", rows, itemNames_);
  switch (action) {
    case RowAction::Insert:
      return "Insert " + items;
    case RowAction::Delete:
      return "Delete " + items;
    case RowAction::MoveUp:
      return fmt::format("Move {} Up", items);
    case RowAction::MoveDown:
      return fmt::format("Move {} Down", items);
  }
  return items;
}

// ---- Many cells at once

namespace {

std::string Quoted(const std::string& cell) {
  if (cell.find_first_of("\t\n\r\"") == std::string::npos) return cell;
  return '"' + Replaced(cell, "\"", "\"\"") + '"';
}

bool EndsCell(std::string_view rest) {
  return rest.empty() || rest.front() == '\t' || rest.front() == '\n' || rest.front() == '\r';
}

/// Takes a cell from the front of the text. A quote that nobody closes before the cell ends is a quote and no more.
std::string TakePastedCell(std::string_view& text) {
  if (text.starts_with('"')) {
    std::string cell;
    for (std::size_t at = 1; at < text.size(); ++at) {
      if (text[at] != '"') {
        cell += text[at];
      } else if (text.substr(at + 1).starts_with('"')) {
        cell += text[at++];
      } else if (EndsCell(text.substr(at + 1))) {
        text.remove_prefix(at + 1);
        return cell;
      } else {
        break;
      }
    }
  }
  const std::size_t end = std::min(text.find_first_of("\t\n\r"), text.size());
  std::string cell(text.substr(0, end));
  text.remove_prefix(end);
  return cell;
}

using PastedRows = std::vector<std::vector<std::string>>;

PastedRows ParsePasted(std::string_view text) {
  PastedRows rows;
  while (!text.empty()) {
    std::vector<std::string>& row = rows.emplace_back();
    row.push_back(TakePastedCell(text));
    while (text.starts_with('\t')) {
      text.remove_prefix(1);
      row.push_back(TakePastedCell(text));
    }
    text.remove_prefix(text.starts_with("\r\n") ? 2 : text.empty() ? 0 : 1);
  }
  return rows;
}

/// The number of a choice by its text or number; -1 when it is none.
int ChoiceNumber(const std::vector<std::string>& choices, std::string_view shown) {
  for (std::size_t i = 0; i < choices.size(); ++i)
    if (EqualIgnoringCase(Trimmed(choices[i]), Trimmed(shown))) return static_cast<int>(i);
  int number = -1;
  const bool isChoice =
      EnterValue(number, std::string(shown)).empty() && number >= 0 && number < static_cast<int>(choices.size());
  return isChoice ? number : -1;
}

/// 1 or 0 by the words for them; -1 when it is none.
int CheckNumber(std::string_view shown) {
  constexpr std::string_view kWords[][4] = {{"0", "false", "no", "off"}, {"1", "true", "yes", "on"}};
  for (int number = 0; number < 2; ++number)
    for (const std::string_view word : kWords[number])
      if (EqualIgnoringCase(Trimmed(shown), word)) return number;
  return -1;
}

}  // namespace

std::string CellsResult::Message() const {
  std::string message;
  for (const std::string& reason : reasons) message += (message.empty() ? "" : "\n") + reason;
  const int more = refused - static_cast<int>(reasons.size());
  return more > 0 ? fmt::format("{}\nand {} more", message, more) : message;
}

void TableForm::Refuse(CellsResult& result, int row, int column, const std::string& expected) const {
  ++result.refused;
  if (result.reasons.size() >= CellsResult::kMostReasons) return;
  const TableColumn* target = ColumnAt(column);
  const std::string head = target ? Replaced(target->head, "\n", " ") : fmt::format("column {}", column);
  result.reasons.push_back(fmt::format("row {}, {}: {}", row, head, expected));
}

std::string TableForm::EnterShown(int row, int column, const std::string& shown) {
  const CellKind kind = Kind(row, column);
  if (IsReadOnly(row, column) || (kind != CellKind::Choice && kind != CellKind::Check))
    return Enter(row, column, shown);
  const int number = kind == CellKind::Choice ? ChoiceNumber(Choices(column), shown) : CheckNumber(shown);
  if (number >= 0) return Enter(row, column, std::to_string(number));
  return kind == CellKind::Choice ? fmt::format("one of {} was expected", fmt::join(Choices(column), ", "))
                                  : "1 or 0, true or false, yes or no, on or off was expected";
}

void TableForm::Put(CellsResult& result, int row, int column, const std::string& shown) {
  const bool exists = ColumnAt(column) && row <= RowCount();
  const bool changes = !exists || ShownCell(row, column) != shown;
  const std::string expected = !ColumnAt(column) ? fmt::format("the table has {} columns", columns_.size())
                               : !exists         ? "the list takes no further rows"
                               : changes         ? EnterShown(row, column, shown)
                                                 : std::string();
  if (!expected.empty()) return Refuse(result, row, column, expected);
  ++result.taken;
  if (changes) result.hint |= kDataChanged;
}

std::string TableForm::CopyText(const CellRange& cells) const {
  const int lastColumn = std::min(cells.lastColumn, static_cast<int>(columns_.size()));
  std::string text;
  for (int row = std::max(cells.firstRow, 1); row <= std::min(cells.lastRow, RowCount()); ++row) {
    for (int column = std::max(cells.firstColumn, 1); column <= lastColumn; ++column)
      text += Quoted(ShownCell(row, column)) + (column < lastColumn ? "\t" : "\n");
  }
  return text;
}

CellsResult TableForm::Paste(const CellRange& selected, std::string_view text) {
  CellsResult result;
  const PastedRows pasted = ParsePasted(text);
  if (pasted.empty()) return result;
  const int before = RowCount();
  const int firstRow = std::clamp(selected.firstRow, 1, before + 1);
  const int firstColumn = std::max(selected.firstColumn, 1);
  const bool fills = pasted.size() == 1 && pasted.front().size() == 1;
  const int rows = fills ? std::max(selected.lastRow - firstRow + 1, 1) : static_cast<int>(pasted.size());
  const int needed = std::min(firstRow + rows - 1, kLargestItemCount);
  for (int count = RowCount(); count < needed && RowCount() == count; ++count) list_.AddItemNode();
  result.cells = OneCell(firstRow, firstColumn);
  int lastTaken = before;
  for (int i = 0; i < rows; ++i) {
    const std::vector<std::string>& row = pasted[fills ? 0 : static_cast<std::size_t>(i)];
    const int columns = fills ? std::max(selected.lastColumn - firstColumn + 1, 1) : static_cast<int>(row.size());
    const int taken = result.taken;
    for (int j = 0; j < columns; ++j)
      Put(result, firstRow + i, firstColumn + j, row[fills ? 0 : static_cast<std::size_t>(j)]);
    if (result.taken > taken) lastTaken = std::max(lastTaken, firstRow + i);
    result.cells.lastRow = firstRow + i;
    result.cells.lastColumn = std::max(result.cells.lastColumn, firstColumn + columns - 1);
  }
  // A new row that took nothing would be no more than an accident.
  for (int row = RowCount(); row > lastTaken; --row) list_.DeleteItem(row, 1);
  if (RowCount() > before) result.hint |= kItemAdded | (before == 0 ? kOrderChanged : 0);
  result.cells.lastRow = std::min(result.cells.lastRow, RowCount());
  result.cells.lastColumn = std::min(result.cells.lastColumn, static_cast<int>(columns_.size()));
  return result;
}

CellsResult TableForm::FillDown(const CellRange& cells) {
  CellsResult result;
  result.cells = cells;
  CYbSEKvfBase* source = list_.GetItemNode(cells.firstRow);
  if (!source) return result;
  for (int row = cells.firstRow + 1; row <= std::min(cells.lastRow, RowCount()); ++row) {
    for (int column = cells.firstColumn; column <= cells.lastColumn; ++column) {
      Put(result, row, column, ShownCell(cells.firstRow, column));
      const TableColumn* target = ColumnAt(column);
      if (!target || !target->HasUnit() || IsReadOnly(row, column)) continue;
      // The shown text of a converted number does not hold all of its digits.
      std::visit(
          [&]<class Real>(Real* number) {
            const Real given = *std::get<Real*>(target->number(*source));
            if (*number != given) result.hint |= kDataChanged;
            *number = given;
          },
          target->number(*list_.GetItemNode(row)));
    }
  }
  return result;
}

CellsResult TableForm::Clear(const CellRange& cells) {
  CellsResult result;
  result.cells = cells;
  for (int row = std::max(cells.firstRow, 1); row <= std::min(cells.lastRow, RowCount()); ++row) {
    for (int column = cells.firstColumn; column <= cells.lastColumn; ++column) {
      const CellKind kind = Kind(row, column);
      if (ColumnAt(column) && (kind == CellKind::Text || kind == CellKind::File)) Put(result, row, column, {});
    }
  }
  return result;
}

// ---- Rows

int TableForm::ChangeRows(RowAction action, int first, int last) {
  switch (action) {
    case RowAction::Insert:
      return InsertRows(first, last);
    case RowAction::Delete:
      return DeleteRows(first, last);
    case RowAction::MoveUp:
      return MoveRowsUp(first, last);
    case RowAction::MoveDown:
      return MoveRowsDown(first, last);
  }
  return 0;
}

int TableForm::ChangeRow(RowAction action, int row) {
  if (!list_.GetItemNode(row)) return 0;
  switch (action) {
    case RowAction::Insert:
      list_.InsertItem(row, 1);
      return kItemAdded;
    case RowAction::Delete:
      list_.DeleteItem(row, 1);
      return kItemDeleted;
    case RowAction::MoveUp:
      return list_.MoveItemUp(row, 1) ? kOrderChanged : 0;
    case RowAction::MoveDown:
      return list_.MoveItemDown(row, 1) ? kOrderChanged : 0;
  }
  return 0;
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

std::string TableText(const TableForm& table, int level) {
  const std::string indent(2 * static_cast<std::size_t>(level), ' ');
  std::string text = indent;
  for (const TableColumn& column : table.Columns()) {
    text += fmt::format("{}\"{}\"", &column == table.Columns().data() ? "" : " | ",
                        Replaced(table.Head(static_cast<int>(&column - table.Columns().data()) + 1), "\n", " "));
    if (!column.choices.empty()) text += fmt::format(" of [{}]", fmt::join(column.choices, " | "));
  }
  text += '\n';
  for (int row = 1; row <= table.RowCount(); ++row) {
    text += indent;
    for (int column = 1; column <= static_cast<int>(table.Columns().size()); ++column)
      text += fmt::format("{}{}", column == 1 ? "" : " | ", table.ShownCell(row, column));
    text += '\n';
  }
  return text;
}

}  // namespace tervane
