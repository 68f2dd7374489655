// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/document/coverage_page.h"

#include <algorithm>
#include <map>

#include <fmt/format.h>

#include "core/path.h"
#include "data/datafile_request.h"
#include "pages/parts/plot_content.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

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

/// What the files of a forcing's stations must have in common to be told in one line: all but who the station is.
std::string CauseOf(const CoverageRow& row) {
  const std::size_t colon = row.file.title.find(": ");
  SetupPath path = ParseSetupPath(row.file.path);
  constexpr std::size_t kStationAndFile = 2;
  // What is no station's stands alone.
  if (colon == std::string::npos || path.steps.size() <= kStationAndFile) return row.file.path;
  std::string owner;
  for (std::size_t i = 0; i + kStationAndFile < path.steps.size(); ++i)
    owner += fmt::format("{}#{}/", path.steps[i].name, path.steps[i].instance);
  return fmt::format("{}\n{}\n{}\n{}\n{}\n{}\n{}\n{}", owner, row.file.title.substr(colon), NameOf(row.state),
                     row.file.use.path, row.PeriodText(), row.problem.empty() ? row.TimeText() : row.problem,
                     row.AreaText(), TextOf(row));
}

/// "▸ 50 × Station Data - Precipitation Rate": a group with its sign, or the title of one file.
std::string DataText(const CoverageFileRow& row) {
  if (row.count == 1) return (row.isInGroup ? "    " : "") + row.file->file.title;
  return fmt::format("{} {} × {}", row.isOpen ? "▾" : "▸", row.count,
                     row.file->file.title.substr(row.file->file.title.find(": ") + 2));
}

std::string TextOf(const ForcingTotals& totals) {
  std::string text = totals.Heading();
  for (const Finding& remark : totals.remarks) text += fmt::format("\n{}: {}", NameOf(remark.severity), remark.text);
  for (const ForcingTotals::Column& column : totals.columns)
    if (!column.problem.empty()) text += fmt::format("\nerror: {}: {}", column.name, column.problem);
  return text;
}

}  // namespace

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
  GroupFiles();
  totals_.clear();
  for (const ForcingTotals& totals : board_->forcings)
    for (std::size_t column = 0; column < totals.columns.size(); ++column)
      totals_.push_back({&totals, column, totals.Decimals()});
  // Each period has a column of its own.
  using Row = CoverageTotalsRow;
  totalsTable_->ClearColumns();
  totalsTable_
      ->Value("Forcing",
              [](const Row& row) {
                return fmt::format("{}, {}", row.totals->forcing.forcing.title,
                                   row.totals->form.isTotal ? "total" : "mean");
              })
      .Width(190)
      .Link([this](const Row& row) { GoTo(row.totals->forcing.path); });
  totalsTable_->Value("Station", [](const Row& row) { return row.totals->ColumnText(row.column); }).Width(110);
  totalsTable_->Value("Unit", [](const Row& row) { return row.totals->form.unit; }).Width(50);
  for (std::size_t period = 0; period < board_->periods.size(); ++period)
    totalsTable_
        ->Value(board_->periods[period].name,
                [this, period](const Row& row) {
                  return row.totals->ValueText(row.column, period, board_->periods[period].span, row.decimals);
                })
        .Width(80)
        .ToolTip("In brackets the share of the time that has values");
  const bool isThere =
      std::ranges::any_of(board_->rows, [&](const auto& row) { return row.file.path == chosen_; }) ||
      std::ranges::any_of(board_->forcings, [&](const auto& totals) { return totals.forcing.path == chosen_; });
  if (isThere) return;
  if (!files_.empty()) ShowFile(1);
}

