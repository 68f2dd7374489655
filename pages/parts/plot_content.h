// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What the pages of spatial and temporal input show of files: maps and charts.
#pragma once

#include <string>
#include <vector>

#include "data/datafile.h"
#include "data/grid_files.h"
#include "forms/plots.h"
#include "platform/item_types.h"
#include "platform/units.h"
#include "spatial/file_nodes.h"

namespace tervane {

/// A map of one grid, or the reason why there is none; on the setup's backdrop and with its transparency.
MapContent GridMap(const CYbSEKvfBase& node, std::shared_ptr<const CTvn2DOrthoRotatedGridData> grid,
                   const std::string& problem);
/// The same of a grid that may still have to be computed; null for none.
MapContent GridMap(const CYbSEKvfBase& node, const std::shared_ptr<ComputedGrid>& grid);
/// The same of an item of a data file, the first step and layer unless told.
MapContent GridFileMap(const CYbSEKvfBase& node, const std::string& path, int item, const GridSlice& slice = {});
/// The same of a data file's selected item.
MapContent FileMap(const DataFileNode& file, const GridSlice& slice = {});
/// A map of a shape file with its attribute.
MapContent ShapeFileMap(const CData2DShpFile& file, int axisUnit);
/// A grid of a file, and the shapes of one with an attribute, empty for none; read once for all pages.
std::shared_ptr<ComputedGrid> RecentGrid(const std::string& path, int item, const GridSlice& slice = {});
std::shared_ptr<Computed<CTvnShapeData>> RecentShapes(const std::string& path, const std::string& attribute,
                                                      int axisUnit);
/// Puts the setup's layers behind and over what the map of a node shows, and the outline of the domain over all.
void AddBackdrop(const CYbSEKvfBase& node, MapContent& map);
/// Puts the outline of the domain of that node's setup over a map, but over one of the domain itself.
void AddDomainOutline(const CYbSEKvfBase& node, MapContent& map);
/// A chart of the selected item of a file of series, with the simulation's period.
SeriesContent FileChart(const DataFileNode& file);

/// A series of a file as it stands there, and what its values are.
struct FileSeries : Series {
  int itemType = quantity::kUndefined;
  std::optional<UnitScale> scale = {};  ///< Of its unit; nothing when nobody knows it.
};

/// The values of a series of a file over time.
std::shared_ptr<Computed<FileSeries>> RecentSeries(const std::string& path, int item);
/// The series in the user's unit of its quantity, the base unit without `units`; as it stands in the file where that
/// tells no quantity.
Series InUserUnit(const FileSeries& series, const DisplayUnits* units);

/// The unit of an item's values in short, "mm/day"; as the file says it where it is none of ours.
std::string ShortUnitOf(const DataItem& item);

}  // namespace tervane
