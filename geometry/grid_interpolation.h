// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Values at scattered points turned into values of a grid's cells. docs/manual/interpolation.md has the formulas.
#pragma once

#include <string>
#include <vector>

#include "geometry/grid.h"
#include "geometry/xyz_text.h"
#include "platform/files.h"
#include "platform/item_types.h"
#include "platform/progress.h"
#include "platform/units.h"

namespace tervane {

/// As setups number them. All speak of the centre of a cell.
enum class InterpolationMethod {
  Bilinear = 0,  ///< Bilinear surface through the nearest point of each quadrant; inverse distance where one has none.
  Triangular = 1,              ///< Plane of the Delaunay triangle; empty outside the convex hull. No search radius.
  InverseDistance = 2,         ///< Mean of the points within the search radius, weighed with 1 / distance.
  InverseDistanceSquared = 3,  ///< The same with 1 / distance squared.
};

struct InterpolationOptions {
  InterpolationMethod method = InterpolationMethod::InverseDistance;
  double searchRadius = 1000;  ///< In metres; a point at just that distance counts.
  int threads = 1;             ///< How many share the rows.
  ProgressPart progress;
};

/// A file of points with values.
struct ScatteredFile {
  std::string path;
  bool isXyz = false;                   ///< Text of x, y, z, else a shape file of points or lines.
  std::string attribute;                ///< Of a shape file; empty takes the z of its points.
  int axisUnit = 1000;                  ///< One of item 100187.
  int itemUnit = 0;                     ///< Of the values, one of the item type's.
  int itemType = quantity::kUndefined;  ///< Without units: values stay as they are.
};

/// Reads the points of a file in metres, their values in the base unit of the item type. Lines give their vertices.
/// Shapes without a value are left out, and a note counts them.
FileResult ReadScatteredFile(const ScatteredFile& file, std::vector<ScatteredPoint>& points,
                             ProgressPart progress = {});

/// The values of the grid's cells, row 0 the southern one; cells without a value get `deleteValue`. Points at the same
/// place count as one with the mean of their values. Errors: a geometry or radius that is none, no points, a value that
/// no grid can hold, "cancelled", no memory; then there are no values. Points on one line span no triangle, and a note
/// says so.
FileResult Interpolate(std::vector<ScatteredPoint> points, const GridGeometry& geometry, float deleteValue,
                       const InterpolationOptions& options, std::vector<float>& values);

}  // namespace tervane
