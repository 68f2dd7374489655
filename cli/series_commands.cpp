// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>
#include <span>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/command_line.h"
#include "cli/commands.h"
#include "platform/datafile_request.h"
#include "platform/datafile_writer.h"
#include "platform/files.h"
#include "platform/series_csv.h"

namespace tervane {

namespace {

int Refuse(Streams streams, const std::string& reason) {
  fmt::print(streams.err, "{}\n", reason);
  return kCouldNot;
}

/// Moves stamps from the begins of their intervals to the ends; the last interval is as long as the one before.
void MoveToEnds(std::vector<CYbDateTime>& stamps) {
  const CYbDateTimeSpan last = stamps.back() - stamps[stamps.size() - 2];
  stamps.erase(stamps.begin());
  stamps.push_back(stamps.back() + last);
}

/// Sets the unit of the item and brings the values to it. "" or why the unit does not fit.
std::string TakeUnit(const std::string& typed, const ItemType& type, NewItem& item, std::vector<float>& values) {
  item.unitKey = BaseUnit(type).key;
  if (typed.empty()) return {};
  const std::optional<ParsedUnit> unit = ParseUnit(typed);
  if (!unit) return fmt::format("\"{}\" is no known unit", typed);
  if (unit->unit != nullptr && (AllowsUnit(type, unit->unit->key) || type.code == kUndefinedItemType)) {
    item.unitKey = unit->unit->key;
    return {};
  }
  const Unit& base = BaseUnit(type);
  const std::optional<UnitConversion> conversion = ConversionBetween(unit->scale, base.scale);
  if (!conversion) return fmt::format("\"{}\" is no unit of {}, which is stored in {}", typed, type.name, base.text);
  for (float& value : values) {
    if (value == kDeleteValue) continue;
    value = static_cast<float>((*conversion)(static_cast<double>(value)));
    if (!std::isfinite(value)) return fmt::format("a value is too large in {}", base.text);
  }
  return {};
}

std::string Write(const std::string& path, const NewDataFile& content, const CsvSeries& series, FileResult& result) {
  DataFileWriter writer;
  if (std::string error = writer.Create(path, content); !error.empty()) return error;
  for (std::size_t i = 0; i < series.stamps.size(); ++i) {
    if (std::string error = writer.AddStep(series.stamps[i]); !error.empty()) return error;
    if (std::string error = writer.Put(1, std::span(series.values).subspan(i, 1)); !error.empty()) return error;
  }
  result = writer.Finish();
  return result.error;
}

}  // namespace

int ImportSeriesCommand(const SeriesImport& import, Streams streams) {
  const ItemType* type = FindItemType(import.itemType);
  if (type == nullptr) return Refuse(streams, fmt::format("there is no item type {}", import.itemType));
  if (RefuseToReplace(import.out, import.force, streams)) return kCouldNot;
  FileContent text;
  if (const FileResult read = ReadWholeFile(import.in, text); !read.Ok()) return Refuse(streams, read.error);
  CsvSeries series = ReadCsvSeries(text.Text(), import.column);
  if (!series.error.empty()) return Refuse(streams, fmt::format("{}: {}", import.in, series.error));
  for (const std::string& note : series.notes) fmt::print(streams.err, "{}: note: {}\n", import.in, note);

  NewDataFile content;
  content.dimensions = 0;
  NewItem item{series.column, type->code, 0, static_cast<ValueType>(import.valueType)};
  if (const std::string error = TakeUnit(import.unit, *type, item, series.values); !error.empty()) {
    return Refuse(streams, error);
  }
  if (import.stampsAreBegins) {
    if (series.stamps.size() < 2) {
      return Refuse(streams,
                    fmt::format("{}: one line does not tell how long its interval is; give --stamps end", import.in));
    }
    content.begin = series.stamps.front();
    MoveToEnds(series.stamps);
  }
  content.items = {item};
  FileResult result;
  if (const std::string error = Write(import.out, content, series, result); !error.empty()) {
    return Refuse(streams, error);
  }
  if (!result.note.empty()) fmt::print(streams.err, "{}: {}\n", import.out, result.note);
  fmt::print(streams.out, "{}: {} steps of {} from {} to {}\n", import.out, series.stamps.size(), type->name,
             DateInWords(series.stamps.front()), DateInWords(series.stamps.back()));
  return kDone;
}

int ExportCommand(const std::string& in, const std::string& out, bool force, Streams streams) {
  DataFile file;
  if (const std::string error = file.Open(in); !error.empty()) return Refuse(streams, error);
  if (RefuseToReplace(out, force, streams)) return kCouldNot;
  std::string text;
  if (const std::string error = WriteCsvSeries(file, text); !error.empty()) return Refuse(streams, error);
  const FileResult written = WriteFileAtomically(out, text);
  if (!written.Ok()) return Refuse(streams, written.error);
  if (!written.note.empty()) fmt::print(streams.err, "{}: {}\n", out, written.note);
  return kDone;
}

}  // namespace tervane
