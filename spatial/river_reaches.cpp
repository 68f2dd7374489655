// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/river_reaches.h"

#include <algorithm>
#include <cmath>

#include <fmt/format.h>

#include "geometry/grid_polygons.h"
#include "spatial/domain.h"

namespace tervane {

namespace {

bool IsInZone(const ZoneCells& cells, double x, double y) {
  const GridGeometry& geometry = cells.grid.Geometry();
  if (!(x >= 0 && y >= 0 && x < geometry.nx && y < geometry.ny)) return false;
  const float value = cells.grid.Value(static_cast<int>(x), static_cast<int>(y));
  if (cells.grid.IsEmptyValue(value)) return false;
  return !cells.code || std::round(value) == *cells.code;
}

/// From 0 to 1 along a segment in cells: where it goes from one cell to the next.
void AddCrossings(double from, double to, double size, std::vector<double>& places) {
  if (from == to) return;
  const double low = std::max(std::min(from, to), 0.0), high = std::min(std::max(from, to), size);
  for (double line = std::ceil(low); line <= high; ++line) {
    const double place = (line - from) / (to - from);
    if (place > 0 && place < 1) places.push_back(place);
  }
}

/// The chainages between which a branch lies in the zone, ascending.
std::vector<std::pair<double, double>> PiecesOf(const RiverBranch& branch, const ZoneCells& cells) {
  const GridGeometry& geometry = cells.grid.Geometry();
  const GridTransform transform(geometry);
  std::vector<std::pair<double, double>> pieces;
  std::vector<double> places;
  for (std::size_t i = 1; i < branch.points.size(); ++i) {
    const RiverPoint &start = branch.points[i - 1], &end = branch.points[i];
    const MapPoint a = transform.ToCells(start.place), b = transform.ToCells(end.place);
    places = {0, 1};
    AddCrossings(a.x, b.x, geometry.nx, places);
    AddCrossings(a.y, b.y, geometry.ny, places);
    std::ranges::sort(places);
    for (std::size_t k = 1; k < places.size(); ++k) {
      const double middle = (places[k - 1] + places[k]) / 2;
      if (!IsInZone(cells, a.x + middle * (b.x - a.x), a.y + middle * (b.y - a.y))) continue;
      const auto chainage = [&](double place) { return start.chainage + place * (end.chainage - start.chainage); };
      const auto [low, high] = std::minmax({chainage(places[k - 1]), chainage(places[k])});
      if (!pieces.empty() && low - pieces.back().second < geometry.cellSize)
        pieces.back().second = std::max(pieces.back().second, high);
      else
        pieces.emplace_back(low, high);
    }
  }
  std::erase_if(pieces, [&](const auto& piece) { return piece.second - piece.first < geometry.cellSize; });
  return pieces;
}

}  // namespace

FileResult CellsOfZone(const ZoneSource& source, const CFMSEKvfGroupBase& zone, ZoneCells& cells) {
  if (source.UsesGridCodes()) {
    cells.code = static_cast<float>(zone.StationCode());
    return ReadGridData(source.GridFile().File.Absolute(), source.GridFile().SelectedItem(), cells.grid);
  }
  if (!source.UsesPolygons()) {
    const auto* domain = zone.Important(kDomain);
    std::string problem = "there is no model domain";
    const auto grid = domain ? domain->GetDomainGrid(&problem) : nullptr;
    if (!grid) return {problem, {}};
    cells.grid = *grid;
    return {};
  }
  const GridSource polygons = source.CurrentSource();
  ZoneTable zones;
  FileResult made = cells.grid.CreateGridData_GIS_Polygon(
      polygons.geometry, kUsualDeleteValue, {polygons.file, polygons.attribute, polygons.gapFill, polygons.axisUnit},
      zones);
  if (!made.Ok()) return made;
  const auto found = std::ranges::find(zones.zones, zone.GetStationId(), &ZoneTable::Zone::text);
  if (found == zones.zones.end()) return {fmt::format("{} has no polygon {}", polygons.file, zone.GetStationId()), {}};
  cells.code = static_cast<float>(found->code);
  return made;
}

std::vector<RiverReach> ReachesWithin(const CYbSimpleRiverData& network, const ZoneCells& cells) {
  std::vector<RiverReach> reaches;
  for (const RiverBranch& branch : network.branches)
    for (const auto& [low, high] : PiecesOf(branch, cells)) {
      const bool isRising = branch.direction != RiverBranch::kToLowerChainages;
      reaches.push_back({branch.name, isRising ? low : high, isRising ? high : low});
    }
  return reaches;
}

}  // namespace tervane
