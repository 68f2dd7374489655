// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/grid_outline.h"

#include <array>
#include <utility>

namespace tervane {

namespace {

/// The edges between cells with and without a value, each with the cell that has one on its right. A corner knows in
/// which directions edges leave it.
class EdgesOfCells {
 public:
  explicit EdgesOfCells(const CTvn2DOrthoRotatedGridData& grid)
      : nx_(grid.Geometry().nx),
        ny_(grid.Geometry().ny),
        leaving_((static_cast<std::size_t>(nx_) + 1) * (static_cast<std::size_t>(ny_) + 1)) {
    const auto isThere = [&](int i, int j) {
      return i >= 0 && j >= 0 && i < nx_ && j < ny_ && !grid.IsEmptyValue(grid.Value(i, j));
    };
    for (int j = 0; j < ny_; ++j) {
      for (int i = 0; i < nx_; ++i) {
        if (!isThere(i, j)) continue;
        if (!isThere(i, j + 1)) Add({i, j + 1}, kEast);
        if (!isThere(i + 1, j)) Add({i + 1, j + 1}, kSouth);
        if (!isThere(i, j - 1)) Add({i + 1, j}, kWest);
        if (!isThere(i - 1, j)) Add({i, j}, kNorth);
      }
    }
  }

  /// Takes all edges away, ring by ring, and tells the corners of each in turn.
  template <class Ring>
  void TakeRings(const Ring& ring) {
    for (int j = 0; j <= ny_; ++j)
      for (int i = 0; i <= nx_; ++i)
        for (int direction = kEast; direction <= kNorth; ++direction)
          if (Leaving({i, j}) & Bit(direction)) ring(TakeRing({i, j}, direction));
  }

 private:
  struct Corner {
    int i, j;
    bool operator==(const Corner&) const = default;
  };
  enum Direction { kEast, kSouth, kWest, kNorth };  ///< Each lies to the right of the one before.

  static unsigned char Bit(int direction) { return static_cast<unsigned char>(1U << direction); }
  unsigned char& Leaving(Corner corner) {
    return leaving_[static_cast<std::size_t>(corner.j) * (static_cast<std::size_t>(nx_) + 1) +
                    static_cast<std::size_t>(corner.i)];
  }
  void Add(Corner corner, Direction direction) { Leaving(corner) |= Bit(direction); }

  std::vector<MapPoint> TakeRing(Corner start, int direction) {
    constexpr std::array<std::pair<int, int>, 4> kSteps = {{{1, 0}, {0, -1}, {-1, 0}, {0, 1}}};
    const auto pointOf = [](Corner corner) {
      return MapPoint{static_cast<double>(corner.i), static_cast<double>(corner.j)};
    };
    std::vector<MapPoint> points = {pointOf(start)};
    for (Corner at = start;;) {
      Leaving(at) &= static_cast<unsigned char>(~Bit(direction));
      const auto [east, north] = kSteps[static_cast<std::size_t>(direction)];
      at = {at.i + east, at.j + north};
      // To the right first: so a ring stays at its cells where others touch them at a corner.
      int next = -1;
      for (const int turn : {1, 0, 3})
        if (next < 0 && (Leaving(at) & Bit((direction + turn) % 4))) next = (direction + turn) % 4;
      if (next != direction) points.push_back(pointOf(at));
      if (next < 0) return points;
      direction = next;
    }
  }

  int nx_, ny_;
  std::vector<unsigned char> leaving_;
};

}  // namespace

void MakeOutline(const CTvn2DOrthoRotatedGridData& grid, CTvnShapeData& outline) {
  outline.Create(ShapeKind::Polygon, {}, {});
  const GridTransform transform(grid.Geometry());
  Shape shape;
  EdgesOfCells(grid).TakeRings([&](const std::vector<MapPoint>& ring) {
    shape.parts.push_back(shape.points.size());
    for (const MapPoint& corner : ring) shape.points.push_back(transform.ToWorld(corner));
  });
  if (!shape.points.empty()) outline.AddShape(std::move(shape));
}

}  // namespace tervane
