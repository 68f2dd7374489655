// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/offers.h"
#include "cli/parts/json.h"
#include "cli/parts/setup_file.h"
#include "forms/page.h"
#include "forms/table_form.h"
#include "pages/tree_entries.h"

namespace tervane {

namespace {

std::string JsonTable(const TableForm& table) {
  std::vector<std::string> heads, rows;
  for (int column = 1; column <= table.ColumnCount(); ++column) heads.push_back(JsonQuoted(table.Head(column)));
  for (int row = 1; row <= table.RowCount(); ++row) {
    std::vector<std::string> cells;
    for (int column = 1; column <= table.ColumnCount(); ++column)
      cells.push_back(JsonQuoted(table.ShownCell(row, column)));
    rows.push_back(JsonArray(cells));
  }
  return JsonObject({{"heads", JsonArray(heads)}, {"rows", JsonArray(rows)}});
}

std::string JsonForm(PageForm& form) {
  std::vector<std::string> controls;
  for (const auto& control : form.Controls()) {
    const auto optional = [](const std::string& text) { return text.empty() ? std::string() : JsonQuoted(text); };
    std::vector<std::string> options;
    for (const std::string& option : control->Options()) options.push_back(JsonQuoted(option));
    std::string subForm;
    if (control->kind == ControlKind::SubForms) {
      const int current = control->currentSubForm();
      if (current >= 0 && current < static_cast<int>(control->subForms.size()))
        subForm = JsonForm(*control->subForms[static_cast<std::size_t>(current)]);
    }
    controls.push_back(JsonObject({{"kind", JsonQuoted(NameOf(control->kind))},
                                   {"label", JsonQuoted(control->label)},
                                   {"value", control->text ? JsonQuoted(control->Text()) : ""},
                                   {"summary", optional(SummaryOf(*control))},
                                   {"options", options.empty() ? "" : JsonArray(options)},
                                   {"unit", optional(control->UnitText())},
                                   {"key", optional(control->key)},
                                   {"enabled", JsonBool(control->IsEnabled())},
                                   {"shown", JsonBool(control->IsShown())},
                                   {"group", control->group ? JsonForm(*control->group) : ""},
                                   {"table", control->table ? JsonTable(*control->table) : ""},
                                   {"form", subForm}}));
  }
  return JsonArray(controls);
}

/// A place of the tree, or of what only old files hold; null, told to the user, where there is none.
CYbSEKvfBase* FindShown(CFlowModelDoc& document, const std::string& typed, Streams streams) {
  const SetupPath path = ParseSetupPath(typed);
  for (const auto& retired : document.Global().Retired()) {
    if (path.steps.empty() || path.steps.front().name != retired->GetSectionName()) continue;
    if (CYbSEKvfBase* node = FindNode(*retired, {path.steps.begin() + 1, path.steps.end()})) return node;
  }
  return FindNodeOrReport(document, path, typed, streams);
}

int PageCommand(const std::string& file, const std::string& typed, bool json, Streams streams) {
  CFlowModelDoc document;
  if (!OpenSetup(document, file, streams)) return kCouldNot;
  PrintLoadReportHint(document, streams);
  ReadProcessedData(document, streams);
  CYbSEKvfBase* node = FindShown(document, typed, streams);
  if (!node) return kCouldNot;
  const PageClass* pageClass = PageClassOf(*node);
  NobodyToAsk host;
  const auto page = pageClass ? MakePage(*pageClass, *node, {document, host, {}}) : nullptr;
  if (!page) {
    fmt::print(streams.err, "{}: this place has no page; what it holds shows on the page of a place above it\n", typed);
    return kCouldNot;
  }
  if (json)
    fmt::print(streams.out, "{}\n",
               JsonObject({{"path", JsonQuoted(typed)},
                           {"title", JsonQuoted(node->GetTitle())},
                           {"controls", JsonForm(page->Form())}}));
  else
    fmt::print(streams.out, "{}", FormText(page->Form()));
  return kDone;
}

}  // namespace

void OfferPageCommand(CommandOffers& offers) {
  struct Options {
    std::string file, path;
    bool json = false;
  };
  auto options = std::make_shared<Options>();
  Command page = offers.Offer("page", "Show the page of a node as text, control by control", [offers, options] {
    return PageCommand(options->file, options->path, options->json, offers.Output());
  });
  AddSetup(page, options->file);
  page.Add("PATH", options->path, "The node").Required();
  page.AddFlag("--json", options->json, "As JSON");
}

}  // namespace tervane
