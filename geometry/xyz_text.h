// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Points with a value in plain text, one on a line: x, y, z.
#pragma once

#include <cstddef>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "geometry/grid.h"
#include "platform/files.h"

namespace tervane {

/// A point of the map, in metres, with its value.
struct ScatteredPoint {
  double x = 0, y = 0, z = 0;

  bool operator==(const ScatteredPoint&) const = default;
};

/// Reads a text of points, in the file's own units. Fields stand apart by blanks, tabs, commas or semicolons; where the
/// first point has a semicolon, or blanks between numbers with a comma inside, a comma is the decimal mark. Whatever
/// stands before the first point and does not begin with a number is a heading; empty lines and lines that begin with
/// `#`, `!` or `%` are left out everywhere. Columns behind the third are not read. Errors name file and line; then
/// `points` is empty.
FileResult ReadXyzFile(const std::string& path, std::vector<ScatteredPoint>& points, ProgressPart progress = {});

/// The same of a text; `path` stands in the messages.
FileResult ParseXyz(std::string_view text, const std::string& path, std::vector<ScatteredPoint>& points,
                    ProgressPart progress = {});

/// What a text of points holds, read once for all callers while the file is unchanged. In the file's own units.
struct XyzFacts {
  std::string error;  ///< As of `ReadXyzFile`; then the rest says nothing.
  std::size_t points = 0;
  Envelope extent;
  double smallest = 0, largest = 0;  ///< Of the values.
};
/// Never null.
std::shared_ptr<const XyzFacts> XyzFactsOf(const std::string& path);

}  // namespace tervane
