// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What lies in the cells of the model domain: values of other grids, and how many of the cells each zone or station
// area has. All works on copies of values, so that another thread may do it.
#pragma once

#include <cstddef>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "core/node.h"
#include "geometry/grid.h"
#include "platform/progress.h"
#include "spatial/data_use.h"

namespace tervane {

/// Where the domain is read from.
struct DomainSource {
  bool isShape = false;
  std::string file;
  std::vector<FileStamp> stamps;
  int item = 1;
  int axisUnit = 1000;
  std::optional<GridGeometry> geometry;  ///< Nothing while it cannot be read.

  bool operator==(const DomainSource&) const = default;
};
DomainSource AskDomain(const CYbSEKvfBase& root);
/// Reads the grid of the domain.
FileResult ReadDomain(const DomainSource& source, ProgressPart progress, CTvn2DOrthoRotatedGridData& grid);

/// For each cell of the domain the place of the cell of another grid in which its centre lies; -1 off that grid.
std::vector<std::ptrdiff_t> PlacesOf(const CTvn2DOrthoRotatedGridData& domain, const GridGeometry& grid);
/// The values of a grid in the cells of the domain; nothing where there is none.
std::vector<std::optional<float>> ValuesIn(const CTvn2DOrthoRotatedGridData& domain,
                                           const CTvn2DOrthoRotatedGridData& grid);

/// The codes of zones or station areas on a grid of their own, and whom a code stands for.
struct AreaCodes {
  CTvn2DOrthoRotatedGridData grid;
  bool arePolygons = false;
  std::map<int, std::string> idOfCode;  ///< Of polygons.

  /// The identity behind a cell's value.
  std::string IdOf(float value) const;
};
FileResult ReadAreaCodes(const GridSource& areas, ProgressPart progress, AreaCodes& codes);

/// The cells of the domain by the zone or station area that they belong to.
struct AreaCells {
  std::map<std::string, std::size_t> cellsOfId;
  std::size_t withoutId = 0;
};
FileResult CountCells(const CTvn2DOrthoRotatedGridData& domain, const GridSource& areas, ProgressPart progress,
                      AreaCells& cells);

/// The cells of each area in the model domain of that node's tree, kept until what decides them changes. Null where
/// they are not known: without a domain, for areas that cannot be read, and for a domain so large that counting would
/// be waited for.
std::shared_ptr<const AreaCells> AreaCellsOf(const CYbSEKvfBase& node, const GridSource& areas);

/// The same with the domain read first, and how large a cell is.
struct ZoneAreas {
  AreaCells cells;
  std::size_t allCells = 0;
  double cellArea = 0;  ///< Square metres.
  /// The mean elevation of the ground in the cells of each area, in the unit of the ground; absent where none of them
  /// has one.
  std::map<std::string, double> groundOfId;
};
/// `ground` may be null.
FileResult ComputeZoneAreas(const DomainSource& domain, const GridSource& zones,
                            const CTvn2DOrthoRotatedGridData* ground, ProgressPart progress, ZoneAreas& areas);

}  // namespace tervane
