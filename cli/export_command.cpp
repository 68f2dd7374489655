// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <new>
#include <vector>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/command_line.h"
#include "cli/commands.h"
#include "data/raster_file.h"
#include "data/series_csv.h"
#include "platform/files.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

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

}  // namespace

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

}  // namespace tervane
