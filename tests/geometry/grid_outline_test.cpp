// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/grid_outline.h"

#include <cmath>

#include <gmock/gmock.h>

namespace tervane::grid_outline_test {
namespace {

constexpr float kEmpty = -99;

/// Of a ring that is closed, positive where it goes clockwise.
double Area(std::span<const MapPoint> ring) {
  double twice = 0;
  for (std::size_t i = 1; i < ring.size(); ++i) twice += ring[i].x * ring[i - 1].y - ring[i - 1].x * ring[i].y;
  return twice / 2;
}

TEST(GridOutline, GoesAroundAllPartsAndHoles) {
  const struct {
    const char* what;
    const char* cells;  ///< Rows from the north; x has a value.
    std::vector<double> areas;
    std::size_t corners;
  } cases[] = {
      {"one cell", "...|.x.|...", {1}, 5},
      {"all cells, along the edge of the grid", "xxx|xxx|xxx", {9}, 5},
      {"a hole", "xxx|x.x|xxx", {9, -1}, 10},
      {"two parts", "x.x|x.x|x.x", {3, 3}, 10},
      {"parts that touch at a corner", "..x|xx.|xx.", {4, 1}, 10},
      {"holes that touch at a corner", "xxxx|x.xx|xx.x|xxxx", {16, -2}, 14},
      {"a step", "x..|xx.|xxx", {6}, 9},
      {"nothing", "...|...|...", {}, 0},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    const std::string text = c.cells;
    const int nx = static_cast<int>(text.find('|')), ny = nx;
    std::vector<float> values(static_cast<std::size_t>(nx * ny), kEmpty);
    for (int j = 0; j < ny; ++j)
      for (int i = 0; i < nx; ++i)
        if (text[static_cast<std::size_t>((ny - 1 - j) * (nx + 1) + i)] == 'x')
          values[static_cast<std::size_t>(j * nx + i)] = 1;
    CTvn2DOrthoRotatedGridData grid;
    ASSERT_EQ(grid.TakeValues({nx, ny, 10, 100, 200, 0, {}}, std::move(values), kEmpty, 0, 0), "");
    CTvnShapeData outline;
    MakeOutline(grid, outline);
    ASSERT_EQ(outline.GetData().size(), c.areas.empty() ? 0U : 1U);
    if (c.areas.empty()) continue;
    const Shape& shape = outline.GetData().front();
    std::vector<double> areas;
    for (std::size_t part = 0; part < shape.parts.size(); ++part) {
      const auto ring = std::span(shape.points).subspan(shape.parts[part], shape.PartEnd(part) - shape.parts[part]);
      EXPECT_EQ(ring.front(), ring.back());
      areas.push_back(Area(ring) / 100);
    }
    EXPECT_THAT(areas, testing::UnorderedElementsAreArray(c.areas));
    EXPECT_EQ(shape.points.size(), c.corners) << "no corner within a straight line";
  }
}

TEST(GridOutline, TurnsWithTheGrid) {
  CTvn2DOrthoRotatedGridData grid;
  ASSERT_EQ(grid.TakeValues({1, 1, 10, 100, 200, 90, {}}, {1}, kEmpty, 0, 0), "");
  CTvnShapeData outline;
  MakeOutline(grid, outline);
  Envelope around;
  ASSERT_TRUE(outline.GetTranscribingRect(around));
  EXPECT_EQ(around, (Envelope{90, 200, 100, 210}));
}

}  // namespace
}  // namespace tervane::grid_outline_test
