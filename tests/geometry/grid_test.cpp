// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/grid.h"

#include <cmath>
#include <limits>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "platform/item_types.h"
#include "tests/support/temp_folder.h"

namespace tervane::grid_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using Grid = CTvn2DOrthoRotatedGridData;

Grid GridOf(GridGeometry geometry, std::vector<float> values) {
  Grid grid;
  EXPECT_EQ(grid.TakeValues(std::move(geometry), std::move(values), -1, 0, quantity::kCode), "");
  return grid;
}

TEST(Grid, RefusesGeometryBeforeMemoryIsAsked) {
  constexpr double kNan = std::numeric_limits<double>::quiet_NaN();
  const struct {
    GridGeometry geometry;
    const char* problem;
  } rows[] = {
      {{0, 5, 1, 0, 0, 0, ""}, "0 by 5"},          {{5, -1, 1, 0, 0, 0, ""}, "5 by -1"},
      {{20001, 20000, 1, 0, 0, 0, ""}, "million"}, {{2147483647, 2147483647, 1, 0, 0, 0, ""}, "million"},
      {{5, 5, 0, 0, 0, 0, ""}, "cell size"},       {{5, 5, -2, 0, 0, 0, ""}, "cell size"},
      {{5, 5, kNan, 0, 0, 0, ""}, "cell size"},    {{5, 5, 1, kNan, 0, 0, ""}, "origin"},
      {{5, 5, 1, 0, 0, kNan, ""}, "rotation"},     {{5, 5, 1e308, 0, 0, 0, ""}, "larger than numbers"},
  };
  Grid grid = GridOf({1, 1, 1, 0, 0, 0, ""}, {7});
  for (const auto& row : rows) {
    EXPECT_THAT(grid.SetGridData(row.geometry, 1, -1, 0, 0), HasSubstr(row.problem));
    EXPECT_THAT(grid.Values(), ElementsAre(7));
  }
  EXPECT_THAT(grid.TakeValues({2, 2, 1, 0, 0, 0, ""}, {1, 2, 3}, -1, 0, 0), HasSubstr("3 values"));
}

TEST(Grid, TurnsPointsIntoCellsAndBack) {
  for (const double rotation : {0.0, 30.0, 90.0, 180.0, 270.0, -90.0, 359.5, 725.0}) {
    const Grid grid = GridOf({3, 2, 10, 500, -70, rotation, ""}, {1, 2, 3, 4, 5, 6});
    const MapPoint centre = grid.CellCentre(2, 1);
    const double angle = rotation * std::acos(-1) / 180;
    EXPECT_NEAR(centre.x, 500 + 25 * std::cos(angle) - 15 * std::sin(angle), 1e-9) << rotation;
    EXPECT_NEAR(centre.y, -70 + 25 * std::sin(angle) + 15 * std::cos(angle), 1e-9) << rotation;
    double i = 0, j = 0;
    grid.GetCellCoordFromXYWorldCoord(centre.x, centre.y, i, j);
    EXPECT_NEAR(i, 2.5, 1e-12);
    EXPECT_NEAR(j, 1.5, 1e-12);
  }
  EXPECT_EQ(GridOf({3, 2, 10, 500, -70, 90, ""}, std::vector<float>(6)).GetEnvelope(), (Envelope{480, -70, 500, -40}));
  EXPECT_EQ(GridOf({3, 2, 10, 500, -70, -180, ""}, std::vector<float>(6)).GetEnvelope(),
            (Envelope{470, -90, 500, -70}));
}

TEST(Grid, FindsDistinctCodesAndRangeOfCellsThatAreNotEmpty) {
  const float nan = std::numeric_limits<float>::quiet_NaN();
  Grid grid = GridOf({5, 2, 1, 0, 0, 0, ""}, {3, -1, 70000, 3, 0, 2.6f, nan, -7, 70000, 1e20f});
  std::vector<unsigned> codes{99};
  EXPECT_TRUE(grid.GetIntValues(codes));
  EXPECT_THAT(codes, ElementsAre(0, 3, 70000));
  int largest = 0, smallest = 0;
  EXPECT_TRUE(grid.GetMaxMin(largest, smallest));
  EXPECT_EQ(largest, std::numeric_limits<int>::max());
  EXPECT_EQ(smallest, -7);

  grid.SetDeleteValue(3);
  EXPECT_THAT(grid.Values(), ElementsAre(3, 3, 70000, 3, 0, 2.6f, 3, -7, 70000, 1e20f));
  Grid empty = GridOf({2, 1, 1, 0, 0, 0, ""}, {-1, -1});
  EXPECT_FALSE(empty.GetIntValues(codes));
  EXPECT_FALSE(empty.GetMaxMin(largest, smallest));
}

