// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "geometry/shapes.h"
#include "libraries/river_network.h"

namespace tervane {

struct RiverImportOptions {
  std::string nameAttribute = {};  ///< Of the branches' names; empty for one that is called so, if there is any.
  double tolerance = 1;            ///< Ends within it are joined, in metres.
  double sliver = 100;             ///< Shorter lines are told, in metres.
  /// With it the branches flow downhill; without it as they are drawn.
  const CTvn2DOrthoRotatedGridData* ground = nullptr;
};

struct RiverImport {
  std::vector<RiverBranch> branches;
  std::size_t junctions = 0;          ///< Ends that are joined to another branch.
  std::size_t turned = 0;             ///< Lines that were drawn uphill.
  std::vector<std::string> warnings;  ///< What a user should look at; nothing of it is left out silently.
  std::string error;                  ///< Why there are no branches; empty when there are.
};

/// How many times the tolerance an end may miss another line before nothing is told of it.
inline constexpr double kNearlyMeets = 10;

/// Makes a branch of each line: chainages count in the direction of flow from 0, ends that meet another line are joined
/// to it. The shapes need the values of all attributes.
RiverImport BranchesOfLines(const CYbShapeData& shapes, const RiverImportOptions& options);

}  // namespace tervane
