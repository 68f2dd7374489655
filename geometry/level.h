// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Levels of the ground: where a layer ends, where a head stands. All that shows or writes levels asks these for
// elevations.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "geometry/grid_section.h"
#include "platform/key_number.h"

namespace tervane {

/// A level by a grid, in the unit that it tells (metres otherwise), or by one value in metres for all places.
struct Level {
  /// What values are counted from.
  enum class Reference {
    Datum,        ///< They are elevations.
    AboveGround,  ///< They are heights above ground, negative below it.
    BelowGround,  ///< They are depths, positive below ground.
  };

  std::shared_ptr<const CTvn2DOrthoRotatedGridData> grid = nullptr;  ///< Null for one value.
  KeyNumber<double> value = 0;
  Reference reference = Reference::Datum;

  bool operator==(const Level&) const = default;
};

/// Elevations in metres at the points of a line, where the ground has those; NaN where nothing is known.
std::vector<double> ElevationsAlong(const Level& level, const std::vector<SectionPoint>& points,
                                    const std::vector<double>& ground, GridSampling sampling = GridSampling::Bilinear);

/// The centres of all cells of a grid, row by row from the south.
std::vector<SectionPoint> CentresOf(const CTvn2DOrthoRotatedGridData& grid);

/// The thickness in metres of the lowest of layers that end at those levels, the first of which begins at the ground: 0
/// where its level lies above the one over it. On the cells of the ground, or of the first level that has some. Gives
/// why there is none: no level differs from place to place.
std::string ThicknessOf(const Level& ground, const std::vector<Level>& bottoms, CTvn2DOrthoRotatedGridData& thickness);

}  // namespace tervane
