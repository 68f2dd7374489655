// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/quadrant_neighbours.h"

#include <algorithm>
#include <cmath>

namespace tervane {

QuadrantNeighbours::QuadrantNeighbours(const std::vector<ScatteredPoint>& points, int nx, double radius)
    : points_(points), nx_(nx), radius_(radius), entered_(points.size()) {}

void QuadrantNeighbours::Find(int begin, int end, ProgressPart progress) {
  begin_ = begin;
  end_ = end;
  nearest_.assign(Place(4, begin), NoPoint());
  for (std::size_t quadrant = 0; quadrant < 4; ++quadrant) {
    Sweep({quadrant, quadrant == 1 || quadrant == 2, quadrant >= 2, quadrant % 2 == 1}, progress);
  }
}

std::size_t QuadrantNeighbours::Place(std::size_t quadrant, int j) const {
  const std::size_t row = quadrant * static_cast<std::size_t>(end_ - begin_) + static_cast<std::size_t>(j - begin_);
  return row * static_cast<std::size_t>(nx_);
}

/// The last of the columns, counted in the direction in which the quadrant opens, that has a point at x in it; below 0
/// for none.
double QuadrantNeighbours::LastColumn(double x, const View& view) const {
  const double whole = std::floor(x);
  const bool isPast = view.hasVertical ? whole + 0.5 <= x : whole + 0.5 < x;
  return std::min((isPast ? whole : whole - 1) + (view.isLeft ? nx_ : 0), nx_ - 1.0);
}

/// Goes through the rows away from the side on which the quadrant lies, so that points come in and none leaves.
void QuadrantNeighbours::Sweep(const View& view, ProgressPart progress) {
  firstOfColumn_.assign(static_cast<std::size_t>(nx_), NoPoint());
  const auto isBelow = [](const ScatteredPoint& point, double limit) { return point.y < limit; };
  // Who asks decides on points at just the distance of the radius.
  const double reach = radius_ * (1 + 1e-9);
  const double start = view.isBelow ? begin_ + 0.5 - reach : end_ - 0.5 + reach;
  auto next = std::lower_bound(points_.begin(), points_.end(), start, isBelow) - points_.begin();
  const auto count = static_cast<std::ptrdiff_t>(points_.size());
  for (int k = 0; k < end_ - begin_; ++k) {
    progress.ThrowIfCancelled();
    const int j = view.isBelow ? begin_ + k : end_ - 1 - k;
    const double y = j + 0.5;
    const auto isIn = [&](std::ptrdiff_t point) {
      const double above = points_[static_cast<std::size_t>(point)].y - y, height = view.isBelow ? -above : above;
      return view.hasVertical ? height > 0 : height >= 0;
    };
    if (view.isBelow) {
      for (; next < count && isIn(next); ++next) Enter(static_cast<std::uint32_t>(next), view);
    } else {
      for (; next > 0 && isIn(next - 1); --next) Enter(static_cast<std::uint32_t>(next - 1), view);
    }
    FindServed(y, view);
    Store(j, view);
  }
}

void QuadrantNeighbours::Enter(std::uint32_t point, const View& view) {
  // Turned by its sign alone, so that differences stay the same to the last bit.
  const double x = view.isLeft ? -points_[point].x : points_[point].x;
  const double column = LastColumn(x, view);
  if (column < 0) return;
  // It is nearer than all that came earlier and lie as far along x or farther, also for all rows that follow.
  std::uint32_t& first = firstOfColumn_[static_cast<std::size_t>(column)];
  while (first != NoPoint() && entered_[first].x >= x) first = entered_[first].following;
  entered_[point] = {x, points_[point].y, first};
  first = point;
}

/// Squares of distances to two points differ by a straight line along the row, so that the one with the smaller x is
/// the nearer one up to some place, and the other one from there on. From the right, each point therefore takes
/// columns from those before it, and keeps them unless a later one takes them (the lower envelope of parabolas, as
/// Felzenszwalb and Huttenlocher 2012 use it).
void QuadrantNeighbours::FindServed(double y, const View& view) {
  served_.clear();
  const double shift = view.isLeft ? nx_ : 0;
  const std::uint32_t none = NoPoint();
  for (int column = nx_ - 1; column >= 0; --column) {
    std::uint32_t point = firstOfColumn_[static_cast<std::size_t>(column)];
    for (; point != none; point = entered_[point].following) {
      const double x = entered_[point].x, height = entered_[point].y - y, height2 = height * height;
      if (std::abs(height) > radius_) break;
      int last = column;
      for (; !served_.empty(); served_.pop_back()) {
        const Served& before = served_.back();
        // Twice the way, times the distance along x, from the row's origin to where the two are equally near.
        const double distance = before.x - x, border = (before.x + x) * distance + (before.height2 - height2);
        if (before.last <= column && border >= (2 * before.last + 1 - 2 * shift) * distance) continue;
        const double nearer = std::floor(border / (2 * distance) - 0.5 + shift);
        last = static_cast<int>(std::clamp(nearer, -1.0, static_cast<double>(column)));
        break;
      }
      if (last >= 0) served_.push_back({point, x, height2, last});
    }
  }
}

void QuadrantNeighbours::Store(int j, const View& view) {
  const auto row = nearest_.begin() + static_cast<std::ptrdiff_t>(Place(view.quadrant, j));
  for (std::size_t k = 0; k < served_.size(); ++k) {
    const int last = served_[k].last, first = k + 1 < served_.size() ? served_[k + 1].last + 1 : 0;
    if (view.isLeft) {
      std::fill(row + (nx_ - 1 - last), row + (nx_ - first), served_[k].point);
    } else {
      std::fill(row + first, row + (last + 1), served_[k].point);
    }
  }
}

}  // namespace tervane
