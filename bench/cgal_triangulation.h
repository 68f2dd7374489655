// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <vector>

namespace tervane::bench {

/// What a Delaunay triangulation by CGAL gives linearly at the centres of `side` x `side` cells of size 1, row by row
/// from the south; `empty` outside the hull.
std::vector<float> CgalLinear(const std::vector<double>& x, const std::vector<double>& y, const std::vector<double>& z,
                              int side, float empty);

}  // namespace tervane::bench
