// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <algorithm>
#include <span>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/command_line.h"
#include "cli/commands.h"
#include "platform/datafile_request.h"
#include "platform/datafile_writer.h"
#include "platform/files.h"
#include "platform/import_unit.h"
#include "platform/series_csv.h"

namespace tervane {

namespace {

/// Moves stamps from the begins of their intervals to the ends; the last interval is as long as the one before.
void MoveToEnds(std::vector<CYbDateTime>& stamps) {
  const CYbDateTimeSpan last = stamps.back() - stamps[stamps.size() - 2];
  stamps.erase(stamps.begin());
  stamps.push_back(stamps.back() + last);
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

}  // namespace tervane
