// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <vector>

#include "geometry/shapes.h"

namespace tervane {

/// What is wrong with the rings of polygons, by the first of them: "shape 3: ring 1 crosses itself near 340000,
/// 5120000", or that it is not closed; empty when nothing was found. Such polygons are used all the same, by the
/// even-odd rule. Where edges by the million
/// lie beside each other the search ends early, so that it never takes long.
std::string FirstRingFault(const std::vector<Shape>& polygons);

}  // namespace tervane
