// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "engine/detailed_output.h"

#include <cmath>

#include <fmt/format.h>

#include "data/datafile.h"
#include "results/result_types.h"

namespace tervane {

namespace {

/// A cell by its place from 0, where there is one.
struct PointCell {
  int column = -1, row = -1;
  std::optional<std::size_t> index;
};

PointCell CellOf(const CTvn2DOrthoRotatedGridData& domain, MapPoint point) {
  const GridGeometry& geometry = domain.Geometry();
  const MapPoint inCells = GridTransform(geometry).ToCells(point);
  if (!(inCells.x >= 0 && inCells.x < geometry.nx && inCells.y >= 0 && inCells.y < geometry.ny)) return {};
  PointCell cell{static_cast<int>(inCells.x), static_cast<int>(inCells.y), {}};
  if (!domain.IsEmptyValue(domain.Value(cell.column, cell.row)))
    cell.index = static_cast<std::size_t>(cell.row) * static_cast<std::size_t>(geometry.nx) +
                 static_cast<std::size_t>(cell.column);
  return cell;
}

/// The layer of a depth below ground, from 1 at the top; 0 where there is none.
int LayerAt(const ModelLayers& layers, std::size_t cell, double depth) {
  if (layers.IsEmpty()) return 0;
  const float ground = layers.Tops(0)[cell];
  if (ground == kDeleteValue) return 0;
  // A point at the ground belongs to the layer below it, one between two layers to the lower.
  constexpr double kLittle = 1e-6;
  const double elevation = static_cast<double>(ground) - depth;
  return layers.LayersBetween(cell, elevation, elevation - kLittle).first;
}

}  // namespace

std::vector<DetailedPoint> PlaceDetailedPoints(const CDetailedTSOutputListKvf& list,
                                               const CTvn2DOrthoRotatedGridData& domain, const ModelLayers& layers,
                                               const std::string& seriesFile, EngineOutput& log) {
  std::vector<DetailedPoint> points;
  for (int number = 1; number <= list.GetItemCount(); ++number) {
    const CDetailedTSOutputItemKvf& item = *list.GetItem(number);
    DetailedPoint& point = points.emplace_back();
    point.name = item.Name;
    point.dataType = ResultCatalogue::Own().GetNameOfNewDataType(item.HydrComp).value;
    point.x = item.X;
    point.y = item.Y;
    point.simulated = {seriesFile, number};
    const PointCell cell = CellOf(domain, {item.X, item.Y});
    point.column = cell.column + 1;
    point.row = cell.row + 1;
    if (!cell.index)
      log.Warning(PathOf(item), "the point lies outside the model domain");
    else if (item.IsDepthActive())
      point.layer = LayerAt(layers, *cell.index, item.Z);
    point.includesObserved = item.InclObserved != 0;
    if (point.includesObserved) point.observed = {item.Observed().File.Absolute(), item.Observed().SelectedItem()};
  }
  return points;
}

std::string DetailedPointsText(const std::vector<DetailedPoint>& points) {
  std::string text;
  for (const DetailedPoint& point : points)
    text += fmt::format("{}: {} in cell {}, {}{}{}\n", point.name, point.dataType, point.column, point.row,
                        point.layer > 0 ? fmt::format(", layer {}", point.layer) : std::string(),
                        point.includesObserved ? ", with observed values" : "");
  return text;
}

}  // namespace tervane
