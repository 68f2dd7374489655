// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Many cells of a table at once: what is copied, pasted, filled down and cleared.
#include <algorithm>

#include <fmt/format.h>

#include "forms/table_form.h"
#include "platform/text.h"

namespace tervane {

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

/// The stored value of a choice by its text, or by the value itself; null when it is none.
const std::string* ChosenValue(const CellChoices& choices, std::string_view shown) {
  for (const CellChoice& choice : choices)
    if (EqualIgnoringCase(Trimmed(choice.text), Trimmed(shown))) return &choice.value;
  for (const CellChoice& choice : choices)
    if (choice.value == Trimmed(shown)) return &choice.value;
  return nullptr;
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
  const TableColumn* target = Column(column);
  const std::string head = target ? Replaced(target->head, "\n", " ") : fmt::format("column {}", column);
  result.reasons.push_back(fmt::format("row {}, {}: {}", row, head, expected));
}

std::string TableForm::EnterShown(int row, int column, const std::string& shown) {
  const CellKind kind = Kind(row, column);
  if (kind == CellKind::Choice) {
    const CellChoices choices = Choices(row, column);
    const std::string* value = ChosenValue(choices, shown);
    return Enter(row, column, value ? *value : shown);
  }
  if (kind != CellKind::Check || IsReadOnly(row, column)) return Enter(row, column, shown);
  const int number = CheckNumber(shown);
  return number >= 0 ? Enter(row, column, std::to_string(number))
                     : "1 or 0, true or false, yes or no, on or off was expected";
}

void TableForm::Put(CellsResult& result, int row, int column, const std::string& shown) {
  const bool exists = Column(column) && IsThere(row);
  // The value of one choice may be the text of another one.
  const bool isTyped = Kind(row, column) != CellKind::Choice && Cell(row, column) == shown;
  const bool changes = !exists || (!isTyped && ShownCell(row, column) != shown);
  const std::string expected = !Column(column) ? fmt::format("the table has {} columns", ColumnCount())
                               : !exists       ? "the list takes no further rows"
                               : changes       ? EnterShown(row, column, shown)
                                               : std::string();
  if (!expected.empty()) return Refuse(result, row, column, expected);
  ++result.taken;
  if (changes) result.hint |= Column(column)->hint;
}

void TableForm::PutCopy(CellsResult& result, int row, int column, int sourceRow) {
  const TableColumn& target = *Column(column);
  const CellValue given = target.get(sourceRow), held = target.get(row);
  const bool isSameType = given.index() == held.index() && Kind(row, target) != CellKind::Choice;
  // Texts are tried where another type is held: they say what is expected.
  if (!isSameType || IsReadOnly(row, target)) return Put(result, row, column, ShownCell(sourceRow, target));
  if (given != held) {
    if (const std::string refusal = Set(row, target, given); !refusal.empty())
      return Refuse(result, row, column, refusal);
    result.hint |= target.hint;
  }
  ++result.taken;
}

std::string TableForm::CopyText(const CellRange& cells) const {
  std::vector<int> columns;
  for (int column = std::max(cells.firstColumn, 1); column <= std::min(cells.lastColumn, ColumnCount()); ++column)
    if (!Column(column)->IsButton()) columns.push_back(column);
  std::string text;
  if (columns.empty()) return text;
  for (int row = std::max(cells.firstRow, 1); row <= std::min(cells.lastRow, RowCount()); ++row) {
    for (const int column : columns) {
      const bool isChoice = Kind(row, column) == CellKind::Choice;
      text += Quoted(isChoice ? ShownCell(row, column) : Cell(row, column)) + (column == columns.back() ? "\n" : "\t");
    }
  }
  return text;
}

std::vector<int> TableForm::PastedColumns(int first, int last, std::size_t count) const {
  std::vector<int> columns;
  for (int column = first; last > 0 ? column <= last : columns.size() < count; ++column)
    if (!Column(column) || !Column(column)->IsButton()) columns.push_back(column);
  return columns;
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
  if (Allows(RowAction::Insert))
    for (int count = RowCount(); count < needed && RowCount() == count; ++count) rows_->Add();
  result.cells = OneCell(firstRow, firstColumn);
  int lastTaken = before;
  for (int i = 0; i < rows; ++i) {
    const std::vector<std::string>& row = pasted[fills ? 0 : static_cast<std::size_t>(i)];
    const std::vector<int> columns =
        PastedColumns(firstColumn, fills ? std::max(selected.lastColumn, firstColumn) : 0, row.size());
    const int taken = result.taken;
    for (std::size_t j = 0; j < columns.size(); ++j) Put(result, firstRow + i, columns[j], row[fills ? 0 : j]);
    if (result.taken > taken) lastTaken = std::max(lastTaken, firstRow + i);
    result.cells.lastRow = firstRow + i;
    if (!columns.empty()) result.cells.lastColumn = std::max(result.cells.lastColumn, columns.back());
  }
  // A new row that took nothing would be no more than an accident.
  for (int row = RowCount(); row > lastTaken; --row) rows_->Delete(row);
  if (RowCount() > before) result.hint |= kItemAdded | (before == 0 ? kOrderChanged : 0);
  result.cells.lastRow = std::min(result.cells.lastRow, RowCount());
  result.cells.lastColumn = std::min(result.cells.lastColumn, ColumnCount());
  Forget();
  FollowCurrent();
  return result;
}

CellsResult TableForm::FillDown(const CellRange& cells) {
  CellsResult result;
  result.cells = cells;
  if (!IsThere(cells.firstRow)) return result;
  for (int row = cells.firstRow + 1; row <= std::min(cells.lastRow, RowCount()); ++row) {
    for (int column = std::max(cells.firstColumn, 1); column <= std::min(cells.lastColumn, ColumnCount()); ++column)
      if (Column(column)->set) PutCopy(result, row, column, cells.firstRow);
  }
  return result;
}

CellsResult TableForm::FillAll(const CellRange& cells) {
  CellsResult result;
  result.cells = cells;
  if (!IsThere(cells.firstRow)) return result;
  for (int row = 1; row <= RowCount(); ++row)
    for (int column = std::max(cells.firstColumn, 1); column <= std::min(cells.lastColumn, ColumnCount()); ++column)
      if (row != cells.firstRow && Column(column)->set) PutCopy(result, row, column, cells.firstRow);
  return result;
}

CellsResult TableForm::Clear(const CellRange& cells) {
  CellsResult result;
  result.cells = cells;
  for (int row = std::max(cells.firstRow, 1); row <= std::min(cells.lastRow, RowCount()); ++row) {
    for (int column = cells.firstColumn; column <= cells.lastColumn; ++column) {
      const CellKind kind = Kind(row, column);
      const bool hasEmptyValue = kind == CellKind::Text || kind == CellKind::File;
      if (hasEmptyValue && !IsReadOnly(row, column)) Put(result, row, column, {});
    }
  }
  return result;
}

}  // namespace tervane
