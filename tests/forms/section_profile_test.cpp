// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "forms/section_profile.h"

#include <gmock/gmock.h>

namespace tervane::section_profile_test {
namespace {

using testing::DoubleNear;
using testing::ElementsAre;
using testing::IsNan;

constexpr float kEmpty = -99;
constexpr int kMetre = 1000, kFoot = 1003;

std::shared_ptr<const CTvn2DOrthoRotatedGridData> Row(std::vector<float> values, int unit = kMetre) {
  auto grid = std::make_shared<CTvn2DOrthoRotatedGridData>();
  const GridGeometry place{static_cast<int>(values.size()), 1, 10, 0, 0, 0, {}};
  EXPECT_EQ(grid->TakeValues(place, std::move(values), kEmpty, unit, 100180), "");
  return grid;
}

/// Along the centres of all cells.
SectionContent Along(std::shared_ptr<const CTvn2DOrthoRotatedGridData> ground, std::vector<SectionSurface> surfaces) {
  SectionContent content;
  content.line = {{5, 5}, {ground->Geometry().nx * 10.0 - 5, 5}};
  content.ground = Level{std::move(ground)};
  content.surfaces = std::move(surfaces);
  return content;
}

TEST(SectionProfile, EachBandReachesFromTheNearestSurfaceAboveToItsBottom) {
  const SectionContent content =
      Along(Row({10, 12, 11}), {{"Clay", {Row({4, 15, kEmpty})}}, {"Sand", {Row({-5, 0, 3})}}});
  const SectionProfile profile = ProfileOf(content, 10);
  ASSERT_EQ(profile.points.size(), 3U);
  EXPECT_THAT(profile.ground, ElementsAre(10, 12, 11));
  // A bottom above its top leaves no thickness; where there is none, the next layer begins at the ground.
  EXPECT_THAT(profile.bands[0].bottom, ElementsAre(4, 12, IsNan()));
  EXPECT_THAT(profile.bands[1].top, ElementsAre(4, 12, 11));
  EXPECT_THAT(profile.bands[1].bottom, ElementsAre(-5, 0, 3));
  EXPECT_EQ(profile.Range(0, 20), std::pair(-5.0, 12.0));
  EXPECT_EQ(profile.Range(9, 30), std::pair(0.0, 12.0));
  EXPECT_EQ(profile.Range(30, 40), std::nullopt);
}

TEST(SectionProfile, ElevationsOfAnyUnitAreComparedInMetres) {
  const SectionProfile profile = ProfileOf(Along(Row({10, 10}), {{"Clay", {Row({20, 20}, kFoot)}}}), 100);
  EXPECT_THAT(profile.bands[0].bottom, ElementsAre(DoubleNear(6.096, 1e-9), DoubleNear(6.096, 1e-9)));
}

TEST(SectionProfile, WithoutALineOrGroundThereIsNothing) {
  SectionContent content = Along(Row({10, 12}), {{"Clay", {Row({4, 5})}}});
  content.message = "Draw a section on the map.";
  EXPECT_EQ(Summary(content), "section of 10 m: ground, Clay");
  EXPECT_GT(StepFor(content), 0);
  content.line.clear();
  EXPECT_TRUE(ProfileOf(content, 1).points.empty());
  EXPECT_EQ(Summary(content), "Draw a section on the map.");
  EXPECT_GT(StepFor(content), 0);
}

}  // namespace
}  // namespace tervane::section_profile_test
