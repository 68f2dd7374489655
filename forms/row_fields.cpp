// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "forms/row_fields.h"

namespace tervane {

namespace {

ControlKind ControlKindOf(CellKind kind) {
  switch (kind) {
    case CellKind::Text:
      return ControlKind::Text;
    case CellKind::Number:
      return ControlKind::Number;
    case CellKind::Integer:
      return ControlKind::Integer;
    case CellKind::Check:
      return ControlKind::Check;
    case CellKind::Choice:
      return ControlKind::Choice;
    case CellKind::File:
      return ControlKind::File;
    case CellKind::Date:
      return ControlKind::Date;
    case CellKind::Button:
      return ControlKind::Button;
  }
  return ControlKind::Text;
}

/// The place of the chosen option; what is none of them stands in quotes, so that it is no place.
std::string OptionText(const TableForm& table, const TableColumn& column, int row) {
  const std::string stored = CellText(column.get(row));
  const int place = table.Choices(row, column).IndexOf(stored);
  return place >= 0 ? std::to_string(place) : stored.empty() ? stored : "'" + stored + "'";
}

/// The stored value of an option by its place.
std::string OptionValue(const TableForm& table, const TableColumn& column, int row, const std::string& typed) {
  const CellChoices choices = table.Choices(row, column);
  int place = -1;
  const bool isPlace = EnterValue(place, typed).empty() && place >= 0 && place < static_cast<int>(choices.size());
  return isPlace ? choices[static_cast<std::size_t>(place)].value : std::string();
}

}  // namespace

Control& AddRowField(PageForm& form, std::shared_ptr<TableForm> table, std::shared_ptr<TableColumn> column,
                     std::string label, CellKind kind) {
  table->ReportCurrentRow();
  Control& control = form.Bare(ControlKindOf(kind), std::move(label));
  // Paths and findings are those of the row, not of the page's node.
  control.node = nullptr;
  control.subject = [table] { return table->CurrentSubject(); };
  control.EnabledWhen("a row of the table is chosen, and its value can be changed", [table, column] {
    const int row = table->CurrentRow();
    if (row == 0) return false;
    return column->IsButton() ? !column->readOnly || !column->readOnly(row) : !table->IsReadOnly(row, *column);
  });
  if (kind == CellKind::Button) {
    control.press = [table, column] { column->press(table->CurrentRow()); };
    return control;
  }
  control.text = [table, column] {
    const int row = table->CurrentRow();
    if (row == 0) return std::string();
    return column->kind == CellKind::Choice ? OptionText(*table, *column, row) : table->ShownCell(row, *column);
  };
  control.enter = [table, column](const std::string& typed) {
    const int row = table->CurrentRow();
    if (row == 0) return NoCell().why;
    return table->Enter(row, *column,
                        column->kind == CellKind::Choice ? OptionValue(*table, *column, row, typed) : typed);
  };
  // Taken by the column when it has any.
  if (kind == CellKind::Text)
    control.options = [table, column] {
      const int row = table->CurrentRow();
      return row == 0 || !column->offers ? std::vector<std::string>() : column->offers(row);
    };
  if (kind == CellKind::Choice)
    control.options = [table, column] {
      const int row = table->CurrentRow();
      return row == 0 ? column->choices.ShownTexts() : table->Choices(row, *column).ShownTexts();
    };
  return control;
}

Control& AddRowFile(PageForm& form, std::shared_ptr<TableForm> table, std::function<DataFileNode*()> current,
                    std::string label) {
  table->ReportCurrentRow();
  Control& control = form.Bare(ControlKind::File, std::move(label));
  control.node = nullptr;
  control.Key("FILE_NAME").EnabledWhen("a row of the table is chosen", [current] { return current() != nullptr; });
  control.subject = [table] { return table->CurrentSubject(); };
  // The control of one file is made for each question, since rows come and go.
  const auto withControl = [current, &control](auto ask, auto otherwise) -> decltype(otherwise) {
    DataFileNode* file = current();
    if (!file) return otherwise;
    PageForm ofFile(*file);
    Control& ofRow = ofFile.DataFile(control.label, *file);
    ofRow.fileQuestion = control.fileQuestion;
    return ask(ofRow);
  };
  control.text = [withControl] { return withControl([](Control& ofRow) { return ofRow.Text(); }, std::string()); };
  control.enter = [withControl](const std::string& typed) {
    return withControl([&](Control& ofRow) { return ofRow.enter(typed); }, NoCell().why);
  };
  control.browse = [withControl](Host& host) {
    return withControl([&](Control& ofRow) { return ofRow.browse(host); }, false);
  };
  return control;
}

}  // namespace tervane
