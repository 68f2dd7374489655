// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "cli/library_info.h"

#include <algorithm>
#include <cmath>
#include <vector>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/parts/json.h"
#include "libraries/library.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// How far the rows reach.
double LastOf(const LibraryEntry& entry) {
  return std::ranges::max_element(entry.rows, {}, [](const LibraryRow& row) { return row.values[0]; })->values[0];
}

/// What an entry without rows is: "van Genuchten, Mualem".
std::string ModelsText(const LibraryKind& kind, const LibraryEntry& entry) {
  std::string text;
  for (std::size_t i = 0; i < kind.fields.size(); ++i)
    if (const LibraryModel* model = ModelOf(kind.fields[i], entry.fields[i].text); model && !model->name.empty())
      text += (text.empty() ? "" : ", ") + entry.fields[i].text;
  return text;
}

std::string EntryJson(const LibraryKind& kind, const LibraryEntry& entry) {
  std::vector<std::pair<std::string_view, std::string>> members = {{"name", JsonQuoted(entry.Name())}};
  for (std::size_t i = 0; i < kind.fields.size(); ++i) {
    const LibraryModel* model = ModelOf(kind.fields[i], entry.fields[i].text);
    if (!model) continue;
    if (!model->name.empty()) members.emplace_back(kind.fields[i].key, JsonQuoted(entry.fields[i].text));
    for (std::size_t k = 0; k < entry.fields[i].numbers.size(); ++k)
      if (const double value = entry.Number(i, k); std::isfinite(value))
        members.emplace_back(model->parameters[k].head, ShortestNumber(value));
  }
  if (kind.HasRows()) {
    members.emplace_back("rows", std::to_string(entry.rows.size()));
    if (!kind.HasRowSections()) members.emplace_back("length", entry.rows.empty() ? "" : ShortestNumber(LastOf(entry)));
  }
  return JsonObject(members);
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
      entries.push_back(EntryJson(kind, entry));
      continue;
    }
    if (!kind.HasRows()) {
      fmt::print(streams.out, "{}: {}\n", entry.Name(), ModelsText(kind, entry));
      continue;
    }
    fmt::print(streams.out, "{}: {}{}\n", entry.Name(), Plural(entry.rows.size(), kind.rowName, kind.rowNames),
               entry.rows.empty() || kind.HasRowSections() ? "" : ", " + LengthText(kind.columns[0], entry));
  }
  if (json) fmt::print(streams.out, "{}\n", JsonObject({{kind.entryNames, JsonArray(entries)}}));
  return kDone;
}

}  // namespace tervane
