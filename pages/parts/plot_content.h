// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What the pages of spatial and temporal input have in common: their maps, charts and buttons.
#pragma once

#include <string>
#include <vector>

#include "data/datafile.h"
#include "data/grid_files.h"
#include "forms/page.h"
#include "forms/plots.h"
#include "spatial/file_nodes.h"
#include "spatial/zone_sync.h"

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
/// A chart of the selected item of a file of series, with the simulation's period.
SeriesContent FileChart(const DataFileNode& file);

/// The unit of an item's values in short, "mm/day"; as the file says it where it is none of ours.
std::string ShortUnitOf(const DataItem& item);

/// The units of an item type as a choice list over the key that a setup stores.
Control& UnitKeyChoice(PageForm& form, const std::string& label, const char* key, int& unitKey, int itemType);

/// Which zone or station of `owner` fills the gaps between polygons.
Control& GapFillChoice(PageForm& form, std::string& filler, const CFMSEKvfBase& owner);
/// Sets `filler` to the first zone or station when none has that name.
void KeepGapFill(std::string& filler, const CFMSEKvfBase& owner);

/// Looks for zones or stations while the user may watch and give up; then they are unreadable.
FoundZones FindWatched(Host& host, const ZoneFinder& finder);
/// Brings zones or stations in step with a source, asking before work of the user's would be lost. Gives the hints of
/// what changed; `sync` does it.
int SyncOrAsk(Host& host, const FoundZones& found, const SyncPlan& plan, const std::function<SyncResult()>& sync);

/// Opens a data file of a page in the program's viewer, with the backdrop prepared for it and, where one is told, its
/// item.
void EditDataFile(const PageContext& context, const CYbSEKvfBase& node, const FileName& file,
                  std::optional<int> item = {});
/// True when the setup has a name, beside which files can be made; else the user is told so.
bool MayCreateFile(const PageContext& context);

inline constexpr const char* kGridFileFilter = "Two Dim Files (*.nds2) |*.nds2|All Files (*.*) |*.*||";
inline constexpr const char* kShapeFileFilter = "Shape Files (*.shp) |*.shp|All Files (*.*) |*.*||";
inline constexpr const char* kSeriesFileFilter = "Time series files (*.nds0) |*.nds0|All Files (*.*) |*.*||";

}  // namespace tervane
