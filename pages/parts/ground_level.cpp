// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/ground_level.h"

namespace tervane {

std::optional<Level> LevelOf(CData2DKvf& quantity, Awaited& awaited, std::string& problem) {
  Level level;
  if (quantity.HasRelativeToGround() && quantity.RelativeToGround != 0) level.reference = Level::Reference::AboveGround;
  if (quantity.Kind().itemType == quantity::kDepthBelowGround) level.reference = Level::Reference::BelowGround;
  if (quantity.Type == CData2DKvf::kUniform) {
    level.value = static_cast<double>(quantity.FixedValue);
    return level;
  }
  problem = quantity.WhyFileNotValid();
  const std::shared_ptr<ComputedGrid> grid = problem.empty() ? quantity.GridComputation() : nullptr;
  if (!grid) return std::nullopt;
  level.grid = NowOrAwaited(grid, awaited);
  if (level.grid) return level;
  if (grid->IsDone()) problem = grid->Problem();
  return std::nullopt;
}

}  // namespace tervane