void CCoverageDlg::GroupFiles() {
  std::vector<const CoverageRow*> rows;
  for (const CoverageRow& row : board_->rows) rows.push_back(&row);
  std::ranges::stable_sort(rows, std::greater(), &CoverageRow::state);
  // The stations of a forcing of which the same is to be told are one line, which opens.
  std::map<std::string, std::size_t> groupOf;
  std::vector<std::vector<const CoverageRow*>> groups;
  for (const CoverageRow* row : rows) {
    const auto [found, isNew] = groupOf.emplace(CauseOf(*row), groups.size());
    if (isNew) groups.emplace_back();
    groups[found->second].push_back(row);
  }
  files_.clear();
  for (const auto& group : groups) {
    if (group.size() == 1) {
      files_.push_back({group.front()});
      continue;
    }
    const std::string cause = CauseOf(*group.front());
    const bool isOpen = open_.contains(cause);
    files_.push_back({group.front(), group.size(), isOpen, cause});
    if (!isOpen) continue;
    for (const CoverageRow* row : group) files_.push_back({row, 1, false, {}, true});
  }
}

void CCoverageDlg::OpenOrGoTo(const CoverageFileRow& row) {
  if (row.count == 1) return GoTo(row.file->file.path);
  const std::string cause = row.cause;
  if (!open_.erase(cause)) open_.insert(cause);
  GroupFiles();
  if (Context().syncSoon) Context().syncSoon();
}

void CCoverageDlg::ShowFile(int row) {
  const CoverageRow& shown = *files_[static_cast<std::size_t>(row - 1)].file;
  chosen_ = shown.file.path;
  extent_ = shown.extent && !shown.isInDegrees ? OutlineOf(*shown.extent) : nullptr;
}

void CCoverageDlg::ShowTotals(int row) {
  chosen_ = totals_[static_cast<std::size_t>(row - 1)].totals->forcing.path;
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
  std::string text;
  for (const ForcingTotals& totals : board_->forcings)
    if (totals.forcing.path == chosen_) text += (text.empty() ? "" : "\n") + TextOf(totals);
  return text.empty() ? "no data file is in use" : text;
}

std::string CCoverageDlg::ChecksText() const {
  std::string text;
  for (const CoverageCheckResult& check : board_ ? board_->checks : std::vector<CoverageCheckResult>())
    for (const Finding& finding : check.findings) text += fmt::format("{}{}", text.empty() ? "" : "\n", finding.text);
  for (const Finding& finding : board_ ? board_->spans : std::vector<Finding>())
    text += fmt::format("{}{}", text.empty() ? "" : "\n", finding.text);
  return text;
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
  const auto isChosen = [this](const ForcingTotals& totals) { return totals.forcing.path == chosen_; };
  const bool areSeveral = std::ranges::count_if(board_->forcings, isChosen) > 1;
  for (const ForcingTotals& totals : board_->forcings) {
    if (!isChosen(totals)) continue;
    for (std::size_t column = 0; column < totals.columns.size(); ++column) {
      Series series;
      series.name = totals.columns[column].name;
      if (areSeveral) series.name = fmt::format("{}, {}", totals.forcing.forcing.title, series.name);
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

  using Row = CoverageFileRow;
  auto files = std::make_shared<TableOf<Row>>(files_);
  files->ItemName("File");
  files->Value("Data", [](const Row& row) { return DataText(row); })
      .Width(170)
      .IconOf([](const Row& row) { return std::string(NameOf(row.file->state)); })
      .Link([this](const Row& row) { OpenOrGoTo(row); });
  files->Value("File", [](const Row& row) { return std::string(FileNameOf(row.file->file.use.path)); }).Width(110);
  files->Value("Period", [](const Row& row) { return row.file->PeriodText(); }).Width(160);
  files
      ->Value("Simulation",
              [](const Row& row) { return row.file->problem.empty() ? row.file->TimeText() : row.file->problem; })
      .Width(150);
  files->Value("Model domain", [](const Row& row) { return row.file->AreaText(); }).Width(170);
  files->ShowOnly();
  files->OnChoose([this](int row) { ShowFile(row); });
  form.Table(files);
  form.Shown("Remarks:", [this] { return RemarksText(); });
  form.Notice([this] { return ChecksText(); });

  totalsTable_ = std::make_shared<TableOf<CoverageTotalsRow>>(totals_);
  totalsTable_->ItemName("Total");
  totalsTable_->ShowOnly();
  totalsTable_->OnChoose([this](int row) { ShowTotals(row); });
  form.Table(totalsTable_);
  form.Map([this] { return Map(); });
  form.Chart([this] { return Chart(); });
}

}  // namespace tervane
