// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>
#include <vector>

namespace tervane::test {

/// Writes what the preprocessor leaves of a setup of that base name: the stored report, with a page of every kind, and
/// all files that it names. Throws when one cannot be written.
void WritePreprocessedRun(const std::string& resultFolder, const std::string& baseName);

/// A river file in memory, whose parts a test may make wrong.
struct RiverBytes {
  int version = 1, nx = 4, ny = 3;
  std::optional<int> points, projectionLength;  ///< As many as there are when nothing is said.
  std::string projection = {};
  double cellSize = 100, x0 = 0, y0 = 0, rotation = 0;
  std::vector<int> first, second;  ///< nx * ny values each.
  struct Point {
    int flag;
    double x, y;
  };
  std::vector<Point> river;

  std::string Bytes() const;
};

}  // namespace tervane::test
