// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <fmt/format.h>
#include <fmt/ranges.h>

#include "forms/table_form.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// `"End Date" date`, `"Observed Data File" over 3 columns`, `"" button "Select point in the plot"`.
std::string HeadText(const TableForm& table, int number) {
  const TableColumn& column = *table.Column(number);
  std::string text = fmt::format("\"{}\"", Replaced(table.Head(number), "\n", " "));
  if (table.HeadSpan(number) > 1) text += fmt::format(" over {} columns", table.HeadSpan(number));
  if (column.kind == CellKind::Date) text += " date";
  if (column.IsButton()) text += " button";
  if (!table.IsShownOnly() && !column.IsButton() && !column.set) text += " read only";
  if (column.IsButton() && !column.toolTip.empty()) text += fmt::format(" \"{}\"", column.toolTip);
  if (!column.choices.empty()) text += fmt::format(" of [{}]", fmt::join(column.choices.ShownTexts(), " | "));
  return text;
}

std::string CellInText(const TableForm& table, int row, int number) {
  const TableColumn& column = *table.Column(number);
  std::string text = table.ShownCell(row, number);
  if (column.IsButton()) {
    const std::string icon = table.Icon(row, number);
    text = fmt::format("[{}{}{}]", icon, icon.empty() || text.empty() ? "" : " ", text);
    return table.IsGrey(row, number) ? text + " (disabled)" : text;
  }
  if (column.rowChoices) {
    constexpr std::size_t kMostTold = 10;
    const std::vector<std::string> choices = table.Choices(row, number).ShownTexts();
    text += choices.size() > kMostTold ? fmt::format(" of {}", choices.size())
                                       : fmt::format(" of [{}]", fmt::join(choices, " | "));
  }
  // The head tells of a column that takes nothing at all.
  return column.set && table.IsGrey(row, number) ? text + (text.empty() ? "(read only)" : " (read only)") : text;
}

}  // namespace

std::string TableText(TableForm& table, int level) {
  table.Follow();
  const std::string indent(2 * static_cast<std::size_t>(level), ' ');
  std::string text = indent;
  for (int column = 1; column <= table.ColumnCount(); ++column)
    text += (column == 1 ? "" : " | ") + HeadText(table, column);
  text += '\n';
  for (int row = 1; row <= table.RowCount(); ++row) {
    text += indent;
    if (table.HasRowHeads()) text += fmt::format("\"{}\": ", table.RowHead(row));
    for (int column = 1; column <= table.ColumnCount(); ++column)
      text += (column == 1 ? "" : " | ") + CellInText(table, row, column);
    text += '\n';
  }
  return text;
}

}  // namespace tervane
