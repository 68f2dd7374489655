// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/level.h"

#include <gmock/gmock.h>

namespace tervane::level_test {
namespace {

using testing::ElementsAre;

constexpr float kEmpty = -99;
constexpr int kMetre = 1000, kFoot = 1003, kElevation = 100180;

using Reference = Level::Reference;

Level Row(std::vector<float> values, Reference reference = Reference::Datum, int unit = kMetre) {
  auto grid = std::make_shared<CTvn2DOrthoRotatedGridData>();
  const GridGeometry place{static_cast<int>(values.size()), 1, 10, 0, 0, 0, {}};
  EXPECT_EQ(grid->TakeValues(place, std::move(values), kEmpty, unit, kElevation), "");
  return {.grid = grid, .reference = reference};
}
Level Uniform(double value, Reference reference = Reference::Datum) { return {.value = value, .reference = reference}; }

TEST(Level, IsAnElevationOrCountsFromTheGroundInAnyUnit) {
  const Level ground = Row({100, 90, kEmpty});
  const std::vector<SectionPoint> places = CentresOf(*ground.grid);
  const std::vector<double> heights = ElevationsAlong(ground, places, {0, 0, 0});
  const auto at = [&](const Level& level) { return ElevationsAlong(level, places, heights, GridSampling::Nearest); };
  EXPECT_THAT(at(Uniform(5)), ElementsAre(5, 5, 5));
  EXPECT_THAT(at(Uniform(-5, Reference::AboveGround)), ElementsAre(95, 85, testing::IsNan()));
  EXPECT_THAT(at(Uniform(5, Reference::BelowGround)), ElementsAre(95, 85, testing::IsNan()));
  EXPECT_THAT(at(Row({-1, kEmpty, -1}, Reference::AboveGround)), ElementsAre(99, testing::IsNan(), testing::IsNan()));
  EXPECT_THAT(at(Row({10, 20, 30}, Reference::Datum, kFoot)),
              ElementsAre(testing::DoubleNear(3.048, 1e-9), testing::DoubleNear(6.096, 1e-9),
                          testing::DoubleNear(9.144, 1e-9)));
}

TEST(Level, AThicknessIsThatOfTheLowestLayerAndNeverNegative) {
  CTvn2DOrthoRotatedGridData grid;
  ASSERT_EQ(ThicknessOf(Uniform(100), {Row({95, 80, 90}), Uniform(90)}, grid), "");
  EXPECT_THAT(grid.Values(), ElementsAre(5, 0, 0));
  ASSERT_EQ(ThicknessOf(Row({100, kEmpty, 90}), {Uniform(-5, Reference::AboveGround)}, grid), "");
  EXPECT_EQ(grid.Value(0, 0), 5);
  EXPECT_TRUE(grid.IsEmptyValue(grid.Value(1, 0)));
  EXPECT_EQ(ThicknessOf(Uniform(100), {Uniform(90)}, grid), "It is the same everywhere.");
}

}  // namespace
}  // namespace tervane::level_test
