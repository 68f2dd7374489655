// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "forms/section_profile.h"

#include <algorithm>
#include <cmath>
#include <limits>

#include "platform/units.h"

namespace tervane {

namespace {

std::vector<double> ElevationsAlong(const CTvn2DOrthoRotatedGridData& grid, const std::vector<SectionPoint>& points) {
  std::vector<double> values = ValuesAlong(grid, points, GridSampling::Bilinear);
  constexpr int kMetre = 1000;
  const Unit *unit = FindUnit(grid.ItemUnit()), *metre = FindUnit(kMetre);
  const auto toMetres = unit ? ConversionBetween(unit->scale, metre->scale) : std::nullopt;
  if (toMetres)
    for (double& value : values) value = (*toMetres)(value);
  return values;
}

}  // namespace

SectionProfile ProfileOf(const SectionContent& content, double step) {
  SectionProfile profile;
  if (content.IsEmpty()) return profile;
  profile.points = PointsAlong(content.line, step);
  profile.ground = ElevationsAlong(*content.ground, profile.points);
  std::vector<double> above = profile.ground;
  for (const SectionSurface& surface : content.surfaces) {
    SectionProfile::Band band{surface.name, above, ElevationsAlong(*surface.bottom, profile.points)};
    for (std::size_t i = 0; i < above.size(); ++i) {
      if (std::isnan(band.bottom[i])) continue;
      if (!std::isnan(above[i])) band.bottom[i] = std::min(band.bottom[i], above[i]);
      above[i] = band.bottom[i];
    }
    profile.bands.push_back(std::move(band));
  }
  return profile;
}

double StepFor(const SectionContent& content) {
  constexpr double kMostPoints = 4000, kPointsInCell = 4;
  double cell = content.ground ? content.ground->Geometry().cellSize : 1;
  for (const SectionSurface& surface : content.surfaces) cell = std::min(cell, surface.bottom->Geometry().cellSize);
  return std::max({LengthOf(content.line) / kMostPoints, cell / kPointsInCell, std::numeric_limits<double>::min()});
}

std::optional<std::pair<double, double>> SectionProfile::Range(double from, double to) const {
  std::optional<std::pair<double, double>> range;
  const auto add = [&](const std::vector<double>& values) {
    for (std::size_t i = 0; i < points.size(); ++i) {
      if (std::isnan(values[i]) || points[i].distance < from || points[i].distance > to) continue;
      if (!range) range = {values[i], values[i]};
      range = {std::min(range->first, values[i]), std::max(range->second, values[i])};
    }
  };
  add(ground);
  for (const Band& band : bands) add(band.bottom);
  return range;
}

}  // namespace tervane
