// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <algorithm>
#include <map>
#include <set>

#include <fmt/format.h>

#include "document/key_reference.h"
#include "forms/page.h"
#include "forms/table_form.h"
#include "geometry/cart.h"
#include "pages/key_defaults.h"
#include "pages/overview_lines.h"
#include "pages/parts/plot_content.h"
#include "pages/place_names.h"
#include "pages/report/report.h"
#include "pages/report/report_pictures.h"
#include "pages/tree_entries.h"
#include "platform/text.h"
#include "simspec/review_notes.h"
#include "spatial/domain.h"

namespace tervane {

namespace {

constexpr std::string_view kNoUnit = "-";  ///< Of what has no dimension.
constexpr std::size_t kMostRows = 60;      ///< Of a table of a page.
constexpr int kMostAlike = 2;              ///< Pages of one kind, such as those of stations, whose plots are shown.

/// The default as the tool tip of the control tells it.
std::string DefaultInWords(KeyDefaults& defaults, const Control& control) {
  constexpr std::string_view kHead = "Default: ";
  const std::string tip = defaults.ToolTip(control);
  std::size_t begin = tip.starts_with(kHead) ? 0 : tip.find(std::string("\n") + std::string(kHead));
  if (begin == std::string::npos) return {};
  begin += kHead.size() + (tip[begin] == '\n' ? 1 : 0);
  std::string text = tip.substr(begin, tip.find('\n', begin) - begin);
  if (text.ends_with(fmt::format(" {}", kNoUnit))) text.resize(text.size() - kNoUnit.size() - 1);
  return text;
}

/// What one page shows otherwise than a new setup.
class PageDifferences {
 public:
  PageDifferences(KeyDefaults& defaults, const ReportDates& dates) : defaults_(defaults), dates_(dates) {}

  void Add(PageForm& form, const std::string& group = {}) {
    std::string before;
    for (const auto& control : form.Controls()) {
      if (!control->IsShown()) continue;
      if (control->group) Add(*control->group, SpokenLabel(control->label));
      if (control->table && !control->table->IsShownOnly()) AddTable(*control->table);
      if (control->kind == ControlKind::SubForms) {
        const int current = control->currentSubForm();
        if (current >= 0 && current < static_cast<int>(control->subForms.size()))
          Add(*control->subForms[static_cast<std::size_t>(current)], group);
      }
      std::string label = NameOf(*control);
      if (label.empty() && control->beside) label = before;
      before = label;
      AddValue(*control, group.empty() ? label : label.empty() ? group : fmt::format("{}, {}", group, label));
    }
  }
  ReportTable values{{"Value", "Here", "Default"}, {}};
  std::vector<ReportTable> tables;

 private:
  void AddValue(const Control& control, const std::string& label) {
    // What is disabled is used by nobody.
    if (!control.IsEnabled() || !control.isOfKey) return;
    const std::optional<std::string> value = ValueInWords(control);
    if (!value || value->empty()) return;
    // A text or a file has no default to go back to: what is filled in is told.
    const bool isFilled =
        control.kind == ControlKind::Text || control.kind == ControlKind::LongText || control.kind == ControlKind::File;
    if (!isFilled && !defaults_.Reset(control)) return;
    // A date in the name of a file is no date of the model.
    values.rows.push_back({label.empty() ? "Choice" : label,
                           control.kind == ControlKind::File ? *value : dates_.In(*value),
                           isFilled ? "" : dates_.In(DefaultInWords(defaults_, control))});
  }
  void AddTable(const TableForm& table) {
    ReportTable told;
    std::vector<int> columns;
    for (int column = 1; column <= table.ColumnCount(); ++column)
      if (!table.Column(column)->IsButton()) columns.push_back(column);
    for (const int column : columns) told.heads.push_back(Replaced(table.Head(column), "\n", " "));
    std::size_t more = 0;
    for (int row = 1; row <= table.RowCount(); ++row) {
      const auto isCheck = [&](int column) { return table.Kind(row, column) == CellKind::Check; };
      // A list of all that may be chosen tells what is chosen.
      if (!columns.empty() && isCheck(columns.front()) && table.Cell(row, columns.front()) == "0") continue;
      // Review notes, which are kept among the extra parameters, have a section of their own.
      if (!columns.empty() && table.Cell(row, columns.front()).starts_with(kReviewNotePrefix)) continue;
      if (told.rows.size() >= kMostRows) {
        ++more;
        continue;
      }
      auto& cells = told.rows.emplace_back();
      for (const int column : columns) {
        const std::string text = table.ShownCell(row, column);
        if (isCheck(column))
          cells.push_back(text == "1" ? "yes" : text == "0" ? "no" : text);
        else
          cells.push_back(table.Kind(row, column) == CellKind::File ? text : dates_.In(text));
      }
    }
    LeaveEmptyColumns(told);
    if (more > 0) told.rows.push_back({fmt::format("and {} more", more)});
    if (!told.rows.empty() && !told.heads.empty()) tables.push_back(std::move(told));
  }

