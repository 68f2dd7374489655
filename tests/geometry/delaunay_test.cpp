// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/delaunay.h"

#include <algorithm>
#include <cmath>
#include <random>
#include <string>

#include <gtest/gtest.h>

namespace tervane::delaunay_test {
namespace {

using Points = std::vector<LatticePoint>;

Points Sorted(Points points) {
  const auto isLess = [](LatticePoint a, LatticePoint b) { return a.x != b.x ? a.x < b.x : a.y < b.y; };
  std::sort(points.begin(), points.end(), isLess);
  points.erase(std::unique(points.begin(), points.end()), points.end());
  return points;
}

std::int64_t Turn(LatticePoint a, LatticePoint b, LatticePoint c) {
  return (b.x - a.x) * (c.y - a.y) - (b.y - a.y) * (c.x - a.x);
}

/// Twice the area of the convex hull of sorted points.
std::int64_t HullArea(const Points& points) {
  Points hull;
  const auto half = [&](auto begin, auto end) {
    const std::size_t base = hull.size();
    for (auto it = begin; it != end; ++it) {
      while (hull.size() >= base + 2 && Turn(hull[hull.size() - 2], hull.back(), *it) <= 0) hull.pop_back();
      hull.push_back(*it);
    }
    hull.pop_back();
  };
  half(points.begin(), points.end());
  half(points.rbegin(), points.rend());
  std::int64_t area = 0;
  for (std::size_t i = 0; i + 1 < hull.size(); ++i) area += Turn(hull[0], hull[i], hull[i + 1]);
  return area;
}

/// Above 0 when d is inside the circle; exact for coordinates up to some thousands.
std::int64_t InCircle(LatticePoint a, LatticePoint b, LatticePoint c, LatticePoint d) {
  const std::int64_t ax = a.x - d.x, ay = a.y - d.y, bx = b.x - d.x, by = b.y - d.y, cx = c.x - d.x, cy = c.y - d.y;
  return (ax * ax + ay * ay) * (bx * cy - by * cx) + (bx * bx + by * by) * (cx * ay - cy * ax) +
         (cx * cx + cy * cy) * (ax * by - ay * bx);
}

TEST(Delaunay, CoversTheHullWithTrianglesWhoseCirclesAreEmpty) {
  std::mt19937 random(5);
  const auto scattered = [&](int count, int size) {
    std::uniform_int_distribution<std::int64_t> coordinate(0, size);
    Points points;
    for (int i = 0; i < count; ++i) points.push_back({coordinate(random), coordinate(random)});
    return points;
  };
  Points grid, circle, line, fan;
  for (int i = 0; i < 144; ++i) grid.push_back({i % 12 * 10, i / 12 * 10});
  // The lattice points of x² + y² = 1105², all on one circle.
  for (int x = -1105; x <= 1105; ++x) {
    const auto y = static_cast<std::int64_t>(std::lround(std::sqrt(1105.0 * 1105.0 - x * x)));
    if (x * x + y * y != 1105 * 1105) continue;
    circle.push_back({1105 + x, 1105 + y});
    circle.push_back({1105 + x, 1105 - y});
  }
  for (int i = 0; i < 50; ++i) line.push_back({3 * i, 2 * i});
  fan = line;
  fan.push_back({500, 0});
  const struct {
    const char* name;
    Points points;
  } rows[] = {{"scattered", scattered(300, 2000)},
              {"dense", scattered(300, 20)},
              {"grid", grid},
              {"circle", circle},
              {"line", line},
              {"fan", fan},
              {"column", {{0, 0}, {0, 1}, {0, 2}, {0, 3}}},
              {"three", scattered(3, 100)},
              {"one", {{1, 1}}},
              {"none", {}}};
  for (const auto& row : rows) {
    const Points points = Sorted(row.points);
    std::int64_t area = 0;
    int inside = 0;
    for (const Triangle& t : Triangulate(points)) {
      const LatticePoint a = points[t[0]], b = points[t[1]], c = points[t[2]];
      EXPECT_GT(Turn(a, b, c), 0) << row.name;
      area += Turn(a, b, c);
      for (const LatticePoint d : points) inside += InCircle(a, b, c, d) > 0;
    }
    EXPECT_EQ(area, points.size() < 3 ? 0 : HullArea(points)) << row.name;
    EXPECT_EQ(inside, 0) << row.name;
  }
}

TEST(Delaunay, IsExactAtTheEdgeOfTheLattice) {
  // Of the four corners of a square that is one step off, only one diagonal is right.
  for (const std::int64_t step : {-1, 1}) {
    const Points points = Sorted({{0, 0},
                                  {kLatticeSize - 1, 0},
                                  {0, kLatticeSize - 1},
                                  {kLatticeSize - 1 - (step > 0), kLatticeSize - 1 - (step > 0)}});
    const std::vector<Triangle> triangles = Triangulate(points);
    ASSERT_EQ(triangles.size(), 2u);
    if (step < 0) continue;
    // The fourth point lies inside the circle of the others, so that no triangle has just those.
    for (const Triangle& t : triangles)
      EXPECT_TRUE(std::count(t.begin(), t.end(), 2u) == 1 && std::count(t.begin(), t.end(), 0u) == 1);
  }
}

TEST(Delaunay, StopsWhenCancelled) {
  Points points;
  for (int i = 0; i < 5000; ++i) points.push_back({i, i * i % 97});
  Progress progress;
  progress.Cancel();
  EXPECT_THROW(Triangulate(points, progress), Cancelled);
}

}  // namespace
}  // namespace tervane::delaunay_test
