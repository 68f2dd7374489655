// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <algorithm>
#include <span>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/offers.h"
#include "data/datafile_request.h"
#include "data/datafile_writer.h"
#include "data/import_unit.h"
#include "data/series_csv.h"
#include "platform/files.h"

namespace tervane {

namespace {

/// What makes a data file of columns of a table.
struct SeriesImport {
  std::string in, out;
  int itemType = 0;
  std::vector<std::string> columns;  ///< None: the only one.
  bool isEveryColumn = false;
  std::string unit;
  int valueType = 0;
  bool stampsAreBegins = false;
  bool force = false;
};

/// Moves stamps from the begins of their intervals to the ends; the last interval is as long as the one before.
void MoveToEnds(std::vector<CYbDateTime>& stamps) {
  const CYbDateTimeSpan last = stamps.back() - stamps[stamps.size() - 2];
  stamps.erase(stamps.begin());
  stamps.push_back(stamps.back() + last);
}

/// The series of an import, which all have the dates of the first.
struct Columns {
  std::vector<CsvSeries> series;
  std::vector<NewItem> items;
};

/// Reads the wanted columns in the unit of their item. "" or why not.
std::string ReadColumns(const SeriesImport& import, const ItemType& type, Columns& columns, Streams streams) {
  FileContent text;
  if (FileResult read = ReadWholeFile(import.in, text); !read.Ok()) return read.error;
  std::vector<std::string> names = import.isEveryColumn ? CsvColumns(text.Text()) : import.columns;
  if (names.empty()) names.emplace_back();
  for (const std::string& name : names) {
    CsvSeries& series = columns.series.emplace_back(ReadCsvSeries(text.Text(), name));
    if (!series.error.empty()) return fmt::format("{}: {}", import.in, series.error);
    const std::string column = names.size() > 1 ? fmt::format("column {}: ", series.column) : std::string();
    for (const std::string& note : series.notes) fmt::print(streams.err, "{}: note: {}{}\n", import.in, column, note);
    NewItem& item = columns.items.emplace_back();
    item = {series.column, type.code, 0, static_cast<ValueType>(import.valueType)};
    if (std::string error = TakeUnit(import.unit, type, item, series.values); !error.empty()) return error;
  }
  return {};
}

std::string Write(const std::string& path, const NewDataFile& content, const Columns& columns, FileResult& result) {
  DataFileWriter writer;
  if (std::string error = writer.Create(path, content); !error.empty()) return error;
  const std::vector<CYbDateTime>& stamps = columns.series.front().stamps;
  for (std::size_t i = 0; i < stamps.size(); ++i) {
    if (std::string error = writer.AddStep(stamps[i]); !error.empty()) return error;
    int item = 0;
    for (const CsvSeries& series : columns.series)
      if (std::string error = writer.Put(++item, std::span(series.values).subspan(i, 1)); !error.empty()) return error;
  }
  result = writer.Finish();
  return result.error;
}

int ImportSeriesCommand(const SeriesImport& import, Streams streams) {
  const ItemType* type = FindItemType(import.itemType);
  if (type == nullptr) return Refuse(streams, fmt::format("there is no item type {}", import.itemType));
  if (RefuseToReplace(import.out, import.force, streams)) return kCouldNot;
  Columns columns;
  if (const std::string error = ReadColumns(import, *type, columns, streams); !error.empty()) {
    return Refuse(streams, error);
  }

  NewDataFile content;
  content.dimensions = 0;
  content.items = columns.items;
  std::vector<CYbDateTime>& stamps = columns.series.front().stamps;
  if (import.stampsAreBegins) {
    if (stamps.size() < 2) {
      return Refuse(streams,
                    fmt::format("{}: one line does not tell how long its interval is; give --stamps end", import.in));
    }
    content.begin = stamps.front();
    MoveToEnds(stamps);
  }
  FileResult result;
  if (const std::string error = Write(import.out, content, columns, result); !error.empty()) {
    return Refuse(streams, error);
  }
  if (!result.note.empty()) fmt::print(streams.err, "{}: {}\n", import.out, result.note);
  fmt::print(streams.out, "{}: {}{} steps of {} from {} to {}\n", import.out,
             columns.items.size() > 1 ? fmt::format("{} items, ", columns.items.size()) : std::string(), stamps.size(),
             type->name, DateInWords(stamps.front()), DateInWords(stamps.back()));
  return kDone;
}

}  // namespace

void OfferSeriesImport(CommandOffers& offers, const Command& family) {
  auto options = std::make_shared<SeriesImport>();
  Command series = offers.Offer(
      "series", "Make time series (.nds0) of columns of a table (CSV)",
      [offers, options] { return ImportSeriesCommand(*options, offers.Output()); }, &family);
  series.Add("CSV", options->in, "The table: names in its first line, ISO dates in its first column").Required();
  series.Add("OUT", options->out, "The data file to write").Required();
  AddQuantity(series, options->itemType).Required();
  CommandOption column = series.Add("--column", options->columns,
                                    "The name of the column; not needed where there is only one. Given several "
                                    "times, each makes an item");
  column.OneAtATime();
  series.AddFlag("--all-columns", options->isEveryColumn, "An item of each column").Excludes(column);
  series.Add("--unit", options->unit, "The unit of the values; the item type's base unit without it");
  series.AddChoice<int>("--value-type", options->valueType,
                        {{"instantaneous", 0}, {"accumulated", 1}, {"step-accumulated", 2}, {"mean-step", 3}},
                        "How a value belongs to its stamp");
  series.AddChoice<bool>("--stamps", options->stampsAreBegins, {{"begin", true}, {"end", false}},
                         "Which end of its interval a stamp is; end without it");
  series.AddFlag("--force", options->force, "Replace a file that exists");
}

}  // namespace tervane
