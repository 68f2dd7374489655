// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/document/coverage_page.h"

#include <algorithm>

#include <fmt/format.h>

#include "core/list.h"
#include "core/path.h"
#include "data/datafile_request.h"
#include "pages/parts/plot_content.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

/// A row of the table of files.
class CoverageFileItem : public CTvnKvfBase {
 public:
  explicit CoverageFileItem(CYbSEKvfBase* list) : CTvnKvfBase("File", "File_%d", list) {}

  const CoverageRow* row = nullptr;
};
class CoverageFileList : public CYbSEKvfListBase<CoverageFileItem> {
 public:
  CoverageFileList() : CYbSEKvfListBase("Files", "Files", nullptr) {}
};

/// A row of the table of totals: a forcing's station, or its mean over the domain.
class CoverageTotalsItem : public CTvnKvfBase {
 public:
  explicit CoverageTotalsItem(CYbSEKvfBase* list) : CTvnKvfBase("Total", "Total_%d", list) {}

  const ForcingTotals* totals = nullptr;
  std::size_t column = 0;
};
class CoverageTotalsList : public CYbSEKvfListBase<CoverageTotalsItem> {
 public:
  CoverageTotalsList() : CYbSEKvfListBase("Totals", "Totals", nullptr) {}
};

namespace {

template <class Item>
Item& As(CYbSEKvfBase& item) {
  return static_cast<Item&>(item);
}

std::string DateText(std::int64_t seconds) { return DateInWords(CYbDateTime::FromSecondsSinceEpoch(seconds)); }

/// The rectangle around a file's values, for the map.
std::shared_ptr<const CYbShapeData> OutlineOf(const Envelope& box) {
  auto outline = std::make_shared<CTvnShapeData>();
  outline->Create(ShapeKind::Line, {}, {});
  Shape shape;
  shape.points = {
      {box.xMin, box.yMin}, {box.xMin, box.yMax}, {box.xMax, box.yMax}, {box.xMax, box.yMin}, {box.xMin, box.yMin}};
  shape.parts = {0};
  outline->AddShape(std::move(shape));
  return outline;
}

/// "31 cells of the domain have no topography" and all else that is to be known of a file, a line each.
std::string TextOf(const CoverageRow& row) {
  std::string text;
  for (const Finding& remark : row.remarks) {
    text += fmt::format("{}{}: {}", text.empty() ? "" : "\n", NameOf(remark.severity), remark.text);
    if (!remark.detail.empty()) text += fmt::format(" ({})", remark.detail);
  }
  return text.empty() ? "nothing is wrong with it" : text;
}

std::string TextOf(const ForcingTotals& totals) {
  std::string text = totals.Heading();
  for (const Finding& remark : totals.remarks) text += fmt::format("\n{}: {}", NameOf(remark.severity), remark.text);
  for (const ForcingTotals::Column& column : totals.columns)
    if (!column.problem.empty()) text += fmt::format("\nerror: {}: {}", column.name, column.problem);
  return text;
}

}  // namespace

CCoverageDlg::CCoverageDlg(CYbSEKvfBase& node, PageContext context)
    : PageOf(node, std::move(context)),
      files_(std::make_unique<CoverageFileList>()),
      totals_(std::make_unique<CoverageTotalsList>()) {}

CCoverageDlg::~CCoverageDlg() = default;

bool CCoverageDlg::Follow() {
  const auto computation = Node().Board();
  // Nobody would come back to what is computed beside the window.
  if (!Context().syncSoon) computation->Run();
  if (!computation->IsDone() || computation->Result() == board_) return false;
  ShowBoard(computation->Result());
  return true;
}

