// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/ring_faults.h"

#include <cmath>

#include <gtest/gtest.h>

namespace tervane::ring_faults_test {
namespace {

TEST(RingFaults, AreToldByTheirPlace) {
  const struct {
    std::vector<MapPoint> points;
    std::vector<std::size_t> parts;
    const char* fault;
  } rows[] = {
      {{{0, 0}, {0, 4}, {4, 4}, {4, 0}, {0, 0}}, {0}, ""},
      {{{0, 0}, {0, 4}, {4, 4}, {4, 0}}, {0}, "shape 1: ring 1 is not closed"},
      {{{0, 0}, {4, 4}, {0, 0}}, {0}, "shape 1: ring 1 has no area"},
      {{{0, 0}, {4, 4}, {4, 0}, {0, 4}, {0, 0}}, {0}, "shape 1: ring 1 crosses itself near 2, 2"},
      // A hole and a ring that touches itself in a point are fine.
      {{{0, 0}, {0, 9}, {9, 9}, {9, 0}, {0, 0}, {1, 1}, {3, 3}, {1, 5}, {5, 5}, {3, 3}, {5, 1}, {1, 1}}, {0, 5}, ""},
      {{{0, 0}, {0, 9}, {9, 9}, {9, 0}, {0, 0}, {1, 1}, {5, 5}, {5, 1}, {1, 5}, {1, 1}},
       {0, 5},
       "shape 1: ring 2 crosses itself near 3, 3"},
      {{}, {}, ""},
  };
  for (const auto& row : rows) {
    Shape shape;
    shape.points = row.points;
    shape.parts = row.parts;
    EXPECT_EQ(FirstRingFault({shape}), row.fault);
  }
}

TEST(RingFaults, OfALongRingAreFound) {
  constexpr int kCorners = 200'000;
  Shape shape;
  shape.parts = {0};
  for (int i = 0; i < kCorners; ++i) {
    const double angle = 2 * std::acos(-1.0) * i / kCorners;
    shape.points.push_back({1000 * std::cos(angle), 1000 * std::sin(angle)});
  }
  shape.points.push_back(shape.points.front());
  EXPECT_EQ(FirstRingFault({shape}), "");
  std::swap(shape.points[1000], shape.points[1010]);
  EXPECT_NE(FirstRingFault({shape}), "");
}

}  // namespace
}  // namespace tervane::ring_faults_test
