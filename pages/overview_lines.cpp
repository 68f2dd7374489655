// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/overview_lines.h"

#include <fmt/format.h>

#include "forms/page.h"
#include "forms/table_form.h"
#include "pages/place_names.h"
#include "pages/tree_entries.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// Collects what one page shows.
class PageLines {
 public:
  PageLines(std::string title, int level, std::vector<OverviewLine>& lines)
      : title_(std::move(title)), level_(level), lines_(lines) {}

  /// `group` is the title of the frame around them.
  void Add(PageForm& form, const std::string& group = {}) {
    group_ = group;
    for (const auto& control : form.Controls()) {
      if (!control->IsShown()) continue;
      if (control->group) {
        Add(*control->group, SpokenLabel(control->label));
        group_ = group;
      }
      if (control->table && !control->table->IsShownOnly()) AddRows(*control->table);
      if (control->kind == ControlKind::SubForms) {
        const int current = control->currentSubForm();
        if (current >= 0 && current < static_cast<int>(control->subForms.size()))
          Add(*control->subForms[static_cast<std::size_t>(current)], group);
      }
      AddValue(*control);
    }
  }

 private:
  void AddValue(const Control& control) {
    const std::string label = NameOf(control);
    const std::optional<std::string> value = ValueInWords(control);
    if (!value) return;
    const bool isChoice = control.kind == ControlKind::Choice || control.kind == ControlKind::Radio;
    // The method of what stands in front of it in its row.
    if (isChoice && label.empty() && control.beside && !lines_.empty())
      lines_.back().text += ", " + *value;
    else
      AddLine(label, value->empty() ? "none" : *value);
  }

  void AddRows(const TableForm& table) {
    for (int row = 1; row <= table.RowCount(); ++row) {
      std::string cells;
      for (int column = 1; column <= table.ColumnCount(); ++column) {
        const std::string cell = table.ShownCell(row, column);
        if (!table.Column(column)->IsButton()) cells += fmt::format("{}{}", cells.empty() ? "" : " | ", cell);
      }
      AddLine(std::to_string(row), cells);
    }
  }

  void AddLine(const std::string& label, const std::string& value) {
    const std::string name = group_.empty() ? label : label.empty() ? group_ : fmt::format("{}, {}", group_, label);
    lines_.push_back({title_, level_, name.empty() ? value : fmt::format("{}: {}", name, value)});
  }

  std::string title_, group_;
  int level_;
  std::vector<OverviewLine>& lines_;
};

}  // namespace

std::optional<std::string> ValueInWords(const Control& control) {
  constexpr std::string_view kNoUnit = "-";  // Of what has no dimension.
  switch (control.kind) {
    case ControlKind::Check:
      return control.Text() == "1" ? "on" : "off";
    case ControlKind::Radio:
    case ControlKind::Choice: {
      const std::vector<std::string> options = control.Options();
      const int chosen = control.Option();
      if (options.empty()) return std::nullopt;
      return chosen >= 0 ? SpokenLabel(options[static_cast<std::size_t>(chosen)])
                         : control.Text() + " (not in the list)";
    }
    case ControlKind::Text:
    case ControlKind::LongText:
    case ControlKind::Integer:
    case ControlKind::Number:
    case ControlKind::Date:
    case ControlKind::File: {
      const std::string unit = control.UnitText(), value = Replaced(control.Text(), "\n", " ");
      return unit.empty() || unit == kNoUnit || value.empty() ? value : fmt::format("{} {}", value, unit);
    }
    default:
      return std::nullopt;
  }
}

std::vector<OverviewLine> OverviewInWords(CYbSEDocument& document) {
  std::vector<OverviewLine> lines;
  NobodyToAsk host;
  for (const TreeEntry& entry : TreeEntries(document.Root(), kSetupDataTree)) {
    const auto page = MakePageToRead(*entry.page, *entry.node, {document, host, {}});
    if (!page) continue;
    const std::string& title = entry.node->GetTitle();
    PageLines(title.empty() ? entry.title : title, entry.depth + 1, lines).Add(page->Form());
  }
  return lines;
}

}  // namespace tervane
