// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "geometry/grid.h"

namespace tervane {

/// A cell of a grid, both numbers from 0.
struct GridCell {
  int i = 0, j = 0;

  bool operator==(const GridCell&) const = default;
};

/// A boundary condition as it is painted: from its point along the boundary to the next one's.
struct BoundaryItem {
  std::optional<MapPoint> point;  ///< Nothing while a coordinate is undefined.
  int type = 0;

  bool operator==(const BoundaryItem&) const = default;
};

/// The domain grid with its outer boundary, traced cell by cell: clockwise, with the model on the right.
class CGeoDataBoundCondCatchmentData : public CTvn2DOrthoRotatedGridData {
 public:
  // What painting and a traced grid hold in the place of the codes.
  static constexpr float kUnpaintedBoundary = -1.0F, kInside = -2.0F, kOutside = -3.0F;

  GridCell StartCell;
  std::vector<GridCell> BoundaryCells;   ///< In the order of the trace.
  std::vector<MapPoint> BoundaryPoints;  ///< Of the conditions that were painted last.
  std::vector<int> BoundaryIndex;  ///< For each cell 0 off the boundary, else its place in `BoundaryCells` from 1.
  std::vector<float> OriginalCells;
  float OriginalDeleteValue = 0;

  /// Traces the boundary; 0 when that fails. `message` is what the user is to be told then; empty where nothing is.
  int PrepareBoundary(std::string& message);
  /// The cell of the boundary whose centre is nearest; cell (0, 0) without a boundary.
  GridCell NearestBoundaryCell(double x, double y) const;
  /// The place of a cell in the boundary, 0 off it; -1 before the boundary was traced.
  int GetBoundaryIndex(GridCell cell) const;

  /// The places of the items in the order in which their points follow each other along the boundary. As they are given
  /// before the boundary was traced, and while a point is missing.
  std::vector<std::size_t> BoundaryOrder(const std::vector<BoundaryItem>& items) const;

  /// Makes a picture of the conditions: each stretch of the boundary has its type, or the number of its condition.
  void PaintBoundaryTypes(const std::vector<BoundaryItem>& items) { Paint(items, false); }
  void PaintBoundaryNumbers(const std::vector<BoundaryItem>& items) { Paint(items, true); }

 private:
  /// The cell's code as a whole number; -10000 off the grid.
  int CodeAt(GridCell cell) const;
  std::size_t IndexOf(GridCell cell) const;
  void Paint(const std::vector<BoundaryItem>& items, bool byNumber);
};

/// The domain of a setup after it was traced.
struct TracedDomain {
  CGeoDataBoundCondCatchmentData grid;
  std::string fault;  ///< Why its boundary could not be followed; empty where it could.
};

}  // namespace tervane
