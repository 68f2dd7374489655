// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Small data files for tests; what cannot be written fails the test.
#pragma once

#include <string>
#include <vector>

#include "geometry/grid.h"
#include "geometry/shapes.h"

namespace tervane::test {

/// Fails the test with this error, unless it is empty.
void Require(const std::string& error);

/// A grid, row 0 in the south, with empty cells of `kUsualDeleteValue`.
void WriteGrid(const std::string& path, const GridGeometry& geometry, std::vector<float> values, int itemType);
/// A row of codes.
void WriteCodes(const std::string& path, std::vector<float> codes);
/// A shape file with one shape of that kind for each value of its attribute "CODE": squares of 10 m in a row, or their
/// centres.
void WriteShapes(const std::string& path, ShapeKind kind, AttributeKind attribute,
                 const std::vector<ShapeValue>& values);

}  // namespace tervane::test
