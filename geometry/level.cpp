// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/level.h"

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
  if (level.isAboveGround)
    for (std::size_t i = 0; i < values.size(); ++i) values[i] += ground[i];
  return values;
}

}  // namespace tervane
