// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/river_places.h"

#include <gmock/gmock.h>

namespace tervane::river_places_test {
namespace {

using testing::DoubleEq;
using testing::ElementsAre;

/// A river that flows east and turns north, whose chainages begin at 1000, and a ditch beside it.
CYbSimpleRiverData Network() {
  CYbSimpleRiverData network = CYbSimpleRiverData::Empty({});
  RiverBranch river{.name = "River"}, ditch{.name = "Ditch"};
  river.points = {{1, {0, 0}, 1000}, {2, {100, 0}, 1100}, {3, {100, 50}, 1200}};
  ditch.points = {{4, {0, 20}, 0}, {5, {80, 20}, 80}};
  network.TakeBranches({river, ditch});
  return network;
}

TEST(RiverPlaces, ThePlaceNearestToAPointHasItsChainage) {
  const CYbSimpleRiverData network = Network();
  const struct {
    MapPoint point;
    const char *branch, *found;
    double chainage, distance;
  } cases[] = {
      {{30, 5}, "", "River", 1030, 5},   {{30, 16}, "", "Ditch", 30, 4},     {{30, 16}, "River", "River", 1030, 16},
      {{-30, 0}, "", "River", 1000, 30}, {{110, 25}, "", "River", 1150, 10},
  };
  for (const auto& c : cases) {
    const RiverPlace place = NearestPlace(network, c.point, c.branch);
    ASSERT_TRUE(place.branch);
    EXPECT_EQ(place.branch->name, c.found);
    EXPECT_THAT(place.chainage, DoubleEq(c.chainage));
    EXPECT_THAT(place.distance, DoubleEq(c.distance));
  }
  EXPECT_FALSE(NearestPlace(network, {0, 0}, "Canal").branch);
}

TEST(RiverPlaces, ACourseGoesAsFarAsItsBranch) {
  const CYbSimpleRiverData network = Network();
  const auto course = [&](double from, double to) {
    std::string text;
    for (const MapPoint& point : CourseBetween(network.branches[0], from, to))
      text += std::to_string(static_cast<int>(point.x)) + "," + std::to_string(static_cast<int>(point.y)) + " ";
    return text;
  };
  EXPECT_EQ(course(1050, 1150), "50,0 100,0 100,25 ");
  EXPECT_EQ(course(1150, 1050), "100,25 100,0 50,0 ");
  EXPECT_EQ(course(0, 1020), "0,0 20,0 ");
  EXPECT_EQ(course(1100, 9999), "100,0 100,0 100,50 ");
  EXPECT_EQ(course(2000, 3000), "");
}

}  // namespace
}  // namespace tervane::river_places_test
