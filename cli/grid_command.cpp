// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/command_line.h"
#include "cli/commands.h"
#include "cli/setup_file.h"
#include "data/grid_files.h"
#include "data/raster_import.h"
#include "spatial/domain.h"

namespace tervane {

namespace {

/// The model grid of a setup; false, with a message, when it has none: the grid that stands in for a missing file is
/// none to put values on.
bool FindModelGrid(const std::string& setup, GridGeometry& geometry, Streams streams) {
  CFlowModelDoc document;
  if (!OpenSetup(document, setup, streams)) return false;
  const auto* domain = document.Root().Important(kDomain);
  geometry = domain->GetModelGeometry();
  if (domain->Type != CCatchmentKvf::kGridFile) return true;
  const FileResult result =
      ReadGeoInfoFromNdsFile(domain->GridFile().File.Absolute(), domain->GridFile().SelectedItem(), geometry);
  if (!result.Ok()) Refuse(streams, fmt::format("{}: the model domain: {}", setup, result.error));
  return result.Ok();
}

}  // namespace

int ImportGridCommand(const GridImport& import, Streams streams) {
  RasterImport wanted;
  wanted.itemType = import.itemType;
  wanted.band = import.band;
  wanted.unit = import.unit;
  wanted.resampling = import.resampling;
  if (FindItemType(import.itemType) == nullptr)
    return Refuse(streams, fmt::format("there is no item type {}", import.itemType));
  if (RefuseToReplace(import.out, import.force, streams)) return kCouldNot;
  if (!import.like.empty() && !FindModelGrid(import.like, wanted.grid.emplace(), streams)) return kCouldNot;

  CTvn2DOrthoRotatedGridData grid;
  const RasterImportReport report = ImportRaster(import.in, wanted, grid);
  for (const std::string& note : report.notes) fmt::print(streams.err, "{}: note: {}\n", import.in, note);
  for (const std::string& warning : report.warnings) fmt::print(streams.err, "{}: warning: {}\n", import.in, warning);
  if (!report.Ok()) return Refuse(streams, report.error);
  const FileResult written = WriteGridData(import.out, grid);
  if (!written.Ok()) return Refuse(streams, written.error);
  if (!written.note.empty()) fmt::print(streams.err, "{}: {}\n", import.out, written.note);
  const GridGeometry& geometry = grid.Geometry();
  fmt::print(streams.out, "{}: grid {} x {} of {} in {}, {} values, {} empty\n", import.out, geometry.nx, geometry.ny,
             FindItemType(grid.ItemType())->name, FindUnit(grid.ItemUnit())->text, report.values, report.empty);
  if (wanted.grid) {
    fmt::print(streams.out, "on the model grid of {}: {}\n", import.like, ResamplingText(report.resampling));
  }
  return kDone;
}

}  // namespace tervane
