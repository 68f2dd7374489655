// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/offers.h"
#include "cli/parts/setup_file.h"
#include "data/grid_files.h"
#include "data/raster_import.h"
#include "geometry/xyz_text.h"
#include "platform/paths.h"
#include "platform/text.h"
#include "spatial/domain.h"

namespace tervane {

namespace {

/// What makes a data file of a band of a raster.
struct GridImport {
  std::string in, out;
  int itemType = 0;
  int band = 0;  ///< 0: the only one.
  std::string unit;
  std::string like;                      ///< A setup, on whose model grid the values are put.
  std::optional<Resampling> resampling;  ///< Without one what suits.
  bool force = false;
};

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

/// Why a file could not be imported. Texts of scattered points are no rasters, and what is wrong with them is better
/// told by who reads such points.
std::string WhyNoRaster(const std::string& path, const std::string& error) {
  const std::string extension = LowerCase(ExtensionOf(path));
  if (extension != ".xyz" && extension != ".txt") return error;
  const auto facts = XyzFactsOf(path);
  if (!facts->error.empty()) return facts->error;
  return fmt::format(
      "{}: its {} points stand on no regular grid: name the file as \"Point XYZ(.txt)\" of a quantity, "
      "which interpolates between them ({})",
      path, facts->points, error);
}

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
  if (!report.Ok()) return Refuse(streams, WhyNoRaster(import.in, report.error));
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

}  // namespace

void OfferGridImport(CommandOffers& offers, const Command& family) {
  auto options = std::make_shared<GridImport>();
  Command gridding = offers.Offer(
      "grid", "Make a grid (.nds2) of a band of a raster (GeoTIFF, ASCII grid, ...)",
      [offers, options] { return ImportGridCommand(*options, offers.Output()); }, &family);
  gridding.Footer(
      "UNITS. The values are in the unit of --unit, without it in the one that the raster names, without that in the\n"
      "item type's base unit. A unit that the item type has is kept with the values as they are; values in any other\n"
      "unit (feet for an elevation, say) are converted to the base unit.\n"
      "PLACE. Without --like the grid has the raster's own cells. With it a cell takes: the raster's value, where the\n"
      "cells agree; codes (item type 100370, or 999 with whole numbers of at most 100 values) from the nearest cell;\n"
      "else the average of the raster's cells in it, where two or more go across, or the bilinear value between them.\n"
      "Where both projections are known and differ, places are converted.");
  gridding.Add("RASTER", options->in, "The raster, of any kind that GDAL reads").Required();
  gridding.Add("OUT", options->out, "The data file to write").Required();
  AddQuantity(gridding, options->itemType).Required();
  gridding.Add("--unit", options->unit, "The unit of the raster's values; see UNITS");
  gridding.Add("--band", options->band, "The number of the band, from 1; not needed where there is only one")
      .Positive();
  gridding.Add("--like", options->like, "A setup (.tvd), on whose model grid the values are put; see PLACE");
  gridding
      .AddChoice<Resampling>(
          "--resample", options->resampling,
          {{"nearest", Resampling::Nearest}, {"bilinear", Resampling::Bilinear}, {"average", Resampling::Average}},
          "How, with --like, instead of what PLACE tells")
      .Needs("--like");
  gridding.AddFlag("--force", options->force, "Replace a file that exists");
}

}  // namespace tervane
