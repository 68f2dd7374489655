// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/grid_resample.h"

#include <gmock/gmock.h>

namespace tervane {
namespace {

constexpr float kEmpty = kUsualDeleteValue;

GridGeometry At(int nx, int ny, double x0, double y0, double rotation = 0) {
  GridGeometry geometry;
  geometry.nx = nx;
  geometry.ny = ny;
  geometry.cellSize = 10;
  geometry.x0 = x0;
  geometry.y0 = y0;
  geometry.rotation = rotation;
  return geometry;
}

TEST(Resample, TakesTheNearestCellOrBlendsFour) {
  CTvn2DOrthoRotatedGridData source;
  ASSERT_EQ(source.TakeValues(At(3, 2, 0, 0), {1, 2, kEmpty, 5, 6, 7}, kEmpty, 0, 0), "");
  struct Case {
    GridGeometry geometry;
    Resampling method;
    std::vector<float> values;
  };
  const Case cases[] = {
      {At(3, 2, 0, 0), Resampling::Bilinear, {1, 2, kEmpty, 5, 6, 7}},
      // Centres at corners of the source's cells: each the mean of those around that have a value.
      {At(2, 1, 5, 5), Resampling::Bilinear, {3.5F, 5}},
      {At(2, 1, 6, 6), Resampling::Nearest, {6, 7}},
      // Off the source and in its empty cell.
      {At(2, 1, -10, 0), Resampling::Bilinear, {kEmpty, 1}},
      {At(1, 1, 20, 0), Resampling::Bilinear, {kEmpty}},
      // A quarter turn: its rows run west to north.
      {At(2, 3, 30, 0, 90), Resampling::Nearest, {kEmpty, 7, 2, 6, 1, 5}},
  };
  for (const Case& test : cases) EXPECT_EQ(Resample(source, test.geometry, test.method), test.values);
}

}  // namespace
}  // namespace tervane
