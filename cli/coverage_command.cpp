// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <algorithm>
#include <cmath>
#include <vector>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/command_line.h"
#include "cli/commands.h"
#include "cli/parts/json.h"
#include "cli/parts/setup_file.h"
#include "cli/parts/text_table.h"
#include "data/datafile_request.h"
#include "platform/paths.h"
#include "platform/text.h"
#include "spatial/coverage.h"

namespace tervane {

namespace {

std::string DateText(std::int64_t seconds) { return DateInWords(CYbDateTime::FromSecondsSinceEpoch(seconds)); }

std::string SimulationText(const CoverageBoard& board) {
  const auto& simulation = board.request.simulation;
  return simulation ? fmt::format("{} to {}", DateText(simulation->start), DateText(simulation->end))
                    : "its dates are none";
}

std::string DomainText(const CoverageBoard& board) {
  if (!board.domain) return board.domainProblem;
  const GridGeometry& geometry = board.domain->Geometry();
  return fmt::format("{} of {} x {} cells of {} m", board.domainCells, geometry.nx, geometry.ny,
                     ShortestNumber(geometry.cellSize));
}

void WriteText(const CoverageBoard& board, std::ostream& out) {
  fmt::print(out, "simulation: {}\ndomain: {}\n", SimulationText(board), DomainText(board));
  TextRows rows{{"state", "data", "file", "item", "period", "simulation", "domain"}};
  for (const CoverageRow& row : board.rows)
    rows.push_back({std::string(NameOf(row.state)), row.file.title, std::string(FileNameOf(row.file.use.path)),
                    row.item, row.PeriodText(), row.TimeText(), row.AreaText()});
  fmt::print(out, "\nfiles: {}\n", board.rows.size());
  if (!board.rows.empty()) WriteTextTable(rows, out);
  for (const CoverageRow& row : board.rows)
    for (const Finding& remark : row.remarks)
      fmt::print(out, "{}: {}: {}{}\n", NameOf(remark.severity), OneLine(row.file.path), OneLine(remark.text),
                 remark.detail.empty() ? "" : fmt::format(" ({})", OneLine(remark.detail)));
  for (const CoverageCheckResult& check : board.checks)
    for (const Finding& finding : check.findings)
      fmt::print(out, "{}: {}: {}\n", NameOf(finding.severity), OneLine(check.check.path), OneLine(finding.text));
  for (const ForcingTotals& totals : board.forcings) {
    fmt::print(out, "\n{}: {}; in brackets shares of domain and time\n", totals.forcing.path, totals.Heading());
    TextRows table{{"station"}};
    for (const TotalsPeriod& period : board.periods) table.front().push_back(period.name);
    const int decimals = totals.Decimals();
    for (std::size_t column = 0; column < totals.columns.size(); ++column) {
      auto& row = table.emplace_back();
      row.push_back(totals.ColumnText(column));
      for (std::size_t period = 0; period < board.periods.size(); ++period)
        row.push_back(totals.ValueText(column, period, board.periods[period].span, decimals));
    }
    WriteTextTable(table, out);
    for (const ForcingTotals::Column& column : totals.columns)
      if (!column.problem.empty()) fmt::print(out, "error: {}: {}\n", OneLine(column.name), OneLine(column.problem));
    for (const Finding& remark : totals.remarks)
      fmt::print(out, "{}: {}\n", NameOf(remark.severity), OneLine(remark.text));
  }
}

// ---- JSON

std::string JsonTime(std::int64_t seconds) {
  return JsonQuoted(CYbDateTime::FromSecondsSinceEpoch(seconds).Format("%Y-%m-%d %H:%M:%S"));
}

std::string JsonSpan(const TimeSpan& span) {
  return JsonObject({{"start", JsonTime(span.start)}, {"end", JsonTime(span.end)}});
}

std::string Optional(const std::string& text) { return text.empty() ? std::string() : JsonQuoted(text); }

std::string JsonRemark(const Finding& remark) {
  return JsonObject({{"severity", JsonQuoted(NameOf(remark.severity))},
                     {"text", JsonQuoted(remark.text)},
                     {"detail", Optional(remark.detail)}});
}

std::string JsonRow(const CoverageRow& row) {
  std::vector<std::string> gaps, remarks;
  for (const TimeSpan& gap : row.gaps) gaps.push_back(JsonSpan(gap));
  for (const Finding& remark : row.remarks) remarks.push_back(JsonRemark(remark));
  const auto whenOverTime = [&](const std::string& text) { return row.file.use.isOverTime ? text : std::string(); };
  const auto whenAsked = [&](std::size_t count) { return row.cells > 0 ? std::to_string(count) : std::string(); };
  const auto& box = row.extent;
  return JsonObject({{"path", JsonQuoted(row.file.path)},
                     {"title", JsonQuoted(row.file.title)},
                     {"file", JsonQuoted(row.file.use.path)},
                     {"item", Optional(row.item)},
                     {"state", JsonQuoted(NameOf(row.state))},
                     {"problem", Optional(row.problem)},
                     {"start", row.period ? JsonTime(row.period->start) : ""},
                     {"end", row.period ? JsonTime(row.period->end) : ""},
                     {"steps", row.steps > 0 ? std::to_string(row.steps) : ""},
                     {"secondsLate", whenOverTime(std::to_string(row.late))},
                     {"secondsEarly", whenOverTime(std::to_string(row.early))},
                     {"gaps", whenOverTime(JsonArray(gaps))},
                     {"extent", box ? JsonArray({ShortestNumber(box->xMin), ShortestNumber(box->yMin),
                                                 ShortestNumber(box->xMax), ShortestNumber(box->yMax)})
                                    : ""},
                     {"domainCells", whenAsked(row.cells)},
                     {"missingCells", whenAsked(row.missing)},
                     {"remarks", JsonArray(remarks)}});
}

std::string JsonTotals(const ForcingTotals& totals, const std::vector<TotalsPeriod>& periods) {
  std::vector<std::string> columns, remarks;
  for (const ForcingTotals::Column& column : totals.columns) {
    std::vector<std::string> values;
    for (std::size_t i = 0; i < column.sums.size(); ++i) {
      // JSON knows no number that is none.
      const bool isKnown = column.sums[i].covered > 0 && std::isfinite(totals.form.Of(column.sums[i]));
      values.push_back(JsonObject({{"period", JsonQuoted(periods[i].name)},
                                   {"value", isKnown ? ShortestNumber(totals.form.Of(column.sums[i])) : ""},
                                   {"secondsCovered", std::to_string(column.sums[i].covered)},
                                   {"seconds", std::to_string(periods[i].span.Seconds())}}));
    }
    columns.push_back(JsonObject({{"name", JsonQuoted(column.name)},
                                  {"share", column.share ? ShortestNumber(*column.share) : ""},
                                  {"problem", Optional(column.problem)},
                                  {"values", JsonArray(values)}}));
  }
  for (const Finding& remark : totals.remarks) remarks.push_back(JsonRemark(remark));
  return JsonObject({{"path", JsonQuoted(totals.forcing.path)},
                     {"title", JsonQuoted(totals.forcing.forcing.title)},
                     {"kind", JsonQuoted(totals.form.isTotal ? "total" : "mean")},
                     {"unit", JsonQuoted(totals.form.unit)},
                     {"columns", JsonArray(columns)},
                     {"remarks", JsonArray(remarks)}});
}

void WriteJson(const CoverageBoard& board, std::ostream& out) {
  std::vector<std::string> files, forcings, checks;
  for (const CoverageCheckResult& check : board.checks)
    for (const Finding& finding : check.findings)
      checks.push_back(JsonObject({{"path", JsonQuoted(check.check.path)}, {"text", JsonQuoted(finding.text)}}));
  for (const CoverageRow& row : board.rows) files.push_back(JsonRow(row));
  for (const ForcingTotals& totals : board.forcings) forcings.push_back(JsonTotals(totals, board.periods));
  fmt::print(out, "{}\n",
             JsonObject({{"simulation", board.request.simulation ? JsonSpan(*board.request.simulation) : ""},
                         {"domainCells", board.domain ? std::to_string(board.domainCells) : ""},
                         {"domainProblem", Optional(board.domainProblem)},
                         {"files", JsonArray(files)},
                         {"forcings", JsonArray(forcings)},
                         {"checks", JsonArray(checks)}}));
}

}  // namespace

int CoverageCommand(const std::string& file, bool json, Streams streams) {
  CFlowModelDoc document;
  if (!OpenSetup(document, file, streams)) return kCouldNot;
  CoverageBoard board;
  ComputeCoverage(AskCoverage(document.Root()), nullptr, board);
  json ? WriteJson(board, streams.out) : WriteText(board, streams.out);
  const auto isNote = [](const Finding& remark) { return remark.severity == Severity::Note; };
  const bool isCovered =
      board.domain && board.request.simulation &&
      std::ranges::all_of(board.checks, [](const auto& check) { return check.findings.empty(); }) &&
      std::ranges::all_of(board.rows, [](const CoverageRow& row) { return row.state <= CoverageState::Note; }) &&
      std::ranges::all_of(board.forcings, [&](const ForcingTotals& totals) {
        return std::ranges::all_of(totals.remarks, isNote) &&
               std::ranges::all_of(totals.columns, [](const auto& column) { return column.problem.empty(); });
      });
  return isCovered ? kDone : kFindings;
}

}  // namespace tervane
