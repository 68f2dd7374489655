// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <algorithm>
#include <new>
#include <vector>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/library_info.h"
#include "cli/offers.h"
#include "cli/parts/json.h"
#include "cli/river_commands.h"
#include "cli/template_info.h"
#include "data/datafile.h"
#include "data/datafile_request.h"
#include "geometry/shapes.h"
#include "geometry/xyz_text.h"
#include "libraries/library_kinds.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// Opens a data file; its notes, or why it cannot be read, go to the error stream.
bool OpenDataFile(DataFile& file, const std::string& path, Streams streams) {
  if (const std::string error = file.Open(path); !error.empty()) {
    fmt::print(streams.err, "{}\n", error);
    return false;
  }
  for (const std::string& note : file.Notes()) fmt::print(streams.err, "{}: note: {}\n", path, note);
  return true;
}

std::string SizeText(const DataItem& item) {
  const FileGeometry& geometry = item.geometry;
  switch (item.dimensions) {
    case 0:
      return "time series";
    case 1:
      return fmt::format("line of {}", geometry.nx);
    case 2:
      return fmt::format("grid {} x {}", geometry.nx, geometry.ny);
    default:
      return fmt::format("grid {} x {} in {} layers", geometry.nx, geometry.ny, geometry.nz);
  }
}

std::string PlaceText(const FileGeometry& geometry) {
  if (!geometry.IsPlaced()) return "place unknown";
  const std::string_view unit = geometry.isGeographical ? "degrees" : "m";
  std::string text = fmt::format("cells of {}", ShortestNumber(geometry.cellSize));
  if (geometry.cellHeight != geometry.cellSize) text += fmt::format(" x {}", ShortestNumber(geometry.cellHeight));
  text += fmt::format(" {} from {}, {}", unit, ShortestNumber(geometry.x0), ShortestNumber(geometry.y0));
  if (geometry.rotation != 0) text += fmt::format(", turned by {} degrees", ShortestNumber(geometry.rotation));
  return text + (geometry.projection.empty() ? ", no projection" : ", projection " + geometry.projection);
}

std::string TimeText(const TimeAxis& time) {
  std::string text = fmt::format("{} step{}", time.steps, time.steps == 1 ? "" : "s");
  if (time.stamps.empty()) return text + (time.hasDates ? "" : " without dates");
  text += fmt::format(" from {} to {}", DateInWords(time.Start()), DateInWords(time.End()));
  if (time.stepSeconds > 0) text += fmt::format(" every {} s", time.stepSeconds);
  if (time.begin && *time.begin < time.Start()) {
    text += fmt::format(", the first begins at {}", DateInWords(*time.begin));
  }
  return text;
}

std::string_view ItemTypeName(const DataItem& item) { return FindItemType(item.itemType)->name; }

void WriteInfoAsText(const DataFile& file, std::ostream& out) {
  fmt::print(out, "{}: {} item{}\ntime: {}\n", file.Path(), file.Items().size(), file.Items().size() == 1 ? "" : "s",
             TimeText(file.Time()));
  int number = 0;
  for (const DataItem& item : file.Items()) {
    fmt::print(out, "item {}: {} [{}], {} ({}), {}, {}\n", ++number, item.name, item.unitText, ItemTypeName(item),
               item.itemType, item.hasTime ? ValueTypeText(item.valueType) : "at all times", SizeText(item));
    const bool isSame = number > 1 && item.geometry == file.Items()[static_cast<std::size_t>(number - 2)].geometry;
    if (item.dimensions > 0 && !isSame) fmt::print(out, "  {}\n", PlaceText(item.geometry));
  }
}

std::string JsonDate(const CYbDateTime& date) { return JsonQuoted(date.Format("%Y-%m-%d %H:%M:%S")); }