  static void LeaveEmptyColumns(ReportTable& table) {
    for (std::size_t column = table.heads.size(); column-- > 0;) {
      if (!std::ranges::all_of(table.rows, [&](const auto& row) { return row[column].empty(); })) continue;
      const auto place = static_cast<std::ptrdiff_t>(column);
      table.heads.erase(table.heads.begin() + place);
      for (auto& row : table.rows) row.erase(row.begin() + place);
    }
  }

  KeyDefaults& defaults_;
  const ReportDates& dates_;
};

/// A page with what it shows otherwise than a new setup.
struct ChangedPage {
  std::string kind, place, name;
  ReportTable values;
  std::vector<ReportTable> tables;

  /// Whether both fill in the same fields, so that they can be rows of one table.
  bool IsLike(const ChangedPage& other) const {
    return kind == other.kind && tables.empty() && other.tables.empty() &&
           std::ranges::equal(values.rows, other.values.rows,
                              [](const auto& a, const auto& b) { return a.front() == b.front(); });
  }
};

/// Whether the tables of a page tell all that these pages do.
bool AreToldBy(const ChangedPage& above, std::span<const ChangedPage> pages) {
  std::set<std::string> told;
  for (const ReportTable& table : above.tables)
    for (const auto& row : table.rows) told.insert(row.begin(), row.end());
  return std::ranges::all_of(pages, [&](const ChangedPage& page) {
    return std::ranges::all_of(page.values.rows, [&](const auto& value) { return told.contains(value[1]); });
  });
}

/// Several pages that are alike, a row each.
void AddAlike(std::span<const ChangedPage> pages, std::vector<ReportBlock>& blocks) {
  ReportTable table{{"Page"}, {}};
  for (const auto& value : pages.front().values.rows) table.heads.push_back(value.front());
  for (const ChangedPage& page : pages) {
    auto& row = table.rows.emplace_back(std::vector<std::string>{page.name});
    for (const auto& value : page.values.rows) row.push_back(value[1]);
  }
  const std::string place = pages.front().place.substr(0, pages.front().place.rfind(" > "));
  blocks.push_back(ReportHeading{fmt::format("{}: {} pages", place, pages.size())});
  blocks.push_back(std::move(table));
}

/// Settings of maps say nothing of the model.
bool IsOfModel(const TreeEntry& entry) { return !entry.path.starts_with("Overlays"); }

std::string PlaceOfPage(CYbSEKvfBase& node) {
  std::string place;
  for (const std::string& title : PlaceNames::TitlesTo(node)) place += (place.empty() ? "" : " > ") + title;
  return place;
}

}  // namespace

void ReportValues(ReportContext& context, std::vector<ReportBlock>& blocks) {
  NobodyToAsk host;
  const std::vector<TreeEntry> entries = TreeEntries(context.document.Root(), kSetupDataTree);
  std::vector<ChangedPage> pages;
  for (std::size_t place = 1; place < entries.size(); ++place) {
    const TreeEntry& entry = entries[place];
    if (!IsOfModel(entry)) continue;
    const auto page = MakePageToRead(*entry.page, *entry.node, {context.document, host, {}});
    if (!page) continue;
    // What a table tells of the cells of zones is computed for the map beside it.
    page->Form().ForEach([](Control& control) {
      if (control.kind == ControlKind::Map && control.map && control.IsShown()) Finished(control.map);
    });
    KeyDefaults defaults;
    PageDifferences differences(defaults, context.dates);
    differences.Add(page->Form());
    if (differences.values.rows.empty() && differences.tables.empty()) continue;
    pages.push_back({NumberlessPath(entry.path), PlaceOfPage(*entry.node), entry.title, std::move(differences.values),
                     std::move(differences.tables)});
  }
  constexpr std::ptrdiff_t kFewest = 3;
  for (auto page = pages.begin(); page != pages.end();) {
    const auto end = std::find_if_not(page, pages.end(), [&](const ChangedPage& other) { return other.IsLike(*page); });
    if (end - page >= kFewest) {
      if (page == pages.begin() || !AreToldBy(*std::prev(page), {page, end})) AddAlike({page, end}, blocks);
      page = end;
      continue;
    }
    blocks.push_back(ReportHeading{page->place});
    if (!page->values.rows.empty()) blocks.push_back(page->values);
    for (const ReportTable& table : page->tables) blocks.push_back(table);
    ++page;
  }
  if (blocks.empty()) blocks.push_back(ReportText{"All values are those of a new setup."});
}

void ReportDomain(ReportContext& context, std::vector<ReportBlock>& blocks) {
  auto* domain = context.document.Root().Important(kDomain);
  if (!domain || !domain->HasGeometry()) {
    blocks.push_back(ReportText{"No file that can be read tells yet where the model lies."});
    return;
  }
  const GridGeometry grid = domain->GetModelGeometry();
  const std::string projection = CYbMapProjection(grid.projection).Name();
  ReportTable table;
  table.rows = {{"Grid", fmt::format("{} columns, {} rows", grid.nx, grid.ny)},
                {"Cell size", fmt::format("{} m", ShortestNumber(grid.cellSize))},
                {"Lower left corner", fmt::format("{}, {}", ShortestNumber(grid.x0), ShortestNumber(grid.y0))}};
  if (grid.rotation != 0.0) table.rows.push_back({"Rotation", fmt::format("{}°", ShortestNumber(grid.rotation))});
  if (!projection.empty()) table.rows.push_back({"Projection", projection});
  const std::function<MapContent()> content = [domain] {
    MapContent map = domain->Type == CCatchmentKvf::kGridFile
                         ? FileMap(domain->GridFile())
                         : ShapeFileMap(domain->ShapeFile(), domain->ShapeAxisUnit);
    for (ShapeLayer& shapes : map.shapes) shapes.isDomain = shapes.isFilled = true;
    return map;
  };
  blocks.push_back(std::move(table));
  if (auto picture = DrawMap(Finished(content))) {
    picture->caption = "The model domain";
    blocks.push_back(std::move(*picture));
  }
}

void ReportInputs(ReportContext& context, std::vector<ReportBlock>& blocks) {
  NobodyToAsk host;
  const std::vector<TreeEntry> entries = TreeEntries(context.document.Root(), kSetupDataTree);
  std::map<std::string, int> alike;
  std::set<std::string> drawn;
  const CYbSEKvfBase* domain = context.document.Root().Important(kDomain);
  for (std::size_t place = 1; place < entries.size(); ++place) {
    const TreeEntry& entry = entries[place];
    const std::string kind = NumberlessPath(entry.path);
    // The domain has a section of its own.
    if (!IsOfModel(entry) || entry.node == domain || (kind != entry.path && alike[kind] >= kMostAlike)) continue;
    const auto page = MakePageToRead(*entry.page, *entry.node, {context.document, host, {}});
    if (!page) continue;
    std::vector<ReportPicture> pictures;
    page->Form().ForEach([&](Control& control) {
      if (!control.IsShown()) return;
      std::optional<ReportPicture> picture;
      if (control.kind == ControlKind::Map && control.map) picture = DrawMap(Finished(control.map));
      if (control.kind == ControlKind::Chart && control.chart) picture = DrawChart(Finished(control.chart));
      // What several pages show alike, such as the ground, stands once.
      if (!picture || !drawn.insert(picture->svg).second) return;
      picture->caption = SpokenLabel(control.label);
      pictures.push_back(std::move(*picture));
    });
    if (pictures.empty()) continue;
    const int number = ++alike[kind];
    blocks.push_back(ReportHeading{PlaceOfPage(*entry.node)});
    for (ReportPicture& picture : pictures) blocks.push_back(std::move(picture));
    if (kind == entry.path || number < kMostAlike) continue;
    const auto more =
        std::ranges::count_if(entries, [&](const TreeEntry& other) { return NumberlessPath(other.path) == kind; }) -
        kMostAlike;
    if (more > 0) blocks.push_back(ReportText{fmt::format("{} more of this kind are not shown.", more), true});
  }
}

}  // namespace tervane
