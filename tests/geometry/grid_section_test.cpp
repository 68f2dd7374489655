// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/grid_section.h"

#include <cmath>
#include <limits>

#include <gmock/gmock.h>

namespace tervane::grid_section_test {
namespace {

using testing::DoubleNear;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::IsNan;

constexpr float kEmpty = -99;

CTvn2DOrthoRotatedGridData Grid(const GridGeometry& geometry, std::vector<float> values) {
  CTvn2DOrthoRotatedGridData grid;
  EXPECT_EQ(grid.TakeValues(geometry, std::move(values), kEmpty, 1000, 100180), "");
  return grid;
}

std::vector<double> Distances(const std::vector<SectionPoint>& points) {
  std::vector<double> distances;
  for (const SectionPoint& point : points) distances.push_back(point.distance);
  return distances;
}

TEST(GridSection, PointsStandAtStepsCornersAndTheEnd) {
  const double inf = std::numeric_limits<double>::infinity();
  const struct {
    const char* what;
    std::vector<MapPoint> line;
    double step;
    std::vector<double> distances;
  } cases[] = {
      {"steps go on behind a corner", {{0, 0}, {3, 0}, {3, 4}}, 2, {0, 2, 3, 4, 6, 7}},
      {"a corner at a whole step stands once", {{0, 0}, {4, 0}, {4, 4}}, 2, {0, 2, 4, 6, 8}},
      {"a step that is no binary number ends at the end", {{0, 0}, {0.3, 0}}, 0.1, {0, 0.1, 0.2, 0.3}},
      {"a long step", {{0, 0}, {3, 4}}, 100, {0, 5}},
      {"a doubled click", {{0, 0}, {0, 0}, {1, 0}, {1, 0}}, 1, {0, 1}},
      {"there and back", {{0, 0}, {2, 0}, {0, 0}}, 1, {0, 1, 2, 3, 4}},
      {"no length", {{5, 5}, {5, 5}}, 1, {}},
      {"one point", {{5, 5}}, 1, {}},
      {"nothing", {}, 1, {}},
      {"no step", {{0, 0}, {1, 0}}, 0, {}},
      {"no number", {{0, 0}, {inf, 0}}, 1, {}},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    EXPECT_THAT(Distances(PointsAlong(c.line, c.step)), testing::Pointwise(testing::DoubleNear(1e-12), c.distances));
  }
  const auto points = PointsAlong({{10, 0}, {10, 3}, {14, 3}}, 2);
  EXPECT_EQ(points[1].place, (MapPoint{10, 2}));
  EXPECT_EQ(points[3].place, (MapPoint{11, 3}));
  // A tiny step asks for no more memory than a screen can show.
  EXPECT_LE(PointsAlong({{0, 0}, {1e6, 0}}, 1e-6).size(), kMostSectionPoints + 2);
}

TEST(GridSection, NearestTellsTheCellAndEmptyCellsAndPlacesOffTheGridAreGaps) {
  const auto grid = Grid({3, 2, 10, 100, 200, 0, {}}, {1, kEmpty, 3, 4, 5, std::nanf("")});
  std::vector<SectionPoint> points;
  for (const MapPoint place : {MapPoint{101, 201},
                               {109.9, 209.9},
                               {115, 205},
                               {125, 205},
                               {125, 215},
                               {99.9, 205},
                               {130, 205},
                               {105, 220},
                               {std::nan(""), 205}})
    points.push_back({0, place});
  EXPECT_THAT(ValuesAlong(grid, points, GridSampling::Nearest),
              ElementsAre(1, 1, IsNan(), 3, IsNan(), IsNan(), IsNan(), IsNan(), IsNan()));
  EXPECT_THAT(ValuesAlong(grid, {}, GridSampling::Nearest), IsEmpty());
}

TEST(GridSection, BilinearValuesFollowAPlaneAlsoOnATurnedGrid) {
  for (const double rotation : {0.0, 30.0, 90.0, -135.0}) {
    SCOPED_TRACE(rotation);
    const GridGeometry geometry{20, 10, 5, 1000, 2000, rotation, {}};
    auto grid = Grid(geometry, std::vector<float>(200));
    const auto plane = [](MapPoint place) { return 0.5 * (place.x - 1000) - 0.25 * (place.y - 2000); };
    for (int j = 0; j < 10; ++j)
      for (int i = 0; i < 20; ++i) grid.GetData()[j * 20 + i] = static_cast<float>(plane(grid.CellCentre(i, j)));
    const auto points = PointsAlong({grid.CellCentre(1, 1), grid.CellCentre(17, 8), grid.CellCentre(2, 8)}, 1.3);
    const auto values = ValuesAlong(grid, points, GridSampling::Bilinear);
    ASSERT_GT(points.size(), 100U);
    for (std::size_t i = 0; i < points.size(); ++i)
      EXPECT_THAT(values[i], DoubleNear(plane(points[i].place), 1e-4)) << points[i].distance;
  }
}

TEST(GridSection, AnEmptyNeighbourLeavesItsWeightToTheOthersAndItsOwnCellIsAGap) {
  const auto grid = Grid({2, 2, 10, 0, 0, 0, {}}, {1, kEmpty, 3, 7});
  const std::vector<SectionPoint> points{{0, {9.9, 5}}, {0, {10.1, 5}}, {0, {10, 10}}, {0, {1, 1}}, {0, {5, 10}}};
  EXPECT_THAT(
      ValuesAlong(grid, points, GridSampling::Bilinear),
      ElementsAre(DoubleNear(1, 1e-9), IsNan(), DoubleNear(11.0 / 3, 1e-6), DoubleNear(1, 1e-9), DoubleNear(2, 1e-9)));
}

}  // namespace
}  // namespace tervane::grid_section_test