void WriteInfoAsJson(const DataFile& file, std::ostream& out) {
  std::vector<std::string> items, notes;
  for (const DataItem& item : file.Items()) {
    const FileGeometry& geometry = item.geometry;
    const auto whenPlaced = [&](double number) { return geometry.IsPlaced() ? ShortestNumber(number) : std::string(); };
    const auto when = [](bool is, int number) { return is ? std::to_string(number) : std::string(); };
    items.push_back(JsonObject({{"name", JsonQuoted(item.name)},
                                {"itemType", std::to_string(item.itemType)},
                                {"itemTypeName", JsonQuoted(ItemTypeName(item))},
                                {"unitKey", when(item.unitKey != 0, item.unitKey)},
                                {"unit", JsonQuoted(item.unitText)},
                                {"valueType", std::to_string(static_cast<int>(item.valueType))},
                                {"hasTime", JsonBool(item.hasTime)},
                                {"dimensions", std::to_string(item.dimensions)},
                                {"nx", when(item.dimensions > 0, geometry.nx)},
                                {"ny", when(item.dimensions > 1, geometry.ny)},
                                {"nz", when(item.dimensions > 2, geometry.nz)},
                                {"cellSize", whenPlaced(geometry.cellSize)},
                                {"cellHeight", whenPlaced(geometry.cellHeight)},
                                {"x0", whenPlaced(geometry.x0)},
                                {"y0", whenPlaced(geometry.y0)},
                                {"rotation", whenPlaced(geometry.rotation)},
                                {"geographical", geometry.IsPlaced() ? JsonBool(geometry.isGeographical) : ""},
                                {"projection", geometry.projection.empty() ? "" : JsonQuoted(geometry.projection)}}));
  }
  for (const std::string& note : file.Notes()) notes.push_back(JsonQuoted(note));
  const TimeAxis& time = file.Time();
  const bool hasStamps = !time.stamps.empty();
  fmt::print(out, "{}\n",
             JsonObject({{"steps", std::to_string(time.steps)},
                         {"start", hasStamps ? JsonDate(time.Start()) : ""},
                         {"end", hasStamps ? JsonDate(time.End()) : ""},
                         {"begin", time.begin ? JsonDate(*time.begin) : ""},
                         {"stepSeconds", time.stepSeconds > 0 ? std::to_string(time.stepSeconds) : ""},
                         {"items", JsonArray(items)},
                         {"notes", JsonArray(notes)}}));
}

void WriteSummary(std::string_view place, const ValueSummary& summary, std::ostream& out) {
  if (summary.count == 0) {
    fmt::print(out, "{}: no values, {} missing\n", place, summary.missing);
    return;
  }
  fmt::print(out, "{}: smallest {}, largest {}, mean {:.6g}, {} values, {} missing\n", place,
             ShortestNumber(summary.smallest), ShortestNumber(summary.largest), summary.Mean(), summary.count,
             summary.missing);
}

/// Reads all values of an item once.
std::string Summarize(const DataFile& file, int number, std::vector<ValueSummary>& steps) {
  const DataItem& item = file.Items()[static_cast<std::size_t>(number - 1)];
  const std::size_t count = item.hasTime ? file.Time().steps : 1;
  // A series is one call, and its steps are single values.
  const bool isSeries = item.dimensions == 0;
  std::vector<float> values;
  ValueSelection selection;
  selection.item = number;
  if (isSeries) selection.steps = count;
  values.resize(file.SizeOf(selection));
  for (; selection.step < count; selection.step += selection.steps) {
    if (std::string error = file.Read(selection, values); !error.empty()) return error;
    steps.emplace_back().Add(values);
  }
  return {};
}

std::string BoxText(const Envelope& box) {
  return fmt::format("x {} to {}, y {} to {}", ShortestNumber(box.xMin), ShortestNumber(box.xMax),
                     ShortestNumber(box.yMin), ShortestNumber(box.yMax));
}

std::string JsonBox(const Envelope& box) {
  return JsonArray(
      {ShortestNumber(box.xMin), ShortestNumber(box.yMin), ShortestNumber(box.xMax), ShortestNumber(box.yMax)});
}

