// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <algorithm>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/offers.h"
#include "libraries/wells.h"
#include "platform/files.h"

namespace tervane {

namespace {

struct WellImportCommand {
  std::string in, out;
  bool force = false;
};

int ImportWells(const WellImportCommand& command, Streams streams) {
  if (RefuseToReplace(command.out, command.force, streams)) return kCouldNot;
  WellImport import;
  if (const std::string problem = ReadWellTable(command.in, import); !problem.empty()) return Refuse(streams, problem);
  for (const std::string& note : import.notes) fmt::print(streams.err, "{}: not taken\n", note);
  // A file that is there keeps all but its wells; a new one begins with what its editor expects.
  Library wells(kWellLibrary);
  if (!FileExists(command.out)) {
    const std::vector<CTvnWellData> made = WellsOf(import.wells);
    const MapPoint first = made.front().place;
    Envelope area{first.x, first.y, first.x, first.y};
    for (const CTvnWellData& well : made)
      area = {std::min(area.xMin, well.place.x), std::min(area.yMin, well.place.y), std::max(area.xMax, well.place.x),
              std::max(area.yMax, well.place.y)};
    if (const FileResult begun = WriteEmptyWellFile(command.out, area); !begun.Ok())
      return Refuse(streams, begun.error);
  }
  if (const std::string problem = ReadLibrary(command.out, wells); !problem.empty()) return Refuse(streams, problem);
  for (LibraryEntry& well : import.wells.entries)
    for (LibraryRow& filter : well.rows) filter.file = FileName(filter.file, import.wells.folder).TextIn(wells.folder);
  wells.entries = std::move(import.wells.entries);
  if (const FileResult written = WriteLibrary(command.out, wells); !written.Ok()) return Refuse(streams, written.error);
  const std::vector<LibraryFinding> findings = FindingsOf(wells);
  for (const LibraryFinding& finding : findings)
    fmt::print(streams.err, "{}: warning: {}\n", command.out, FindingText(command.out, wells, finding));
  std::size_t filters = 0;
  for (const LibraryEntry& well : wells.entries) filters += well.rows.size();
  fmt::print(streams.out, "{}: {} wells with {} filters\n", command.out, wells.entries.size(), filters);
  return import.notes.empty() ? kDone : kFindings;
}

}  // namespace

void OfferWellImport(CommandOffers& offers, const Command& family) {
  auto options = std::make_shared<WellImportCommand>();
  Command wells = offers.Offer(
      "wells", "Make a well file (.WEL) of a table of wells",
      [offers, options] { return ImportWells(*options, offers.Output()); }, &family);
  wells
      .Add("TABLE", options->in,
           "Comma separated values with the columns name, x, y, level, depth, and field, top, bottom, file, item")
      .Required();
  wells.Add("OUT", options->out, "The well file (.WEL)").Required();
  wells.AddFlag("--force", options->force, "Take the place of the wells of a file that is there");
}

}  // namespace tervane
