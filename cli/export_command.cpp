// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <algorithm>
#include <new>
#include <optional>
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
  std::optional<int> item, step, layer;  ///< Of grids; each the first without it.
  std::optional<CsvStamps> stamps;       ///< Of series; ends without it.
  bool force = false;
};

FileResult Failed(std::string error) { return {std::move(error), {}}; }

FileResult WriteTable(const DataFile& file, const Export& wanted) {
  std::string text;
  if (std::string error = WriteCsvSeries(file, wanted.stamps.value_or(CsvStamps::Ends), text); !error.empty())
    return Failed(std::move(error));
  return WriteFileAtomically(wanted.out, text);
}

/// What the dates of the table are: who reads it must know.
std::string StampsText(const DataFile& file, const Export& wanted) {
  if (wanted.stamps == CsvStamps::Begins) return "each date is the begin of its interval";
  const bool holdAtDates = std::ranges::all_of(
      file.Items(), [](const DataItem& item) { return item.valueType == ValueType::Instantaneous; });
  if (holdAtDates) return "each value holds at its date";
  return wanted.stamps ? "each date is the end of its interval"
                       : "each date is the end of its interval; --stamps begin writes the begins";
}

/// Writes one step of one layer, in the file's unit.
FileResult WriteRaster(const DataFile& file, const Export& wanted) {
  const std::size_t count = file.Items().size();
  ValueSelection selection;
  selection.item = wanted.item.value_or(1);
  selection.step = static_cast<std::size_t>(wanted.step.value_or(1) - 1);
  selection.layer = wanted.layer.value_or(1) - 1;
  if (static_cast<std::size_t>(selection.item) > count)
    return Failed(fmt::format("{}: there is no item {}: the file has {}", wanted.in, selection.item, count));
  const DataItem& item = file.Items()[static_cast<std::size_t>(selection.item - 1)];
  if (item.dimensions < 2) return Failed(fmt::format("{}: item {} is no grid", wanted.in, selection.item));
  std::vector<float> values(file.SizeOf(selection));
  if (std::string error = file.Read(selection, values); !error.empty()) return Failed(std::move(error));
  return WriteGeoTiff(wanted.out, {item.geometry, item.name, item.itemType, item.unitKey, item.unitText}, values);
}

int ExportCommand(const Export& wanted, Streams streams) {
  if (wanted.in.empty() || wanted.out.empty())
    return Refuse(streams, "name the data file and the file to write: tervane export FILE OUT");
  DataFile file;
  if (const std::string error = file.Open(wanted.in); !error.empty()) return Refuse(streams, error);
  const std::string_view extension = ExtensionOf(wanted.out);
  const bool isRaster = EqualIgnoringCase(extension, ".tif") || EqualIgnoringCase(extension, ".tiff");
  if (!isRaster && (wanted.item || wanted.step || wanted.layer))
    return Refuse(streams, "--item, --step and --layer choose a grid for a GeoTIFF: give OUT the extension .tif");
  if (isRaster && wanted.stamps)
    return Refuse(streams, "--stamps tells what the dates of a table are: a GeoTIFF has none");
  if (RefuseToReplace(wanted.out, wanted.force, streams)) return kCouldNot;
  FileResult written;
  try {
    written = isRaster ? WriteRaster(file, wanted) : WriteTable(file, wanted);
  } catch (const std::bad_alloc&) {
    written = Failed(fmt::format("cannot read {}: it needs more than the free memory", wanted.in));
  }
  if (!written.Ok()) return Refuse(streams, written.error);
  if (!written.note.empty()) fmt::print(streams.err, "{}: {}\n", wanted.out, written.note);
  if (!isRaster) fmt::print(streams.out, "{}: {} steps, {}\n", wanted.out, file.Time().steps, StampsText(file, wanted));
  return kDone;
}

}  // namespace

void OfferExportCommands(CommandOffers& offers) {
  auto options = std::make_shared<Export>();
  Command exporting = offers.Offer("export", "Write time series (.nds0) as a table (CSV), or a grid as GeoTIFF",
                                   [offers, options] { return ExportCommand(*options, offers.Output()); });
  exporting.Add("FILE", options->in, "The data file");
  exporting.Add("OUT", options->out, "The file to write: a GeoTIFF when it ends in .tif, else a table");
  exporting.Add("--item", options->item, "The item of a grid, from 1; the first without it").Positive();
  exporting.Add("--step", options->step, "Its time step, from 1; the first without it").Positive();
  exporting.Add("--layer", options->layer, "Its layer, from 1 at the bottom; the lowest without it").Positive();
  exporting.AddChoice<CsvStamps>("--stamps", options->stamps, {{"begin", CsvStamps::Begins}, {"end", CsvStamps::Ends}},
                                 "Which end of its interval a date of a table is; end without it");
  exporting.AddFlag("--force", options->force, "Replace a file that exists");
  OfferModflow6Export(offers, exporting);
}

}  // namespace tervane