// ---- Text

constexpr float kEmpty = -99;

FileResult ReadText(Grid& grid, std::string_view text) {
  const test::TempFolder folder;
  return grid.ReadTextFile(folder.Write("grid.txt", text), {9, 9, 25, 100, 200, 0, "EPSG:32632"}, kEmpty, 1000, 100180);
}

TEST(GridText, ReadsRowsFromTheNorth) {
  const struct {
    std::string_view text;
    GridGeometry geometry;
    const char* note;
  } rows[] = {
      {"1 2 3\n4 5 6\n", {3, 2, 25, 100, 200, 0, "EPSG:32632"}, ""},
      {"1,2;3\r\n\r\n4\t5 6", {3, 2, 25, 100, 200, 0, "EPSG:32632"}, ""},
      {"NCOLS 3\nnrows 2\nxllcorner 100\nyllcorner 200\nCellSize 25\nNODATA_value -9999\n1 2\n3 4 5 6\n",
       {3, 2, 25, 100, 200, 0, "EPSG:32632"},
       ""},
      {"ncols 3\nnrows 2\nxllcenter 50\nyllcenter 75\ncellsize 10\n1 2 3 4 5 6\n",
       {3, 2, 10, 45, 70, 0, "EPSG:32632"},
       "the cell size is 10, as the file says; x0 is 45"},
  };
  for (const auto& row : rows) {
    Grid grid;
    const FileResult result = ReadText(grid, row.text);
    EXPECT_EQ(result.error, "");
    EXPECT_THAT(result.note, HasSubstr(row.note));
    EXPECT_EQ(result.note.empty(), row.note[0] == '\0') << result.note;
    EXPECT_EQ(grid.Geometry(), row.geometry);
    EXPECT_THAT(grid.Values(), ElementsAre(4, 5, 6, 1, 2, 3));
  }
  Grid grid;
  EXPECT_EQ(ReadText(grid, "nodata_value -9999\n-9999 2").error, "");
  EXPECT_THAT(grid.Values(), ElementsAre(kEmpty, 2));
}

TEST(GridText, TellsWhatIsWrongAndWhere) {
  const struct {
    std::string_view text;
    const char* error;
  } rows[] = {
      {"", "no rows"},
      {"ncols 2\nnrows 2\n", "no rows"},
      {"ncols 2\n1 2\n", "both be given"},
      {"ncols 2\nnrows x\n", "line 2: nrows is \"x\""},
      {"ncols 2.5\nnrows 2\n1", "2.5 by 2"},
      {"ncols 20000\nnrows 20000\n1 2 3", "cannot hold"},
      {"ncols 1e300\nnrows 1\n1", "cells"},
      {"ncols 2\nnrows 2\n1 2 3\n", "ends after 3 values"},
      {"ncols 2\nnrows 1\n1 2\n3\n", "line 4: there are more values"},
      {"ncols 1\nnrows 1\ncellsize -5\n1\n", "cell size"},
      {"1 2\n3\n", "line 2: the row has 1 numbers"},
      {"1 2\n3 abc\n", "line 2: \"abc\" is no number"},
      {"1 nan\n", "\"nan\" is no number"},
      {"1 1e300\n", "more than a grid can hold"},
      {"\xFF\xFE\x31", "UTF-16"},
      {std::string_view("1 \0 2", 5), "no text"},
  };
  for (const auto& row : rows) {
    Grid grid = GridOf({1, 1, 1, 0, 0, 0, ""}, {7});
    const std::string error = ReadText(grid, row.text).error;
    EXPECT_THAT(error, HasSubstr(row.error));
    EXPECT_THAT(error, HasSubstr("grid.txt"));
    EXPECT_THAT(grid.Values(), ElementsAre(7));
  }
}

}  // namespace
}  // namespace tervane::grid_test
