// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Delaunay triangulation of points in the plane.
#pragma once

#include <array>
#include <cstdint>
#include <vector>

#include "platform/progress.h"

namespace tervane {

/// A point with whole coordinates, which make every test of the triangulation exact.
struct LatticePoint {
  std::int64_t x = 0, y = 0;

  bool operator==(const LatticePoint&) const = default;
};

/// No coordinate may be below 0 or above this.
inline constexpr std::int64_t kLatticeSize = std::int64_t{1} << 30;

/// Three points by their indices, counter-clockwise.
using Triangle = std::array<std::uint32_t, 3>;

/// The Delaunay triangulation of distinct points sorted by x, then y; no triangles when all lie on one line. Divide and
/// conquer (Guibas and Stolfi 1985), in time n log n whatever the points. Where more than three points lie on a circle,
/// one of the possible triangulations. Throws `Cancelled`.
std::vector<Triangle> Triangulate(const std::vector<LatticePoint>& points, ProgressPart progress = {});

}  // namespace tervane
