// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <bit>
#include <cmath>
#include <optional>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/offers.h"
#include "cli/parts/json.h"
#include "cli/parts/setup_file.h"
#include "cli/parts/text_table.h"
#include "data/datafile_request.h"
#include "platform/paths.h"
#include "platform/text.h"
#include "platform/units.h"
#include "results/statistics_report.h"
#include "results/storing.h"
#include "results/storing_cost.h"
#include "simspec/periods.h"

namespace tervane {

namespace {

// ---- The types that can be stored

struct ResultTypesOptions {
  std::string setup;
  bool all = false, json = false;
};

/// What is told of a type.
struct TypeLine {
  const ResultDataType& type;
  std::vector<RequirementMask> ways;
  std::optional<RequirementMask> by;   ///< The way in which the setup brings it in.
  std::vector<RequirementMask> lacks;  ///< What each way that comes nearest lacks.
  bool seriesOnly = false;

  std::string State() const {
    if (by) return type.isHidden ? "stored by engines" : seriesOnly ? "series" : "grids and series";
    return "missing";
  }
};

/// The features that no setup brings in by itself, and what does.
constexpr std::pair<RequirementMask, std::string_view> kFeaturesOfRuns[] = {
    {feature::kWaterQuality, "a water quality run lists its results itself"},
    {feature::kParticles, "a particle tracking run lists its results itself"},
    {feature::kKinetraSaturated, "process templates list their output themselves"},
    {feature::kKinetraUnsaturated, "process templates list their output themselves"},
    {feature::kKinetraOverland, "process templates list their output themselves"},
    {feature::kExchangeInWaterQuality, "exchanged with other models alone"},
};

std::string WhyNever(const TypeLine& line) {
  if (!line.type.isShown) return "exchanged with other models alone";
  if (line.ways.empty()) return "no setup brings it in";
  for (const auto& [bit, why] : kFeaturesOfRuns)
    if (std::ranges::all_of(line.ways, [bit = bit](RequirementMask way) { return way.Contains(bit); }))
      return std::string(why);
  return {};
}

std::string AlternativesText(const std::vector<RequirementMask>& masks) {
  std::string text;
  for (const RequirementMask mask : masks) {
    if (!text.empty()) text += " or ";
    text += mask.IsEmpty() ? "Always" : mask.Text();
  }
  return text;
}

std::vector<RequirementMask> WaysOf(const ResultDataType& type) {
  std::vector<RequirementMask> ways;
  for (const RequirementMask way : type.alternatives)
    if (!ResultDataType::IsUnused(way)) ways.push_back(way);
  return ways;
}

/// What the ways lack that lack least.
std::vector<RequirementMask> LeastLacks(const std::vector<RequirementMask>& ways, RequirementMask features) {
  std::vector<RequirementMask> lacks;
  for (const RequirementMask way : ways) {
    const RequirementMask lack = way.Without(features);
    const int count = std::popcount(lack.Bits());
    if (!lacks.empty() && count > std::popcount(lacks.front().Bits())) continue;
    if (!lacks.empty() && count < std::popcount(lacks.front().Bits())) lacks.clear();
    lacks.push_back(lack);
  }
  return lacks;
}

std::vector<TypeLine> LinesOf(const COutputGridSeriesListKvf* setup, bool all) {
  std::vector<TypeLine> lines;
  for (const ResultDataType& type : ResultCatalogue::Own().Types()) {
    TypeLine line{type, WaysOf(type), {}, {}};
    if (setup) {
      const RequirementMask onGrids = setup->BuildResultMask(false), inSeries = setup->BuildResultMask(true);
      const int place = type.AlternativeFor(inSeries);
      if (place >= 0 && type.isShown) line.by = type.alternatives[static_cast<std::size_t>(place)];
      line.seriesOnly = !type.ExistsFor(onGrids);
      if (!line.by) line.lacks = LeastLacks(line.ways, inSeries);
    }
    if (all || (type.IsOffered() && (!setup || line.by))) lines.push_back(std::move(line));
  }
  return lines;
}

std::string UnitName(const ResultDataType& type) {
  const Unit* unit = FindUnit(type.unit);
  return unit ? std::string(unit->abbreviation) : std::string();
}

std::string FileText(const ResultDataType& type) {
  const ResultFile* file = ResultCatalogue::Own().FileOf(type);
  return file ? std::string(file->suffix) : std::string();
}

std::string LackText(const TypeLine& line) {
  if (line.by) return {};
  const std::string never = WhyNever(line);
  return never.empty() ? AlternativesText(line.lacks) : never;
}

void WriteTypes(const std::vector<TypeLine>& lines, bool ofSetup, bool all, std::ostream& out) {
  TextRows rows{{"type", "name", "unit", "file"}};
  if (ofSetup) rows.front().insert(rows.front().end(), {"stored", "by"});
  if (!ofSetup) rows.front().emplace_back("needs");
  if (ofSetup && all) rows.front().emplace_back("lacks");
  for (const TypeLine& line : lines) {
    std::vector<std::string>& row = rows.emplace_back();
    row = {std::to_string(line.type.newDataType), std::string(line.type.name), UnitName(line.type),
           FileText(line.type)};
    if (!ofSetup) {
      row.push_back(AlternativesText(line.ways));
      continue;
    }
    row.push_back(line.State());
    row.push_back(line.by ? AlternativesText({*line.by}) : std::string());
    if (all) row.push_back(LackText(line));
  }
  WriteTextTable(std::move(rows), out);
}

std::string JsonMasks(const std::vector<RequirementMask>& masks) {
  std::vector<std::string> texts;
  for (const RequirementMask mask : masks) texts.push_back(JsonQuoted(mask.Text()));
  return JsonArray(texts);
}

std::string JsonOf(const TypeLine& line, bool ofSetup) {
  const ResultDataType& type = line.type;
  const ResultFile* file = ResultCatalogue::Own().FileOf(type);
  const std::string never = ofSetup && !line.by ? WhyNever(line) : std::string();
  return JsonObject({{"type", std::to_string(type.newDataType)},
                     {"name", JsonQuoted(type.name)},
                     {"quantity", std::to_string(type.quantity)},
                     {"unit", std::to_string(type.unit)},
                     {"isMean", JsonBool(type.valueType == ResultValueType::kMeanOfStep)},
                     {"gridKind", std::to_string(static_cast<int>(type.gridKind))},
                     {"file", file ? JsonQuoted(file->suffix) : ""},
                     {"isHidden", JsonBool(type.isHidden)},
                     {"isShown", JsonBool(type.isShown)},
                     {"isWaterQualityInput", JsonBool(type.isWaterQualityInput)},
                     {"isWaterBalance", JsonBool(type.isWaterBalance)},
                     {"needs", JsonMasks(line.ways)},
                     {"stored", ofSetup ? JsonQuoted(line.State()) : ""},
                     {"by", line.by ? JsonQuoted(line.by->Text()) : ""},
                     {"lacks", ofSetup && !line.by ? JsonMasks(line.lacks) : ""},
                     {"why", never.empty() ? "" : JsonQuoted(never)}});
}

int ResultTypesCommand(const ResultTypesOptions& options, Streams streams) {
  CFlowModelDoc document;
  const bool ofSetup = !options.setup.empty();
  if (ofSetup && !OpenSetup(document, options.setup, streams)) return kCouldNot;
  const COutputGridSeriesListKvf* setup = ofSetup ? document.Root().Important(kOutputGridSeries) : nullptr;
  const std::vector<TypeLine> lines = LinesOf(setup, options.all);
  if (options.json) {
    std::vector<std::string> types;
    for (const TypeLine& line : lines) types.push_back(JsonOf(line, ofSetup));
    fmt::print(streams.out, "{}\n",
               JsonObject({{"features", setup ? JsonQuoted(setup->BuildResultMask(true).Text()) : ""},
                           {"types", JsonArray(types)}}));
    return kDone;
  }
  if (setup) fmt::print(streams.out, "features: {}\n\n", setup->BuildResultMask(false).Text());
  WriteTypes(lines, ofSetup, options.all, streams.out);
  return kDone;
}

// ---- What they take on the disk

struct CostOptions {
  std::string file;
  bool json = false;
};

std::string BytesText(const std::optional<double>& bytes) { return bytes ? SizeInWords(*bytes) : "not known"; }
std::string WholeText(const std::optional<double>& number) { return number ? fmt::format("{:.0f}", *number) : "-"; }
std::string JsonWhole(const std::optional<double>& number) {
  return number ? fmt::format("{:.0f}", *number) : std::string();
}

void WriteCost(const StoringCost& cost, const std::optional<double>& free, std::ostream& out) {
  TextRows types{{"type", "name", "file", "values", "steps", "size", "remark"}};
  for (const TypeCost& type : cost.types)
    types.push_back({std::to_string(type.type->newDataType), std::string(type.type->name),
                     std::string(ResultCatalogue::Own().FileOf(*type.type)->suffix), WholeText(type.valuesOfStep),
                     WholeText(type.steps), BytesText(type.Bytes()), type.unknown});
  if (types.size() > 1) WriteTextTable(std::move(types), out);
  TextRows files{{"file", "types", "size"}};
  for (const FileCost& file : cost.files)
    files.push_back({std::string(file.file->suffix), std::to_string(file.types),
                     file.unknownTypes == file.types ? "not known" : SizeInWords(file.bytes)});
  fmt::print(out, "\n");
  if (files.size() > 1) WriteTextTable(std::move(files), out);
  fmt::print(out, "\nsum: {}\n", cost.Text());
  if (free) fmt::print(out, "free: {}\n", SizeInWords(*free));
}

void WriteCostJson(const StoringCost& cost, const std::optional<double>& free, std::ostream& out) {
  std::vector<std::string> types, files;
  for (const TypeCost& type : cost.types)
    types.push_back(JsonObject({{"type", std::to_string(type.type->newDataType)},
                                {"name", JsonQuoted(type.type->name)},
                                {"file", JsonQuoted(ResultCatalogue::Own().FileOf(*type.type)->suffix)},
                                {"valuesOfStep", JsonWhole(type.valuesOfStep)},
                                {"steps", JsonWhole(type.steps)},
                                {"bytes", JsonWhole(type.Bytes())},
                                {"unknown", type.unknown.empty() ? "" : JsonQuoted(type.unknown)}}));
  for (const FileCost& file : cost.files)
    files.push_back(JsonObject({{"file", JsonQuoted(file.file->suffix)},
                                {"types", std::to_string(file.types)},
                                {"unknownTypes", std::to_string(file.unknownTypes)},
                                {"bytes", JsonWhole(file.bytes)}}));
  fmt::print(out, "{}\n",
             JsonObject({{"types", JsonArray(types)},
                         {"files", JsonArray(files)},
                         {"bytes", JsonWhole(cost.bytes)},
                         {"unknownTypes", std::to_string(cost.unknownTypes)},
                         {"freeBytes", JsonWhole(free)}}));
}

int ResultsCostCommand(const CostOptions& options, Streams streams) {
  CFlowModelDoc document;
  if (!OpenSetup(document, options.file, streams)) return kCouldNot;
  const auto* storing = document.Root().Important(kStoringResults);
  if (!storing || !storing->TakesPartRule().Holds(*storing))
    return Refuse(streams, fmt::format("{}: the engine of this setup stores other results", options.file));
  const StoringCost cost = ForecastCost(*storing, storing->GridSeries().Rows());
  const std::optional<double> free = FreeBytesAt(ResolvedPath(document.getResultFolder(), {}));
  options.json ? WriteCostJson(cost, free, streams.out) : WriteCost(cost, free, streams.out);
  return free && cost.bytes > *free ? kFindings : kDone;
}

void OfferResultTypes(CommandOffers& offers, const Command& family) {
  auto options = std::make_shared<ResultTypesOptions>();
  Command types = offers.Offer(
      "types", "List what can be stored, and what brings it in",
      [offers, options] { return ResultTypesCommand(*options, offers.Output()); }, &family);
  types.Add("--setup", options->setup, "What this setup (.tvd) can store, and by what");
  types.AddFlag("--all", options->all,
                "Also what is missing, with what it lacks, and what engines store by themselves");
  types.AddFlag("--json", options->json, "As JSON");
}

void OfferResultsCost(CommandOffers& offers, const Command& family) {
  auto options = std::make_shared<CostOptions>();
  Command cost = offers.Offer(
      "cost", "Tell what the results of a simulation will take on the disk",
      [offers, options] { return ResultsCostCommand(*options, offers.Output()); }, &family);
  AddSetup(cost, options->file);
  cost.AddFlag("--json", options->json, "As JSON");
  cost.Footer("Exit status 1 where the disk has less room than that.");
}

// ---- How well series agree with what was observed

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
  OfferResultTypes(offers, family);
  OfferResultsCost(offers, family);
  OfferResultStatistics(offers, family);
}

}  // namespace tervane
