// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "forms/relief_content.h"

#include <cmath>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "platform/units.h"

namespace tervane {
namespace {

std::shared_ptr<const CTvn2DOrthoRotatedGridData> GridOf(int nx, int ny, std::vector<float> values) {
  auto grid = std::make_shared<CTvn2DOrthoRotatedGridData>();
  GridGeometry geometry;
  geometry.nx = nx;
  geometry.ny = ny;
  geometry.cellSize = 10;
  EXPECT_EQ(grid->TakeValues(geometry, std::move(values), kUsualDeleteValue, 1000, 100180), "");
  return grid;
}

SectionContent TwoLayers() {
  SectionContent section;
  section.ground = Level{GridOf(3, 2, {10, 11, 12, 13, 14, 15})};
  section.surfaces.push_back({"Sand", {GridOf(3, 2, {5, 5, 20, 5, 5, 5})}});
  section.surfaces.push_back({"Clay", {nullptr, 4.0, Level::Reference::Datum}, 0x123456});
  section.curves.push_back({"Head", {nullptr, 7.0}});
  section.screens.push_back({"North 3", {15, 5}, 4, -2});
  return section;
}

TEST(ReliefContentTest, ASectionBecomesBodiesOverTheWholeGround) {
  Relief relief;
  ASSERT_EQ(ReliefOf(TwoLayers(), relief), "");
  ASSERT_EQ(relief.bodies.size(), 4U);
  EXPECT_THAT(relief.bodies[0].top, testing::ElementsAre(10, 11, 12, 13, 14, 15));
  EXPECT_FALSE(relief.bodies[0].isShown) << "its layers show where they come to the surface";
  // A bottom above its top is no thickness, as in sections.
  EXPECT_THAT(relief.bodies[1].bottom, testing::ElementsAre(5, 5, 12, 5, 5, 5));
  EXPECT_THAT(relief.bodies[2].top, testing::ElementsAre(5, 5, 12, 5, 5, 5));
  EXPECT_EQ(relief.bodies[2].color, 0xff123456U);
  EXPECT_TRUE(relief.bodies[3].IsSurface());
  EXPECT_FALSE(relief.bodies[3].isShown);
  ASSERT_EQ(relief.wells.size(), 1U);
  EXPECT_EQ(relief.Heights(), std::optional(std::pair(-2.0, 15.0)));
}

TEST(ReliefContentTest, WhatHasNoGroundOrNoPlaceIsTold) {
  Relief relief;
  EXPECT_EQ(ReliefOf(SectionContent(), relief), "The ground is not known.");
  SectionContent flat;
  flat.ground = Level{nullptr, 3.0};
  EXPECT_EQ(ReliefOf(flat, relief), "All levels are the same everywhere.");
}

TEST(ReliefContentTest, ValuesThatAreLengthsAreMetresAndOthersKeepTheirUnit) {
  const auto make = [](int unit, int itemType) {
    CTvn2DOrthoRotatedGridData grid;
    EXPECT_EQ(grid.TakeValues({2, 1, 10, 0, 0, 0, {}}, {100, 200}, kUsualDeleteValue, unit, itemType), "");
    Relief relief;
    EXPECT_EQ(ReliefOfValues(grid, relief), "");
    return relief;
  };
  constexpr int kFoot = 1003, kElevationItem = 100180, kRainItem = 100431;
  const Relief ground = make(kFoot, kElevationItem);
  EXPECT_NEAR(ground.bodies.front().top[1], 60.96, 0.001);
  EXPECT_FALSE(ground.unit);
  const int rate = BaseUnit(*FindItemType(kRainItem)).key;
  const Relief rain = make(rate, kRainItem);
  EXPECT_EQ(rain.bodies.front().top[1], 200);
  EXPECT_EQ(rain.unit, std::string(FindUnit(rate)->abbreviation));
}

TEST(ReliefContentTest, FineGridsAreSampled) {
  const GridGeometry raster = ReliefRaster({1201, 800, 10, 0, 0, 0, {}});
  EXPECT_EQ(raster.nx, 401);
  EXPECT_EQ(raster.ny, 267);
  EXPECT_EQ(raster.cellSize, 30);
}

TEST(ReliefContentTest, WithoutGroundTheValuesOfAGridAreHeights) {
  const auto made = [](SectionContent section, std::shared_ptr<const CTvn2DOrthoRotatedGridData> values) {
    const ReliefSource source = ReliefOf([section] { return section; }, std::move(values));
    ReliefContent content = source();
    EXPECT_EQ(content.awaited.size(), 1U);
    EXPECT_TRUE(content.awaited.front()->Run());
    content = source();
    EXPECT_TRUE(content.awaited.empty());
    return content;
  };
  const auto grid = GridOf(2, 1, {3, kUsualDeleteValue});
  const ReliefContent content = made({}, grid);
  ASSERT_TRUE(content.relief);
  EXPECT_EQ(content.relief->bodies.front().top[0], 3);
  EXPECT_TRUE(std::isnan(content.relief->bodies.front().top[1]));
  EXPECT_FALSE(made({}, nullptr).relief);
  EXPECT_EQ(made(TwoLayers(), grid).relief->bodies.size(), 4U);
}

}  // namespace
}  // namespace tervane
