// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What sections and maps show, as bodies that are seen from the side.
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "forms/plots.h"
#include "geometry/relief.h"

namespace tervane {

/// The most columns or rows of a relief; finer grids are sampled.
inline constexpr int kMostReliefCells = 500;

/// What is shown as a relief, which may still have to be computed.
struct ReliefContent {
  std::shared_ptr<const Relief> relief;
  std::string message;  ///< Why there is none.
  Awaited awaited = {};
};
using ReliefSource = std::function<ReliefContent()>;

/// The raster of a relief on a grid's place.
GridGeometry ReliefRaster(GridGeometry grid);

/// The bodies of a section over the whole area of its ground: the ground as a surface, its layers from the top down,
/// lenses, then curves as surfaces that are not shown at first. A body without a colour of its own has 0. Gives why
/// there is none: nothing varies from place to place, or the ground is not known.
std::string ReliefOf(const SectionContent& section, Relief& relief);

/// The values of a grid as heights, where nothing is known of the ground; in its own unit where that is no length.
/// Gives why there is none.
std::string ReliefOfValues(const CTvn2DOrthoRotatedGridData& values, Relief& relief);

/// One of these, made beside the window: sampling takes its time. `values` serve where the section has no ground, and
/// may be null.
ReliefSource ReliefOf(std::function<SectionContent()> section,
                      std::shared_ptr<const CTvn2DOrthoRotatedGridData> values = nullptr);

}  // namespace tervane
