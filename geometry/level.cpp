// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/level.h"

#include <cmath>
#include <limits>
#include <utility>

#include "platform/item_types.h"
#include "platform/units.h"

namespace tervane {

std::vector<double> ElevationsAlong(const Level& level, const std::vector<SectionPoint>& points,
                                    const std::vector<double>& ground, GridSampling sampling) {
  std::vector<double> values(points.size(), level.value);
  if (level.grid) {
    values = ValuesAlong(*level.grid, points, sampling);
    constexpr int kMetre = 1000;
    const Unit *unit = FindUnit(level.grid->ItemUnit()), *metre = FindUnit(kMetre);
    const auto toMetres = unit ? ConversionBetween(unit->scale, metre->scale) : std::nullopt;
    if (toMetres)
      for (double& value : values) value = (*toMetres)(value);
  }
  if (level.reference == Level::Reference::Datum) return values;
  const double direction = level.reference == Level::Reference::BelowGround ? -1 : 1;
  for (std::size_t i = 0; i < values.size(); ++i) values[i] = ground[i] + direction * values[i];
  return values;
}

std::vector<SectionPoint> CentresOf(const CTvn2DOrthoRotatedGridData& grid) {
  const GridGeometry& geometry = grid.Geometry();
  std::vector<SectionPoint> centres;
  centres.reserve(static_cast<std::size_t>(geometry.nx) * static_cast<std::size_t>(geometry.ny));
  for (int row = 0; row < geometry.ny; ++row)
    for (int column = 0; column < geometry.nx; ++column) centres.push_back({0, grid.CellCentre(column, row)});
  return centres;
}

std::string ThicknessOf(const Level& ground, const std::vector<Level>& bottoms, CTvn2DOrthoRotatedGridData& thickness) {
  const CTvn2DOrthoRotatedGridData* cells = ground.grid.get();
  for (const Level& bottom : bottoms)
    if (!cells) cells = bottom.grid.get();
  if (!cells) return "It is the same everywhere.";
  const std::vector<SectionPoint> centres = CentresOf(*cells);
  const std::vector<double> none(centres.size(), std::numeric_limits<double>::quiet_NaN());
  const std::vector<double> heights = ElevationsAlong(ground, centres, none, GridSampling::Nearest);
  std::vector<double> above = heights, bottom = heights;
  for (const Level& level : bottoms) {
    above = std::exchange(bottom, ElevationsAlong(level, centres, heights, GridSampling::Nearest));
    for (std::size_t i = 0; i < bottom.size(); ++i)
      if (bottom[i] > above[i]) bottom[i] = above[i];
  }
  constexpr float kMissing = -1e-35F;
  constexpr int kMetre = 1000;
  std::vector<float> values(centres.size(), kMissing);
  for (std::size_t i = 0; i < values.size(); ++i)
    if (const double thick = above[i] - bottom[i]; !std::isnan(thick)) values[i] = static_cast<float>(thick);
  return thickness.TakeValues(cells->Geometry(), std::move(values), kMissing, kMetre, quantity::kLayerThickness);
}

}  // namespace tervane
