// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <cmath>
#include <optional>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/json.h"
#include "cli/offers.h"
#include "cli/setup_file.h"
#include "cli/text_table.h"
#include "data/datafile_request.h"
#include "platform/paths.h"
#include "platform/text.h"
#include "results/statistics_report.h"
#include "simspec/periods.h"

namespace tervane {

namespace {

struct StatisticsOrder {
  std::string setup;
  std::string from, to;
  bool json = false;
  bool write = false;
};

/// A figure with its name, for tables and for JSON.
struct NamedFigure {
  const char* head;
  const char* member;
  std::optional<double> RunStatistics::*figure;
};
constexpr NamedFigure kNamedFigures[] = {
    {"ME", "meanError", &RunStatistics::meanError},
    {"MAE", "meanAbsoluteError", &RunStatistics::meanAbsoluteError},
    {"RMSE", "rootMeanSquareError", &RunStatistics::rootMeanSquareError},
    {"STDres", "residualDeviation", &RunStatistics::residualDeviation},
    {"R", "correlation", &RunStatistics::correlation},
    {"R2", "nashSutcliffe", &RunStatistics::nashSutcliffe},
    {"KGE", "klingGupta", &RunStatistics::klingGupta},
    {"PBIAS", "percentBias", &RunStatistics::percentBias},
};

/// Takes a typed date; "" or what was expected.
std::string TakeDate(const char* option, const std::string& typed, CYbDateTime& date) {
  if (typed.empty()) return {};
  for (const char* format : {"%Y-%m-%d %H:%M:%S", "%Y-%m-%d %H:%M", "%Y-%m-%d"})
    if (const CYbDateTime read = CYbDateTime::Parse(typed, format); read.IsValid()) {
      date = read;
      return {};
    }
  return fmt::format("{} {}: a date was expected, such as 2019-10-01", option, typed);
}

void WriteText(const StatisticsTable& table, std::ostream& out) {
  fmt::print(out, "{} to {}\n", DateInWords(table.period.start), DateInWords(table.period.end));
  TextRows rows{{"point", "data type", "unit", "layer", "pairs"}};
  for (const NamedFigure& named : kNamedFigures) rows.front().emplace_back(named.head);
  for (const PointStatistics& row : table.rows) {
    auto& cells = rows.emplace_back();
    cells = {row.point.name, row.point.dataType, row.unit,
             row.point.layer >= 1 ? std::to_string(row.point.layer) : std::string(), std::to_string(row.figures.pairs)};
    for (const NamedFigure& named : kNamedFigures) {
      const auto& figure = row.figures.*named.figure;
      cells.push_back(figure ? FormatNumber(*figure, "%.4g") : "-");
    }
  }
  WriteTextTable(std::move(rows), out);
}

std::string JsonOf(const PointStatistics& row) {
  std::vector<std::pair<std::string_view, std::string>> members = {
      {"name", JsonQuoted(row.point.name)},
      {"dataType", JsonQuoted(row.point.dataType)},
      {"x", ShortestNumber(row.point.x)},
      {"y", ShortestNumber(row.point.y)},
      {"layer", row.point.layer >= 1 ? std::to_string(row.point.layer) : std::string()},
      {"unit", JsonQuoted(row.unit)},
      {"pairs", std::to_string(row.figures.pairs)}};
  for (const NamedFigure& named : kNamedFigures) {
    const auto& figure = row.figures.*named.figure;
    members.emplace_back(named.member, figure && std::isfinite(*figure) ? ShortestNumber(*figure) : std::string());
  }
  members.emplace_back("problem", row.problem.empty() ? std::string() : JsonQuoted(row.problem));
  return JsonObject(members);
}

void WriteJson(const StatisticsTable& table, std::ostream& out) {
  std::vector<std::string> points;
  for (const PointStatistics& row : table.rows) points.push_back(JsonOf(row));
  const auto date = [](const CYbDateTime& time) { return JsonQuoted(time.Format("%Y-%m-%d %H:%M:%S")); };
  fmt::print(out, "{}\n",
             JsonObject({{"start", date(table.period.start)},
                         {"end", date(table.period.end)},
                         {"points", JsonArray(points)},
                         {"stopped", table.stopped.empty() ? std::string() : JsonQuoted(table.stopped)}}));
}

int StatisticsCommand(const StatisticsOrder& order, Streams streams) {
  CFlowModelDoc document;
  if (!OpenSetup(document, order.setup, streams)) return kCouldNot;
  ComparedPeriod period;
  if (const auto* simulation = document.Root().Important(kSimulationPeriod))
    period = {simulation->GetSimStartDate(), simulation->SIMEND};
  for (const std::string& problem :
       {TakeDate("--from", order.from, period.start), TakeDate("--to", order.to, period.end)})
    if (!problem.empty()) return Refuse(streams, problem);

  const std::string report = ResolvedPath(document.PreprocessorReport(), {});
  std::vector<DetailedPoint> points;
  if (const FileResult read = ReadDetailedPoints(report, points); !read.Ok()) return Refuse(streams, read.error);
  StatisticsTable table;
  const DisplayUnits units;
  ComputeStatistics(points, period, units, table);
  order.json ? WriteJson(table, streams.out) : WriteText(table, streams.out);
  for (const PointStatistics& row : table.rows)
    if (!row.problem.empty()) fmt::print(streams.err, "{}: {}\n", OneLine(row.point.name), OneLine(row.problem));
  if (order.write) {
    const StatisticsFiles files = StatisticsFilesBeside(report);
    const FileResult written = WriteStatistics(table, units, files);
    if (!written.Ok()) return Refuse(streams, written.error);
    if (!written.note.empty()) fmt::print(streams.err, "{}\n", written.note);
    fmt::print(streams.err, "wrote {} and {}\n", files.html, files.shape);
  }
  if (!table.stopped.empty()) return Refuse(streams, table.stopped + "; the points behind it are left out");
  return kDone;
}

void OfferResultStatistics(CommandOffers& offers, const Command& family) {
  auto order = std::make_shared<StatisticsOrder>();
  Command statistics = offers.Offer(
      "stats", "How well simulated series agree with observed ones, point by point",
      [offers, order] { return StatisticsCommand(*order, offers.Output()); }, &family);
  AddSetup(statistics, order->setup);
  statistics.Add("--from", order->from, "The first date that is compared; the start of the simulation without it");
  statistics.Add("--to", order->to, "The last one; the end of the simulation without it");
  statistics.AddFlag("--json", order->json, "As JSON");
  statistics.AddFlag("--write", order->write, "Write the table in HTML and the point shape file, too");
}

}  // namespace

void OfferResultsCommands(CommandOffers& offers) {
  const Command family = offers.Family("results", "What a run stores, and what came of it");
  OfferResultStatistics(offers, family);
}

}  // namespace tervane
