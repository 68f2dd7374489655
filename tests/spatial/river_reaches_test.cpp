// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/river_reaches.h"

#include <gmock/gmock.h>

namespace tervane::river_reaches_test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

RiverBranch Branch(const std::string& name, const std::vector<MapPoint>& places, int direction = 0) {
  RiverBranch branch{.name = name, .points = {}, .direction = direction};
  double chainage = 0;
  for (std::size_t i = 0; i < places.size(); ++i) {
    if (i > 0) chainage += std::hypot(places[i].x - places[i - 1].x, places[i].y - places[i - 1].y);
    branch.points.push_back({static_cast<int>(i), places[i], chainage});
  }
  return branch;
}

/// Four columns of cells of 100 m with the codes 1, 2, none and 2, three rows high.
ZoneCells Cells(std::optional<float> code, double rotation = 0) {
  ZoneCells cells;
  GridGeometry geometry{
      .nx = 4, .ny = 3, .cellSize = 100, .x0 = 1000, .y0 = 2000, .rotation = rotation, .projection = {}};
  std::vector<float> values;
  for (int j = 0; j < 3; ++j)
    for (const float value : {1.0F, 2.0F, kUsualDeleteValue, 2.0F}) values.push_back(value);
  EXPECT_EQ(cells.grid.TakeValues(geometry, values, kUsualDeleteValue, 0, quantity::kCode), "");
  cells.code = code;
  return cells;
}

TEST(RiverReaches, AreThePiecesOfABranchInTheCellsOfAZone) {
  CYbSimpleRiverData network;
  // Comes from the west and leaves to the east, then one the other way round.
  network.branches = {Branch("A", {{900, 2150}, {1150, 2150}, {1500, 2150}}),
                      Branch("B", {{900, 2250}, {1500, 2250}}, RiverBranch::kToLowerChainages),
                      Branch("C", {{0, 0}, {10, 10}}), Branch("D", {})};
  const RiverReach first{"A", 200, 300}, second{"A", 400, 500};
  EXPECT_THAT(ReachesWithin(network, Cells(2)),
              ElementsAre(first, second, RiverReach{"B", 300, 200}, RiverReach{"B", 500, 400}));
  EXPECT_THAT(ReachesWithin(network, Cells(1)), ElementsAre(RiverReach{"A", 100, 200}, RiverReach{"B", 200, 100}));
  EXPECT_THAT(ReachesWithin(network, Cells({})),
              ElementsAre(RiverReach{"A", 100, 300}, second, RiverReach{"B", 300, 100}, RiverReach{"B", 500, 400}));
  EXPECT_THAT(ReachesWithin(network, Cells(7)), IsEmpty());
}

TEST(RiverReaches, AlongABorderTheyAreNotCut) {
  CYbSimpleRiverData network;
  // Swings over the border between the codes 1 and 2.
  network.branches = {
      Branch("A", {{1100, 2000}, {1090, 2050}, {1110, 2100}, {1090, 2150}, {1110, 2200}, {1090, 2300}})};
  for (const float code : {1.0F, 2.0F}) EXPECT_EQ(ReachesWithin(network, Cells(code)).size(), 1U) << code;
}

TEST(RiverReaches, OfATurnedGridFollowItsCells) {
  CYbSimpleRiverData network;
  // A quarter turn: the columns lie above each other, to the west of the corner.
  network.branches = {Branch("A", {{850, 1950}, {850, 2500}})};
  EXPECT_THAT(ReachesWithin(network, Cells(1, 90)), ElementsAre(RiverReach{"A", 50, 150}));
}

}  // namespace
}  // namespace tervane::river_reaches_test
