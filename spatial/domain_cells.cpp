// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/domain_cells.h"

#include <algorithm>
#include <cmath>
#include <deque>
#include <mutex>
#include <new>

#include "data/datafile_facts.h"
#include "data/grid_files.h"
#include "geometry/grid_polygons.h"
#include "geometry/shapes.h"
#include "spatial/data2d.h"
#include "spatial/domain.h"
#include "spatial/placement.h"

namespace tervane {

namespace {

using GridData = CTvn2DOrthoRotatedGridData;

std::size_t CountInside(const GridData& grid) {
  return static_cast<std::size_t>(
      std::ranges::count_if(grid.Values(), [&](float value) { return !grid.IsEmptyValue(value); }));
}

}  // namespace

DomainSource AskDomain(const CYbSEKvfBase& root) {
  DomainSource source;
  const auto* domain = root.Important(kDomain);
  if (!domain) return source;
  source.isShape = domain->Type == CCatchmentKvf::kShapeFile;
  const FileName& file = source.isShape ? domain->ShapeFile().File : domain->GridFile().File;
  source.file = file.IsEmpty() ? std::string() : file.Absolute();
  source.stamps = StampsOfShape(source.file);
  source.item = domain->GridFile().SelectedItem();
  source.axisUnit = domain->ShapeAxisUnit;
  source.geometry = DomainGeometryOf(root);
  return source;
}

FileResult ReadDomain(const DomainSource& source, ProgressPart progress, GridData& grid) {
  if (source.file.empty()) return {"no file is chosen", {}};
  if (!source.geometry) return {DataFileFactsOf(source.file)->error, {}};
  return source.isShape
             ? grid.MakeCatchmentGriddataFromShapefile(source.file, source.axisUnit, *source.geometry, progress)
             : ReadGridData(source.file, source.item, grid, progress);
}

std::vector<std::ptrdiff_t> PlacesOf(const GridData& domain, const GridGeometry& grid) {
  const GridTransform own(grid);
  const GridGeometry& cells = domain.Geometry();
  std::vector<std::ptrdiff_t> places;
  for (int j = 0; j < cells.ny; ++j) {
    for (int i = 0; i < cells.nx; ++i) {
      if (domain.IsEmptyValue(domain.Value(i, j))) continue;
      const MapPoint at = own.ToCells(domain.CellCentre(i, j));
      const bool isInside = at.x >= 0 && at.y >= 0 && at.x < grid.nx && at.y < grid.ny;
      places.push_back(isInside ? static_cast<std::ptrdiff_t>(at.y) * grid.nx + static_cast<std::ptrdiff_t>(at.x) : -1);
    }
  }
  return places;
}

std::vector<std::optional<float>> ValuesIn(const GridData& domain, const GridData& grid) {
  std::vector<std::optional<float>> values;
  for (const std::ptrdiff_t place : PlacesOf(domain, grid.Geometry())) {
    const float value = place < 0 ? grid.DeleteValue() : grid.Values()[static_cast<std::size_t>(place)];
    values.push_back(grid.IsEmptyValue(value) ? std::nullopt : std::optional(value));
  }
  return values;
}

namespace {

/// The code of the area of each cell of the domain, nothing where there is none.
using CodesOfCells = std::vector<std::optional<float>>;

void CountCodes(const CodesOfCells& codes, const AreaCodes& found, AreaCells& cells) {
  for (const std::optional<float>& code : codes) {
    if (code)
      ++cells.cellsOfId[found.IdOf(*code)];
    else
      ++cells.withoutId;
  }
}

}  // namespace

std::string AreaCodes::IdOf(float value) const {
  const int code = static_cast<int>(std::lround(value));
  if (!arePolygons) return std::to_string(code);
  const auto found = idOfCode.find(code);
  return found == idOfCode.end() ? std::string() : found->second;
}

FileResult ReadAreaCodes(const GridSource& areas, ProgressPart progress, AreaCodes& codes) {
  ZoneTable zones;
  const bool isPolygons = areas.type == CData2DKvf::kShapeFile;
  const PolygonFile polygons{areas.file, areas.attribute, areas.gapFill, areas.axisUnit};
  FileResult result =
      isPolygons ? codes.grid.CreateGridData_GIS_Polygon(areas.geometry, kUsualDeleteValue, polygons, zones, progress)
                 : ReadGridData(areas.file, areas.item, codes.grid, progress);
  if (!result.Ok()) return result;
  codes.arePolygons = isPolygons;
  for (const ZoneTable::Zone& zone : zones.zones) codes.idOfCode[zone.code] = zone.text;
  return result;
}

FileResult CountCells(const GridData& domain, const GridSource& areas, ProgressPart progress, AreaCells& cells) {
  AreaCodes found;
  FileResult result = ReadAreaCodes(areas, progress, found);
  if (result.Ok()) CountCodes(ValuesIn(domain, found.grid), found, cells);
  return result;
}

FileResult ComputeZoneAreas(const DomainSource& domain, const GridSource& zones, const GridData* ground,
                            ProgressPart progress, ZoneAreas& areas) {
  GridData grid;
  if (FileResult read = ReadDomain(domain, progress.Part(0, 0.5), grid); !read.Ok())
    return {"The model domain cannot be read: " + read.error, {}};
  areas = {};
  areas.allCells = CountInside(grid);
  areas.cellArea = grid.Geometry().cellSize * grid.Geometry().cellSize;
  AreaCodes found;
  FileResult result = ReadAreaCodes(zones, progress.Part(0.5, 1), found);
  if (!result.Ok()) return result;
  const CodesOfCells codes = ValuesIn(grid, found.grid);
  CountCodes(codes, found, areas.cells);
  if (!ground) return result;
  std::map<std::string, std::pair<double, std::size_t>> sums;
  const std::vector<std::optional<float>> elevations = ValuesIn(grid, *ground);
  for (std::size_t cell = 0; cell < codes.size(); ++cell) {
    if (!codes[cell] || !elevations[cell]) continue;
    auto& [sum, count] = sums[found.IdOf(*codes[cell])];
    sum += static_cast<double>(*elevations[cell]);
    ++count;
  }
  for (const auto& [id, sum] : sums) areas.groundOfId[id] = sum.first / static_cast<double>(sum.second);
  return result;
}

namespace {

std::shared_ptr<const AreaCells> CountIn(const DomainSource& source, const GridSource& areas) {
  try {
    GridData domain;
    AreaCells cells;
    const bool isKnown = ReadDomain(source, {}, domain).Ok() && CountCells(domain, areas, {}, cells).Ok();
    return isKnown ? std::make_shared<const AreaCells>(std::move(cells)) : nullptr;
  } catch (const std::bad_alloc&) {
    return nullptr;
  }
}

}  // namespace

std::shared_ptr<const AreaCells> AreaCellsOf(const CYbSEKvfBase& node, const GridSource& areas) {
  // Counting in more cells than these takes longer than a user who types should wait.
  constexpr std::size_t kMostCellsAtOnce = 4'000'000;
  DomainSource domain = AskDomain(node);
  if (!domain.geometry || areas.file.empty() || !domain.geometry->Problem().empty() ||
      domain.geometry->CellCount() > kMostCellsAtOnce)
    return nullptr;

  // As many as a setup has sources of areas.
  constexpr std::size_t kMostKept = 64;
  struct Known {
    DomainSource domain;
    GridSource areas;
    std::shared_ptr<const AreaCells> cells;
  };
  static std::mutex mutex;
  static std::deque<Known> kept;
  const std::lock_guard lock(mutex);
  for (const Known& known : kept)
    if (known.domain == domain && known.areas == areas) return known.cells;
  auto cells = CountIn(domain, areas);
  kept.push_front({std::move(domain), areas, cells});
  if (kept.size() > kMostKept) kept.pop_back();
  return cells;
}

}  // namespace tervane