void CCoverageDlg::ShowBoard(std::shared_ptr<const CoverageBoard> board) {
  board_ = std::move(board);
  // What needs the user most comes first.
  std::vector<const CoverageRow*> rows;
  for (const CoverageRow& row : board_->rows) rows.push_back(&row);
  std::ranges::stable_sort(rows, std::greater(), &CoverageRow::state);
  files_->SetItemCount(static_cast<int>(rows.size()), 1);
  for (int number = 1; number <= files_->GetItemCount(); ++number)
    files_->GetItem(number)->row = rows[static_cast<std::size_t>(number - 1)];

  int count = 0;
  for (const ForcingTotals& totals : board_->forcings) count += static_cast<int>(totals.columns.size());
  totals_->SetItemCount(count, 1);
  int number = 0;
  for (const ForcingTotals& totals : board_->forcings) {
    for (std::size_t column = 0; column < totals.columns.size(); ++column) {
      CoverageTotalsItem& item = *totals_->GetItem(++number);
      item.totals = &totals;
      item.column = column;
    }
  }
  totalsTable_->ClearColumns();
  TableColumn& forcing = totalsTable_->Add("Forcing", 190);
  forcing.text = [](CYbSEKvfBase& item) {
    const ForcingTotals& totals = *As<CoverageTotalsItem>(item).totals;
    return fmt::format("{}, {}", totals.forcing.forcing.title, totals.form.isTotal ? "total" : "mean");
  };
  forcing.press = [this](CYbSEKvfBase& item) { GoTo(As<CoverageTotalsItem>(item).totals->forcing.path); };
  totalsTable_->Add("Station", 110).text = [](CYbSEKvfBase& item) {
    const CoverageTotalsItem& of = As<CoverageTotalsItem>(item);
    return of.totals->ColumnText(of.column);
  };
  totalsTable_->Add("Unit", 50).text = [](CYbSEKvfBase& item) {
    return As<CoverageTotalsItem>(item).totals->form.unit;
  };
  for (std::size_t period = 0; period < board_->periods.size(); ++period) {
    TableColumn& value = totalsTable_->Add(board_->periods[period].name, 80);
    value.text = [this, period](CYbSEKvfBase& item) {
      const CoverageTotalsItem& of = As<CoverageTotalsItem>(item);
      return of.totals->ValueText(of.column, period, board_->periods[period].span);
    };
    value.toolTip = "In brackets the share of the time that has values";
  }
  const bool isThere =
      std::ranges::any_of(board_->rows, [&](const auto& row) { return row.file.path == chosen_; }) ||
      std::ranges::any_of(board_->forcings, [&](const auto& totals) { return totals.forcing.path == chosen_; });
  if (isThere) return;
  if (!rows.empty()) ShowFile(1);
}

void CCoverageDlg::ShowFile(int row) {
  const CoverageRow& shown = *files_->GetItem(row)->row;
  chosen_ = shown.file.path;
  extent_ = shown.extent && !shown.isInDegrees ? OutlineOf(*shown.extent) : nullptr;
}

void CCoverageDlg::ShowTotals(int row) {
  chosen_ = totals_->GetItem(row)->totals->forcing.path;
  extent_ = nullptr;
}

void CCoverageDlg::GoTo(const std::string& path) const {
  const CYbSEKvfBase* node = FindNode(*Node().GetRoot(), ParseSetupPath(path).steps);
  if (node && Context().selectNode) Context().selectNode(*node);
}

// ---- What is shown

std::string CCoverageDlg::SimulationText() const {
  if (!board_) return "...";
  const auto& simulation = board_->request.simulation;
  return simulation ? fmt::format("{} to {}", DateText(simulation->start), DateText(simulation->end))
                    : "its start and end are no dates, or in no order";
}

std::string CCoverageDlg::DomainText() const {
  if (!board_) return "...";
  if (!board_->domain) return board_->domainProblem;
  const GridGeometry& geometry = board_->domain->Geometry();
  return fmt::format("{} of {} x {} cells of {} m", board_->domainCells, geometry.nx, geometry.ny,
                     ShortestNumber(geometry.cellSize));
}

std::string CCoverageDlg::RemarksText() const {
  if (!board_) return {};
  for (const CoverageRow& row : board_->rows)
    if (row.file.path == chosen_)

      return fmt::format("{}{}{}:\n{}", row.file.title, row.file.use.path.empty() ? "" : ", ",
                         FileNameOf(row.file.use.path), TextOf(row));
  for (const ForcingTotals& totals : board_->forcings)
    if (totals.forcing.path == chosen_) return TextOf(totals);
  return "no data file is in use";
}

