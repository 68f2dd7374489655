// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "execution/processed_river.h"

#include <cmath>
#include <limits>

#include <gmock/gmock.h>

#include "platform/item_types.h"
#include "tests/support/preprocessed_run.h"
#include "tests/support/temp_folder.h"

namespace tervane::processed_river_test {
namespace {

using test::RiverBytes;
using testing::ElementsAre;
using testing::HasSubstr;

/// 4 x 3 cells with links, and two branches.
RiverBytes Small() {
  RiverBytes river;
  river.first = {0, 0, 0, 0, 1, 0, 0, 0, 1, 0, 0, 7};
  river.second = {0, 1, 1, 0, 0, 0, 0, 0, 0, 0, 0, -1};
  river.river = {{3, 0, 0}, {0, 10, 0}, {0, 20, 5}, {3, 50, 50}, {0, 60, 60}};
  return river;
}

std::vector<std::vector<MapPoint>> LinesOf(const CYbShapeData& data) {
  std::vector<std::vector<MapPoint>> lines;
  for (const Shape& shape : data.GetData()) lines.push_back(shape.points);
  return lines;
}

TEST(ProcessedRiver, AllIsReadAsItWasWritten) {
  const test::TempFolder folder;
  RiverBytes written = Small();
  written.version = 2;  // read like version 1
  written.projection = "PROJCS[\"somewhere\"]";
  written.x0 = 480000;
  written.rotation = 30;
  ProcessedRiver river;
  ASSERT_EQ(ReadProcessedRiver(folder.Write("river.bin", written.Bytes()), river).message, "");
  const GridGeometry expected{4, 3, 100, 480000, 0, 30, "PROJCS[\"somewhere\"]"};
  EXPECT_EQ(river.firstLinks->Geometry(), expected);
  EXPECT_EQ(river.secondLinks->Geometry(), expected);
  EXPECT_EQ(river.firstLinks->Value(3, 2), 7);
  EXPECT_EQ(river.secondLinks->Value(3, 2), -1);
  EXPECT_EQ(river.firstLinks->ItemType(), quantity::kCode);
  EXPECT_EQ(river.firstLinks->ItemUnit(), kWholeNumberUnit);
  EXPECT_THAT(river.flags, ElementsAre(3, 0, 0, 3, 0));
  EXPECT_THAT(river.x, ElementsAre(0, 10, 20, 50, 60));
  EXPECT_THAT(river.y, ElementsAre(0, 0, 5, 50, 60));
}

TEST(ProcessedRiver, AFileThatLiesIsRefusedWithItsNameAndTheReason) {
  const auto with = [](auto change) {
    RiverBytes river = Small();
    change(river);
    return river.Bytes();
  };
  const std::string good = Small().Bytes();
  const double nan = std::numeric_limits<double>::quiet_NaN();
  const struct {
    std::string bytes;
    const char* message;
  } cases[] = {
      {"", "Could not load binary preprocessed River file: \n"},
      {good.substr(0, 19), "it has 19 bytes"},
      {good.substr(0, 60), "cut off"},
      {good.substr(0, good.size() - 1), "cut off"},
      {good + "x", "longer than that"},
      {with([](RiverBytes& r) { r.version = 0; }),
       "Error: Wrong version number found in binary preprocessed River file: \n"},
      {with([](RiverBytes& r) { r.version = -7; }), "It is -7"},
      {with([](RiverBytes& r) { r.nx = 5; }), "NX 5, NY 3"},
      {with([](RiverBytes& r) { r.ny = 1; }), "longer than that"},
      {with([](RiverBytes& r) { r.nx = -4, r.ny = -3; }), "NX is -4"},
      {with([](RiverBytes& r) { r.nx = r.ny = 0x7fffffff; }), "2147483647 by 2147483647 cells"},
      {with([](RiverBytes& r) { r.points = 0x7fffffff; }), "2147483647 points"},
      {with([](RiverBytes& r) { r.projectionLength = 0x7fffffff; }), "a projection of 2147483647 bytes"},
      {with([](RiverBytes& r) { r.projectionLength = -2; }), "projection is -2"},
      {with([](RiverBytes& r) { r.cellSize = 0; }), "the cell size is 0"},
      {with([=](RiverBytes& r) { r.rotation = nan; }), "the rotation is nan"},
      {with([=](RiverBytes& r) { r.river[1].y = nan; }), "point 2 (at byte"},
  };
  const test::TempFolder folder;
  for (const auto& c : cases) {
    SCOPED_TRACE(c.message);
    ProcessedRiver river;
    const std::string path = folder.Write("river.bin", c.bytes);
    const std::string message = ReadProcessedRiver(path, river).message;
    EXPECT_THAT(message, HasSubstr(c.message));
    EXPECT_THAT(message, HasSubstr("preprocessed River file: \n" + path));
    EXPECT_FALSE(river.firstLinks);
  }
  ProcessedRiver river;
  EXPECT_THAT(ReadProcessedRiver(folder.File("nowhere.bin"), river).message, HasSubstr("nowhere.bin"));
  EXPECT_THAT(ReadProcessedRiver(folder.Path(), river).message, HasSubstr("Could not load"));
}

TEST(ProcessedRiver, LinksLieAtTheFarEdgesOfTheirCells) {
  const test::TempFolder folder;
  ProcessedRiver river;
  ASSERT_TRUE(ReadProcessedRiver(folder.Write("river.bin", Small().Bytes()), river).Ok());
  const CProcDataRiverLinkOverlay links(*river.firstLinks, *river.secondLinks);
  EXPECT_THAT(LinesOf(*links.Lines()), ElementsAre(ElementsAre(MapPoint{100, 100}, MapPoint{100, 300}),
                                                   ElementsAre(MapPoint{400, 200}, MapPoint{400, 300}),
                                                   ElementsAre(MapPoint{100, 100}, MapPoint{300, 100}),
                                                   ElementsAre(MapPoint{300, 300}, MapPoint{400, 300})));
  RiverBytes turned = Small();
  turned.rotation = 90;
  turned.x0 = 1000;
  ASSERT_TRUE(ReadProcessedRiver(folder.Write("river.bin", turned.Bytes()), river).Ok());
  const CProcDataRiverLinkOverlay turnedLinks(*river.firstLinks, *river.secondLinks);
  EXPECT_THAT(LinesOf(*turnedLinks.Lines()).front(), ElementsAre(MapPoint{900, 100}, MapPoint{700, 100}));
}

TEST(ProcessedRiver, BranchesBeginAtFlagThree) {
  const auto lines = [](const std::vector<int>& flags) {
    std::vector<double> x, y;
    for (std::size_t i = 0; i < flags.size(); ++i) {
      x.push_back(static_cast<double>(i));
      y.push_back(0);
    }
    std::vector<std::size_t> lengths;
    for (const auto& line : LinesOf(*CProcDataRiverPointOverlay(flags, x, y).Lines())) lengths.push_back(line.size());
    return lengths;
  };
  EXPECT_THAT(lines({}), ElementsAre());
  EXPECT_THAT(lines({3}), ElementsAre());
  EXPECT_THAT(lines({3, 3}), ElementsAre());
  EXPECT_THAT(lines({0, 1}), ElementsAre(2));
  EXPECT_THAT(lines({3, 0, 0, 3, 2, 3, 0}), ElementsAre(3, 2, 2));
}

}  // namespace
}  // namespace tervane::processed_river_test
