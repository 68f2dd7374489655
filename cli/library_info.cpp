// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "cli/library_info.h"

#include <algorithm>
#include <vector>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/json.h"
#include "libraries/library.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// How far the rows reach.
double LastOf(const LibraryEntry& entry) {
  return std::ranges::max_element(entry.rows, {}, [](const LibraryRow& row) { return row.values[0]; })->values[0];
}

std::string Plural(std::size_t count, std::string_view one, std::string_view many) {
  return fmt::format("{} {}", count, count == 1 ? one : many);
}

std::string LengthText(const LibraryColumn& column, const LibraryEntry& entry) {
  const double last = LastOf(entry);
  // Days say their own unit.
  if (column.unit.empty())
    return fmt::format("{} {}", ShortestNumber(last), LowerCase(column.head) + (last == 1 ? "" : "s"));
  return fmt::format("{} {}", ShortestNumber(last), column.unit);
}

}  // namespace

int PrintLibrary(const LibraryKind& kind, const std::string& path, bool json, Streams streams) {
  Library library(kind);
  if (const std::string problem = ReadLibrary(path, library); !problem.empty()) {
    fmt::print(streams.err, "{}\n", problem);
    return kCouldNot;
  }
  for (const LibraryFinding& finding : FindingsOf(library))
    fmt::print(streams.err, "{}\n", FindingText(path, library, finding));
  std::vector<std::string> entries;
  if (!json) fmt::print(streams.out, "{}: {}\n", path, Plural(library.entries.size(), kind.entryName, kind.entryNames));
  for (const LibraryEntry& entry : library.entries) {
    if (json) {
      entries.push_back(JsonObject({{"name", JsonQuoted(entry.Name())},
                                    {"rows", std::to_string(entry.rows.size())},
                                    {"length", entry.rows.empty() ? "" : ShortestNumber(LastOf(entry))}}));
      continue;
    }
    fmt::print(streams.out, "{}: {}{}\n", entry.Name(), Plural(entry.rows.size(), kind.rowName, kind.rowNames),
               entry.rows.empty() ? "" : ", " + LengthText(kind.columns[0], entry));
  }
  if (json) fmt::print(streams.out, "{}\n", JsonObject({{kind.entryNames, JsonArray(entries)}}));
  return kDone;
}

}  // namespace tervane
