// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Makes a file, or opens one, changes it as its editor does and saves it: `save_once make|save KIND FILE`.
#include <algorithm>
#include <cstdio>
#include <iterator>
#include <string>
#include <string_view>
#include <vector>

#include <fmt/format.h>

#include "data/datafile_writer.h"
#include "document/journal.h"
#include "document/recovery.h"
#include "edits/grid_edit.h"
#include "edits/series_edit.h"
#include "execution/run_passport.h"
#include "libraries/library.h"
#include "libraries/river_network.h"
#include "libraries/soils.h"
#include "libraries/vegetations.h"
#include "libraries/wells.h"

namespace {

using namespace tervane;

/// "" or what went wrong.
using Outcome = std::string;

// ---- Data files

Outcome MakeDataFile(const std::string& path, bool isGrid) {
  NewDataFile content;
  content.dimensions = isGrid ? 2 : 0;
  content.geometry.nx = 6;
  content.geometry.ny = 5;
  content.geometry.cellSize = 10;
  content.items = {{"Level", quantity::kElevation, 1000, {}}};
  DataFileWriter writer;
  Outcome error = writer.Create(path, content);
  const std::vector<float> values(isGrid ? 30 : 1, 4.5F);
  for (int day = 1; day <= 3 && error.empty(); ++day) {
    error = writer.AddStep(CYbDateTime(2000, 1, day));
    if (error.empty()) error = writer.Put(1, values);
  }
  return error.empty() ? writer.Finish().error : error;
}
Outcome MakeSeries(const std::string& path) { return MakeDataFile(path, false); }

/// What could not be read is not changed.
template <class Edit, class Change>
Outcome ChangeAndSave(const std::string& path, const Change& change) {
  Edit edit(path);
  Outcome problem = edit.Problem().empty() ? edit.WhyReadOnly() : edit.Problem();
  if (problem.empty()) problem = change(edit);
  return problem.empty() ? edit.Save(path).error : problem;
}

// ---- Libraries and networks

Outcome SaveLibrary(const std::string& path, const LibraryKind& kind, bool isThere) {
  Library library(kind);
  if (isThere)
    if (Outcome why = ReadLibrary(path, library); !why.empty()) return why;
  library.entries.push_back(library.NewEntry(library.FreeName("Oak")));
  return WriteLibrary(path, library).error;
}
template <const LibraryKind& kKind>
Outcome MakeLibrary(const std::string& path) {
  return SaveLibrary(path, kKind, false);
}
template <const LibraryKind& kKind>
Outcome ChangeLibrary(const std::string& path) {
  return SaveLibrary(path, kKind, true);
}

Outcome MakeNetwork(const std::string& path) {
  return CYbSimpleRiverData::Empty({0, 0, 100, 100}).WriteNetworkFile(path).error;
}
Outcome ChangeNetwork(const std::string& path) {
  CYbSimpleRiverData network;
  if (const FileResult read = network.ReadNetworkFile(path); !read.Ok()) return read.error;
  network.SetArea({0, 0, 200, 200});
  return network.WriteNetworkFile(path).error;
}

// ---- What stands beside a setup

Outcome AddStep(const std::string& path, const char* action) {
  return AppendToJournal(path, WriteJournalLine({"2000-01-31 08:30:15", "somebody", action, "", {}}));
}
Outcome SaveAutosave(const std::string& path, const char* text) {
  return WriteAutosave(path, {"/setups/a.tvd", "", {}, text}).error;
}
Outcome SavePassport(const std::string& path, const char* title) {
  RunPassport passport;
  passport.inputs.emplace_back().path = title;
  return WritePassport(passport, path).error;
}

constexpr struct {
  std::string_view name;
  Outcome (*make)(const std::string& path);
  Outcome (*save)(const std::string& path);
} kKinds[] = {
    {"series", MakeSeries,
     [](const std::string& path) {
       return ChangeAndSave<SeriesEdit>(path, [](SeriesEdit& edit) { return edit.SetValue(0, 1, 7.5F); });
     }},
    {"times", MakeSeries,
     [](const std::string& path) {
       return ChangeAndSave<SeriesEdit>(path, [](SeriesEdit& edit) { return edit.InsertRow(1); });
     }},
    {"grid", [](const std::string& path) { return MakeDataFile(path, true); },
     [](const std::string& path) {
       return ChangeAndSave<GridEdit>(path, [](GridEdit& edit) {
         return edit.PutCells("Paste", {{1, 2, 7.5F}, {3, 3, 8.5F}});
       });
     }},
    {"vegetation", MakeLibrary<kVegetationLibrary>, ChangeLibrary<kVegetationLibrary>},
    {"soils", MakeLibrary<kSoilLibrary>, ChangeLibrary<kSoilLibrary>},
    {"wells", MakeLibrary<kWellLibrary>, ChangeLibrary<kWellLibrary>},
    {"network", MakeNetwork, ChangeNetwork},
    {"journal", [](const std::string& path) { return AddStep(path, "first"); },
     [](const std::string& path) { return AddStep(path, "second"); }},
    {"autosave", [](const std::string& path) { return SaveAutosave(path, "first"); },
     [](const std::string& path) { return SaveAutosave(path, "second"); }},
    {"passport", [](const std::string& path) { return SavePassport(path, "first"); },
     [](const std::string& path) { return SavePassport(path, "second"); }},
};

}  // namespace

int main(int argc, char** argv) {
  if (argc != 4) return 2;
  const std::string_view what = argv[1];
  const auto* kind = std::ranges::find(kKinds, std::string_view(argv[2]), [](const auto& each) { return each.name; });
  if (kind == std::end(kKinds)) return 2;
  const Outcome problem = (what == "make" ? kind->make : kind->save)(argv[3]);
  if (!problem.empty()) fmt::print(stderr, "{}\n", problem);
  return problem.empty() ? 0 : 1;
}