int PrintPoints(const std::string& path, bool json, Streams streams) {
  const auto facts = XyzFactsOf(path);
  if (!facts->error.empty()) {
    fmt::print(streams.err, "{}\n", facts->error);
    return kCouldNot;
  }
  if (json)
    fmt::print(streams.out, "{}\n",
               JsonObject({{"points", std::to_string(facts->points)},
                           {"extent", JsonBox(facts->extent)},
                           {"smallest", ShortestNumber(facts->smallest)},
                           {"largest", ShortestNumber(facts->largest)}}));
  else
    fmt::print(streams.out, "{}: {} point{}, {}\nvalues: smallest {}, largest {}\n", path, facts->points,
               facts->points == 1 ? "" : "s", BoxText(facts->extent), ShortestNumber(facts->smallest),
               ShortestNumber(facts->largest));
  return kDone;
}

int PrintShapes(const std::string& path, bool json, Streams streams) {
  const auto facts = ShapeFactsOf(path);
  if (!facts->error.empty()) {
    fmt::print(streams.err, "{}\n", facts->error);
    return kCouldNot;
  }
  // The files beside it stand in the same folder, which is told once.
  const auto note = [&](const std::string& text) {
    const std::string folder(FolderOf(path));
    fmt::print(streams.err, "{}: note: {}\n", path, folder.empty() ? text : Replaced(text, folder + "/", ""));
  };
  if (!facts->note.empty()) note(facts->note);
  // A damaged table is told by the note already.
  if (facts->note.find(facts->tableProblem) == std::string::npos) note(facts->tableProblem);
  constexpr std::string_view kKinds[] = {"points", "lines", "polygons", "points"};
  constexpr std::string_view kFields[] = {"text", "whole number", "real number"};
  const std::string_view kind = kKinds[static_cast<std::size_t>(facts->kind)];
  const auto kindOf = [&](const ShapeField& field) { return kFields[static_cast<std::size_t>(field.kind)]; };
  if (json) {
    std::vector<std::string> fields;
    for (const ShapeField& field : facts->fields)
      fields.push_back(JsonObject({{"name", JsonQuoted(field.name)}, {"kind", JsonQuoted(kindOf(field))}}));
    fmt::print(streams.out, "{}\n",
               JsonObject({{"shapes", std::to_string(facts->shapes)},
                           {"kind", JsonQuoted(kind)},
                           {"withoutPoints", std::to_string(facts->withoutPoints)},
                           {"points", std::to_string(facts->points)},
                           {"extent", facts->extent ? JsonBox(*facts->extent) : ""},
                           {"projection", facts->projection.empty() ? "" : JsonQuoted(facts->projection)},
                           {"attributes", JsonArray(fields)}}));
    return kDone;
  }
  fmt::print(streams.out, "{}: {} {}{}, {}\n", path, facts->shapes, kind,
             facts->withoutPoints > 0 ? fmt::format(" ({} of them without points)", facts->withoutPoints) : "",
             facts->extent ? BoxText(*facts->extent) : "no points");
  fmt::print(streams.out, "{}\n",
             facts->projection.empty() ? "no projection" : fmt::format("projection {}", facts->projection));
  for (const ShapeField& field : facts->fields)
    fmt::print(streams.out, "attribute {}: {}\n", field.name, kindOf(field));
  return kDone;
}

bool HasExtension(const std::string& path, std::initializer_list<std::string_view> extensions) {
  return std::ranges::find(extensions, LowerCase(ExtensionOf(path))) != extensions.end();
}

int DataInfoCommand(const std::string& path, bool json, Streams streams) {
  if (const LibraryKind* kind = LibraryKindOf(path)) return PrintLibrary(*kind, path, json, streams);
  if (HasExtension(path, {".kinetra"})) return PrintTemplate(path, json, streams);
  if (LeadsToRiver(path)) return PrintRiver(path, json, streams);
  if (HasExtension(path, {".shp"})) return PrintShapes(path, json, streams);
  if (HasExtension(path, {".txt", ".xyz"})) return PrintPoints(path, json, streams);
  DataFile file;
  if (!OpenDataFile(file, path, streams)) return kCouldNot;
  json ? WriteInfoAsJson(file, streams.out) : WriteInfoAsText(file, streams.out);
  return kDone;
}

