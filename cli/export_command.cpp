// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <new>
#include <vector>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/offers.h"
#include "data/raster_file.h"
#include "data/series_csv.h"
#include "platform/files.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// What of a data file is written for other programs.
struct Export {
  std::string in, out;
  int item = 1, step = 1, layer = 1;  ///< Of grids.
  bool isPartNamed = false;           ///< One of them was given.
  bool force = false;
};

FileResult Failed(std::string error) { return {std::move(error), {}}; }

FileResult WriteTable(const DataFile& file, const std::string& out) {
  std::string text;
  if (std::string error = WriteCsvSeries(file, text); !error.empty()) return Failed(std::move(error));
  return WriteFileAtomically(out, text);
}

/// Writes one step of one layer, in the file's unit.
FileResult WriteRaster(const DataFile& file, const Export& wanted) {
  const std::size_t count = file.Items().size();
  if (static_cast<std::size_t>(wanted.item) > count)
    return Failed(fmt::format("{}: there is no item {}: the file has {}", wanted.in, wanted.item, count));
  const DataItem& item = file.Items()[static_cast<std::size_t>(wanted.item - 1)];
  if (item.dimensions < 2) return Failed(fmt::format("{}: item {} is no grid", wanted.in, wanted.item));
  ValueSelection selection;
  selection.item = wanted.item;
  selection.step = static_cast<std::size_t>(wanted.step - 1);
  selection.layer = wanted.layer - 1;
  std::vector<float> values(file.SizeOf(selection));
  if (std::string error = file.Read(selection, values); !error.empty()) return Failed(std::move(error));
  return WriteGeoTiff(wanted.out, {item.geometry, item.name, item.itemType, item.unitKey, item.unitText}, values);
}

int ExportCommand(const Export& wanted, Streams streams) {
  DataFile file;
  if (const std::string error = file.Open(wanted.in); !error.empty()) return Refuse(streams, error);
  const std::string_view extension = ExtensionOf(wanted.out);
  const bool isRaster = EqualIgnoringCase(extension, ".tif") || EqualIgnoringCase(extension, ".tiff");
  if (!isRaster && wanted.isPartNamed)
    return Refuse(streams, "--item, --step and --layer choose a grid for a GeoTIFF: give OUT the extension .tif");
  if (RefuseToReplace(wanted.out, wanted.force, streams)) return kCouldNot;
  FileResult written;
  try {
    written = isRaster ? WriteRaster(file, wanted) : WriteTable(file, wanted.out);
  } catch (const std::bad_alloc&) {
    written = Failed(fmt::format("cannot read {}: it needs more than the free memory", wanted.in));
  }
  if (!written.Ok()) return Refuse(streams, written.error);
  if (!written.note.empty()) fmt::print(streams.err, "{}: {}\n", wanted.out, written.note);
  return kDone;
}

}  // namespace

void OfferExportCommand(CommandOffers& offers) {
  auto options = std::make_shared<Export>();
  CLI::App* exporting = offers.Command("export", "Write time series (.nds0) as a table (CSV), or a grid as GeoTIFF",
                                       [offers, options] { return ExportCommand(*options, offers.Output()); });
  exporting->add_option("FILE", options->in, "The data file")->required();
  exporting->add_option("OUT", options->out, "The file to write: a GeoTIFF when it ends in .tif, else a table")
      ->required();
  for (const auto& [name, number, description] :
       {std::tuple{"--item", &options->item, "The item of a grid, from 1; the first without it"},
        std::tuple{"--step", &options->step, "Its time step, from 1; the first without it"},
        std::tuple{"--layer", &options->layer, "Its layer, from 1 at the bottom; the lowest without it"}}) {
    exporting->add_option(name, *number, description)->check(CLI::PositiveNumber)->each([options](const std::string&) {
      options->isPartNamed = true;
    });
  }
  exporting->add_flag("--force", options->force, "Replace a file that exists");
}

}  // namespace tervane
