// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "forms/table_form.h"

#include <algorithm>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "platform/text.h"

namespace tervane {

// ---- Columns and rows that are there

void TableColumn::Bind(const BoundKeys::Place& place) {
  key = place.key;
  unit = place.facts.unit;
  itemType = place.facts.itemType;
  choices = CellChoices::Of(place.facts.choices);
}

TableColumn& TableForm::AddColumn(std::string head) {
  TableColumn& column = columns_.emplace_back();
  column.head = std::move(head);
  shown_.push_back({&column, 1});
  return column;
}

void TableForm::ClearColumns() {
  shown_.clear();
  columns_.clear();
  sortedBy_ = nullptr;
}

void TableForm::ItemName(std::string one, std::string many) {
  itemNames_ = many.empty() ? one + "s" : std::move(many);
  itemName_ = std::move(one);
}

void TableForm::Forget() {
  for (const TableColumn& column : columns_)
    if (column.forget) column.forget();
}

void TableForm::FollowColumns() {
  shown_.clear();
  // A head goes over the columns that are there of those behind it.
  std::size_t covered = 0, bearer = 0;
  for (std::size_t i = 0; i < columns_.size(); ++i) {
    const TableColumn& column = columns_[i];
    if (column.shownWhen && !column.shownWhen()) continue;
    if (i < covered) {
      ++shown_[bearer].headSpan;
      shown_.push_back({&column, 0});
    } else {
      bearer = shown_.size();
      covered = i + static_cast<std::size_t>(column.headSpan);
      shown_.push_back({&column, 1});
    }
  }
}

void TableForm::FollowCurrent() {
  const int count = RowCount();
  if (identity_ && !(IsThere(current_) && rows_->Identity(current_) == identity_)) {
    for (int row = 1; row <= count; ++row) {
      if (rows_->Identity(row) != identity_) continue;
      current_ = row;
      break;
    }
  }
  current_ = std::min(current_, count);
  // What is only shown is chosen by the user alone.
  if (current_ == 0 && count > 0 && !isShownOnly_) current_ = 1;
  identity_ = current_ > 0 ? rows_->Identity(current_) : nullptr;
}

void TableForm::Follow() {
  Forget();
  FollowColumns();
  if (rows_->Refresh() || allRows_ == 0) Arrange();
  FollowCurrent();
}

const TableColumn* TableForm::Column(int column) const {
  return column >= 1 && column <= ColumnCount() ? shown_[static_cast<std::size_t>(column - 1)].column : nullptr;
}

bool TableForm::Choose(int row) {
  if (!IsThere(row)) return false;
  const bool isOther = current_ != row;
  current_ = row;
  identity_ = rows_->Identity(row);
  if (chosen_) chosen_(row);
  return chosen_ || (isOther && reportsCurrent_);
}

// ---- Cells

CellKind TableForm::Kind(int row, const TableColumn& column) const {
  return column.kind ? *column.kind : KindOf(column.get(row));
}

std::string TableForm::Cell(int row, const TableColumn& column) const {
  return CellText(column.get(row), UnitOf(column));
}

std::string TableForm::ShownCell(int row, const TableColumn& column) const {
  if (column.shown) return column.shown(row);
  if (Kind(row, column) != CellKind::Choice) return CellText(column.get(row), UnitOf(column), column.format);
  std::string stored = Cell(row, column);
  const CellChoices choices = Choices(row, column);
  const int place = choices.IndexOf(stored);
  return place >= 0 ? choices[static_cast<std::size_t>(place)].text : std::move(stored);
}

bool TableForm::IsReadOnly(int row, const TableColumn& column) const {
  if (!column.set || (column.readOnly && column.readOnly(row))) return true;
  return !column.kind && std::holds_alternative<NoCell>(column.get(row));
}

CellChoices TableForm::Choices(int row, const TableColumn& column) const {
  return column.rowChoices ? column.rowChoices(row) : column.choices;
}

std::string TableForm::ToolTip(int row, const TableColumn& column) const {
  std::string own = column.cellToolTip ? column.cellToolTip(row) : std::string();
  return own.empty() ? column.toolTip : own;
}

std::string TableForm::Set(int row, const TableColumn& column, const CellValue& value) {
  std::string refusal = column.set(row, value);
  Forget();
  return refusal;
}

std::string TableForm::Enter(int row, const TableColumn& column, const std::string& typed) {
  CellValue value = column.get(row);
  if (IsReadOnly(row, column)) {
    const auto* none = std::get_if<NoCell>(&value);
    return none ? none->why : NoCell().why;
  }
  if (Kind(row, column) == CellKind::Choice) {
    const CellChoices choices = Choices(row, column);
    if (choices.empty()) return "there is nothing to choose from";
    if (choices.IndexOf(typed) < 0) return fmt::format("one of {} was expected", fmt::join(choices.ShownTexts(), ", "));
  }
  const CYbSEKvfBase* node = rows_->Node(row);
  std::string expected = EnterCell(value, typed, UnitOf(column), node ? node : node_);
  return expected.empty() ? Set(row, column, value) : expected;
}

// ---- The same by numbers

std::string TableForm::Cell(int row, int column) const {
  const TableColumn* shown = Column(column);
  return shown && IsThere(row) ? Cell(row, *shown) : std::string();
}

std::string TableForm::ShownCell(int row, int column) const {
  const TableColumn* shown = Column(column);
  return shown && IsThere(row) ? ShownCell(row, *shown) : std::string();
}

CellKind TableForm::Kind(int row, int column) const {
  const TableColumn* shown = Column(column);
  return shown && IsThere(row) ? Kind(row, *shown) : CellKind::Text;
}

bool TableForm::IsReadOnly(int row, int column) const {
  const TableColumn* shown = Column(column);
  return !shown || !IsThere(row) || isShownOnly_ || IsReadOnly(row, *shown);
}

bool TableForm::IsGrey(int row, int column) const {
  const TableColumn* shown = Column(column);
  if (!shown || !IsThere(row)) return false;
  // Of a table that is only shown nothing could stand out.
  if (shown->press) return shown->readOnly && shown->readOnly(row);
  return !isShownOnly_ && IsReadOnly(row, *shown);
}

std::vector<std::string> TableForm::Offers(int row, int column) const {
  const TableColumn* shown = Column(column);
  return shown && shown->offers && IsThere(row) ? shown->offers(row) : std::vector<std::string>();
}

CellChoices TableForm::Choices(int row, int column) const {
  const TableColumn* shown = Column(column);
  return shown && IsThere(row) ? Choices(row, *shown) : CellChoices();
}

std::string TableForm::ToolTip(int row, int column) const {
  const TableColumn* shown = Column(column);
  return shown && IsThere(row) ? ToolTip(row, *shown) : std::string();
}

std::string TableForm::Icon(int row, int column) const {
  const TableColumn* shown = Column(column);
  return shown && IsThere(row) && shown->icon ? shown->icon(row) : std::string();
}

bool TableForm::IsLink(int row, int column) const {
  const TableColumn* shown = Column(column);
  return shown && IsThere(row) && shown->press && !shown->IsButton();
}

bool TableForm::Press(int row, int column) const {
  const TableColumn* shown = Column(column);
  if (!shown || !IsThere(row) || !shown->press || IsGrey(row, column)) return false;
  shown->press(row);
  return true;
}

std::string TableForm::Enter(int row, int column, const std::string& typed) {
  const TableColumn* shown = Column(column);
  if (!shown || !IsThere(row)) return "there is no such cell";
  return isShownOnly_ ? NoCell().why : Enter(row, *shown, typed);
}

std::string TableForm::Head(int column) const {
  const TableColumn* shown = Column(column);
  if (!shown) return {};
  const std::string unit = UnitOf(*shown).Text();
  if (unit.empty()) return shown->head;
  return unit.starts_with('[') ? fmt::format("{} {}", shown->head, unit) : fmt::format("{} [{}]", shown->head, unit);
}

int TableForm::HeadSpan(int column) const {
  return Column(column) ? shown_[static_cast<std::size_t>(column - 1)].headSpan : 1;
}

std::vector<UnitChoice> TableForm::UnitChoices(int column) const {
  const TableColumn* shown = Column(column);
  return shown ? UnitOf(*shown).Choices() : std::vector<UnitChoice>();
}

std::string TableForm::RowHead(int row) const {
  if (!IsThere(row)) return {};
  return rowHead_ ? rowHead_(row) : std::to_string(row);
}

// ---- Rows

bool TableForm::Allows(RowAction action) const {
  if (isShownOnly_ || keepsRows_ || !rows_->CanChange()) return false;
  return !keepsOrder_ || action == RowAction::Insert || action == RowAction::Delete;
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

void TableForm::MoveCurrent(RowAction action, int first, int last) {
  const int rows = last - first + 1;
  switch (action) {
    case RowAction::Insert:
      if (current_ >= first) current_ += rows;
      break;
    case RowAction::Delete:
      if (current_ > last)
        current_ -= rows;
      else if (current_ >= first)
        current_ = std::min(first, RowCount());
      break;
    case RowAction::MoveUp:
      if (current_ == first - 1)
        current_ = last;
      else if (current_ >= first && current_ <= last)
        --current_;
      break;
    case RowAction::MoveDown:
      if (current_ == last + 1)
        current_ = first;
      else if (current_ >= first && current_ <= last)
        ++current_;
      break;
  }
  Forget();
  identity_ = IsThere(current_) ? rows_->Identity(current_) : nullptr;
  FollowCurrent();
}

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
  if (!IsThere(row) || !Allows(action)) return 0;
  int hint = 0;
  switch (action) {
    case RowAction::Insert:
      rows_->Insert(row);
      hint = kItemAdded;
      break;
    case RowAction::Delete:
      rows_->Delete(row);
      hint = kItemDeleted;
      break;
    case RowAction::MoveUp:
      hint = rows_->MoveUp(row) ? kOrderChanged : 0;
      break;
    case RowAction::MoveDown:
      hint = rows_->MoveDown(row) ? kOrderChanged : 0;
      break;
  }
  if (hint) MoveCurrent(action, row, row);
  return hint;
}

int TableForm::InsertRows(int first, int last) {
  if (!Allows(RowAction::Insert)) return 0;
  if (first < 1) {
    rows_->Add();
    Forget();
    FollowCurrent();
    return kItemAdded | (RowCount() == 1 ? kOrderChanged : 0);
  }
  for (int row = first; row <= last; ++row) rows_->Insert(first);
  MoveCurrent(RowAction::Insert, first, last);
  return kItemAdded | (first == 1 ? kOrderChanged : 0);
}

int TableForm::DeleteRows(int first, int last) {
  if (first < 1 || first > RowCount() || !Allows(RowAction::Delete)) return 0;
  last = std::min(last, RowCount());
  for (int row = first; row <= last; ++row) rows_->Delete(first);
  MoveCurrent(RowAction::Delete, first, last);
  return kItemDeleted;
}

int TableForm::MoveRowsUp(int first, int last) {
  if (first <= 1 || !Allows(RowAction::MoveUp)) return 0;
  for (int row = first; row <= last; ++row) rows_->MoveUp(row);
  MoveCurrent(RowAction::MoveUp, first, last);
  return kOrderChanged;
}

int TableForm::MoveRowsDown(int first, int last) {
  if (first < 1 || last >= RowCount() || !Allows(RowAction::MoveDown)) return 0;
  for (int row = last; row >= first; --row) rows_->MoveDown(row);
  MoveCurrent(RowAction::MoveDown, first, last);
  return kOrderChanged;
}

}  // namespace tervane