MapContent CCoverageDlg::Map() {
  const auto computation = Node().Board();
  MapContent map;
  if (!NowOrAwaited(computation, map.awaited)) return map;
  // What was computed beside the window is shown in the tables too.
  if (Follow() && Context().syncSoon) Context().syncSoon();
  std::shared_ptr<const CTvn2DOrthoRotatedGridData> grid = board_->domain;
  bool isMissing = false;
  for (const CoverageRow& row : board_->rows) {
    if (row.file.path != chosen_ || !row.missingCells) continue;
    grid = row.missingCells;
    isMissing = true;
  }
  map = GridMap(Node(), grid, board_->domainProblem);
  if (!map.grids.empty()) {
    map.grids.front().isCodes = true;
    map.grids.front().withLegend = false;
    if (isMissing) LetStandOut(map, {.code = 2.0F});
  }
  if (extent_) map.shapes.push_back({extent_, {}});
  return map;
}

SeriesContent CCoverageDlg::Chart() {
  SeriesContent chart;
  if (!board_) return chart;
  for (const CoverageRow& row : board_->rows) {
    if (row.file.path != chosen_) continue;
    const auto* file = dynamic_cast<const DataFileNode*>(FindNode(*Node().GetRoot(), ParseSetupPath(chosen_).steps));
    if (file && row.steps > 0 && row.cells == 0 && row.problem.empty()) return FileChart(*file);
    chart.message = row.file.use.isOverTime ? row.problem : "It has no values over time.";
    return chart;
  }
  for (const ForcingTotals& totals : board_->forcings) {
    if (totals.forcing.path != chosen_) continue;
    for (std::size_t column = 0; column < totals.columns.size(); ++column) {
      Series series;
      series.name = totals.columns[column].name;
      series.unit = totals.form.unit;
      series.isStepped = true;
      // A point in front of the first year, from which its step goes; the last period is the simulation as a whole.
      for (std::size_t period = 0; period + 1 < board_->periods.size() && period < totals.columns[column].sums.size();
           ++period) {
        const TimeSpan& span = board_->periods[period].span;
        const double value = totals.form.Of(totals.columns[column].sums[period]);
        if (period == 0) {
          series.times.push_back(CYbDateTime::FromSecondsSinceEpoch(span.start));
          series.values.push_back(value);
        }
        series.times.push_back(CYbDateTime::FromSecondsSinceEpoch(span.end));
        series.values.push_back(value);
      }
      chart.series.push_back(std::move(series));
    }
    const auto& simulation = board_->request.simulation;
    if (simulation)
      chart.period = {CYbDateTime::FromSecondsSinceEpoch(simulation->start),
                      CYbDateTime::FromSecondsSinceEpoch(simulation->end)};
  }
  return chart;
}

void CCoverageDlg::Describe(PageForm& form) {
  form.Shown("Simulation:", [this] {
    Follow();
    return SimulationText();
  });
  form.Shown("Model domain:", [this] { return DomainText(); });

  auto files = std::make_shared<TableForm>(*files_);
  files->ItemName("File");
  TableColumn& data = files->Add("Data", 170);
  data.text = [](CYbSEKvfBase& item) { return As<CoverageFileItem>(item).row->file.title; };
  data.icon = [](CYbSEKvfBase& item) {
    const CoverageState state = As<CoverageFileItem>(item).row->state;
    return std::string(NameOf(state));
  };
  data.press = [this](CYbSEKvfBase& item) { GoTo(As<CoverageFileItem>(item).row->file.path); };
  const auto add = [&](const char* head, int width, auto text) {
    files->Add(head, width).text = [text](CYbSEKvfBase& item) { return text(*As<CoverageFileItem>(item).row); };
  };
  add("File", 110, [](const CoverageRow& row) { return std::string(FileNameOf(row.file.use.path)); });
  add("Period", 160, [](const CoverageRow& row) { return row.PeriodText(); });
  add("Simulation", 150, [](const CoverageRow& row) { return row.problem.empty() ? row.TimeText() : row.problem; });
  add("Model domain", 170, [](const CoverageRow& row) { return row.AreaText(); });
  files->ShowOnly([this](int row) {
    ShowFile(row);
    if (Context().syncSoon) Context().syncSoon();
  });
  form.Table(files);
  form.Shown("Remarks:", [this] { return RemarksText(); });

  totalsTable_ = std::make_shared<TableForm>(*totals_);
  totalsTable_->ItemName("Total");
  totalsTable_->ShowOnly([this](int row) {
    ShowTotals(row);
    if (Context().syncSoon) Context().syncSoon();
  });
  form.Table(totalsTable_);
  form.Map([this] { return Map(); });
  form.Chart([this] { return Chart(); });
}

}  // namespace tervane