std::string JsonSummary(const ValueSummary& summary) {
  const bool hasValues = summary.count > 0;
  return JsonObject({{"smallest", hasValues ? ShortestNumber(summary.smallest) : ""},
                     {"largest", hasValues ? ShortestNumber(summary.largest) : ""},
                     {"mean", hasValues ? ShortestNumber(summary.Mean()) : ""},
                     {"values", std::to_string(summary.count)},
                     {"missing", std::to_string(summary.missing)}});
}

std::string JsonStats(const DataItem& item, const ValueSummary& all, const std::vector<ValueSummary>& steps) {
  std::vector<std::string> each;
  for (const ValueSummary& step : steps) each.push_back(JsonSummary(step));
  return JsonObject({{"name", JsonQuoted(item.name)},
                     {"unit", JsonQuoted(item.unitText)},
                     {"all", JsonSummary(all)},
                     {"steps", item.hasTime && item.dimensions > 0 ? JsonArray(each) : ""}});
}

int DataStatsCommand(const std::string& path, bool json, Streams streams) {
  /// Of a file with more steps, only the whole is told.
  constexpr std::size_t kMostStepsTold = 24;
  if (HasExtension(path, {".txt", ".xyz"})) return PrintPoints(path, json, streams);
  if (HasExtension(path, {".shp"})) return PrintShapes(path, json, streams);
  DataFile file;
  if (!OpenDataFile(file, path, streams)) return kCouldNot;
  std::vector<std::string> items;
  for (std::size_t i = 0; i < file.Items().size(); ++i) {
    const DataItem& item = file.Items()[i];
    std::vector<ValueSummary> steps;
    std::string error;
    try {
      error = Summarize(file, static_cast<int>(i + 1), steps);
    } catch (const std::bad_alloc&) {
      error = fmt::format("cannot read {}: the item {} needs more than the free memory", path, item.name);
    }
    if (!error.empty()) {
      fmt::print(streams.err, "{}\n", error);
      return kCouldNot;
    }
    ValueSummary all;
    for (const ValueSummary& step : steps) all.Add(step);
    if (json) {
      items.push_back(JsonStats(item, all, steps));
      continue;
    }
    WriteSummary(fmt::format("item {}: {} [{}]", i + 1, item.name, item.unitText), all, streams.out);
    if (steps.size() < 2 || steps.size() > kMostStepsTold) continue;
    for (std::size_t step = 0; step < steps.size(); ++step) {
      const std::string date = file.Time().stamps.empty() ? "" : ", " + DateInWords(file.Time().Stamp(step));
      WriteSummary(fmt::format("  step {}{}", step + 1, date), steps[step], streams.out);
    }
  }
  if (json) fmt::print(streams.out, "{}\n", JsonObject({{"items", JsonArray(items)}}));
  return kDone;
}

}  // namespace

void OfferDataCommands(CommandOffers& offers) {
  struct Options {
    std::string file;
    bool json = false;
  };
  auto options = std::make_shared<Options>();
  const Command data = offers.Family("data",
                                     "Look into data files (.nds0 to .nds3, netCDF), rasters (GeoTIFF, ...), libraries "
                                     "(.etv), process templates and river "
                                     "networks");
  Command info = offers.Offer(
      "info", "Tell items, times and place",
      [offers, options] { return DataInfoCommand(options->file, options->json, offers.Output()); }, &data);
  Command stats = offers.Offer(
      "stats", "Tell range, mean and missing values of each item",
      [offers, options] { return DataStatsCommand(options->file, options->json, offers.Output()); }, &data);
  for (Command* command : {&info, &stats}) {
    command->Add("FILE", options->file, "The data file").Required();
    command->AddFlag("--json", options->json, "As JSON");
  }
}

}  // namespace tervane
