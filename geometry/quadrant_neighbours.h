// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The nearest point in each quadrant around the centres of a grid's cells.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <vector>

#include "geometry/xyz_text.h"
#include "platform/progress.h"

namespace tervane {

/// Finds the neighbours of whole rows at a time, in a time that grows with the cells and with the points within reach
/// of the rows, however they lie. Lengths are in cells: cell i has its centre at i + 0.5.
///
/// Quadrants are counted counter-clockwise from the upper right one; an axis belongs to the quadrant that it opens. A
/// point just at a centre lies in none. Of points equally near, the one nearer along x counts.
class QuadrantNeighbours {
 public:
  /// The points must be sorted by y and live as long.
  QuadrantNeighbours(const std::vector<ScatteredPoint>& points, int nx, double radius);

  /// Finds the neighbours of the cells of rows [begin, end). Throws `Cancelled`.
  void Find(int begin, int end, ProgressPart progress);
  /// The indices of the nearest points, one for each cell of a row that was found last. `NoPoint` tells that none is
  /// within the radius; what is told may still lie farther away.
  const std::uint32_t* Row(std::size_t quadrant, int j) const { return nearest_.data() + Place(quadrant, j); }
  std::uint32_t NoPoint() const { return static_cast<std::uint32_t>(points_.size()); }

 private:
  /// How a quadrant is looked at: turned so that it opens to the right.
  struct View {
    std::size_t quadrant;
    bool isLeft, isBelow;
    /// Whether points straight above or below the centre belong to it; else those straight beside it do.
    bool hasVertical;
  };
  /// A point that rows have come past, turned like the view.
  struct Entered {
    double x, y;
    std::uint32_t following;
  };
  /// A point and the columns which it is the nearest to: those from the next one's `last` on up to its own.
  struct Served {
    std::uint32_t point;
    double x, height2;
    int last;
  };

  std::size_t Place(std::size_t quadrant, int j) const;
  double LastColumn(double x, const View& view) const;
  void Sweep(const View& view, ProgressPart progress);
  void Enter(std::uint32_t point, const View& view);
  void FindServed(double y, const View& view);
  void Store(int j, const View& view);

  const std::vector<ScatteredPoint>& points_;
  int nx_;
  double radius_;
  int begin_ = 0, end_ = 0;
  std::vector<std::uint32_t> nearest_;
  /// For each column the first of the points between its centre and the next; the others follow it. A point comes
  /// before those that are farther from the row, and those only follow while they are nearer to the column.
  std::vector<std::uint32_t> firstOfColumn_;
  std::vector<Entered> entered_;
  std::vector<Served> served_;
};

}  // namespace tervane
