// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/file_geometry.h"

#include <gmock/gmock.h>

namespace tervane::file_geometry_test {
namespace {

using testing::HasSubstr;

TEST(FileGeometry, ATransformBringsThePlaceBackToTheLastDigit) {
  struct Row {
    double cellSize, x0, y0, rotation;
  };
  constexpr Row kRows[] = {{50, 500000.25, 6000000.75, 0},
                           {1.0 / 3, -10, 20, 0},
                           {25, 1, 2, 30},
                           {0.1, 3, 4, -12.5},
                           {100, 0, 0, 90},
                           {7.5, 5, 6, 180},
                           {50, 1, 1, -90},
                           {1000, 1e6, 5e6, 0.001}};
  for (const Row& row : kRows) {
    FileGeometry geometry;
    geometry.nx = 3;
    geometry.ny = 4;
    geometry.cellSize = geometry.cellHeight = row.cellSize;
    geometry.x0 = row.x0;
    geometry.y0 = row.y0;
    geometry.rotation = row.rotation;
    const auto transform = ParseGeoTransform(GeoTransformText(geometry));
    ASSERT_TRUE(transform);
    FileGeometry read;
    read.nx = 3;
    read.ny = 4;
    bool isNorthFirst = true;
    ASSERT_TRUE(PlaceByGeoTransform(*transform, read, isNorthFirst));
    EXPECT_FALSE(isNorthFirst);
    EXPECT_EQ(read, geometry) << GeoTransformText(geometry);
  }
}

TEST(FileGeometry, ATransformFromTheNorthIsTurnedAndABadOneRefused) {
  FileGeometry geometry;
  geometry.nx = 10;
  geometry.ny = 20;
  bool isNorthFirst = false;
  ASSERT_TRUE(PlaceByGeoTransform({100, 5, 0, 1000, 0, -5}, geometry, isNorthFirst));
  EXPECT_TRUE(isNorthFirst);
  EXPECT_EQ(geometry.y0, 900);
  EXPECT_EQ(geometry.cellHeight, 5);
  const FileGeometry before = geometry;
  EXPECT_FALSE(PlaceByGeoTransform({0, 5, 1, 0, 0, 5}, geometry, isNorthFirst)) << "sheared";
  EXPECT_FALSE(PlaceByGeoTransform({0, 0, 0, 0, 0, 0}, geometry, isNorthFirst)) << "empty";
  EXPECT_EQ(geometry, before);
  for (const char* text : {"", "1 2 3 4 5", "1 2 3 4 5 6 7", "1 2 3 4 5 x", "1 2 3 4 5 inf"})
    EXPECT_FALSE(ParseGeoTransform(text)) << text;
}

TEST(FileGeometry, SpacingIsFoundOrTheFirstUnevenValueNamed) {
  struct Row {
    std::vector<double> values;
    bool areSinglePrecision;
    double spacing;
    const char* error;
  };
  const Row rows[] = {
      {{1, 2, 3}, false, 1, ""},
      {{30, 20, 10}, false, -10, ""},
      {{5}, false, 0, ""},
      {{0, 1, 2.5, 3}, false, 1, "number 3 is 2.5, 2 was expected"},
      {{0, 1, 0, 1}, false, 0, "number 2 is 1"},
      {{1, 1, 1}, false, 0, "number 2 is 1"},
      {{0, std::numeric_limits<double>::quiet_NaN(), 2}, false, 0, "number 2 of its values is missing"},
      {{static_cast<double>(359.97f), static_cast<double>(359.98f), static_cast<double>(359.99f)}, true, 0.01, ""},
      {{6e6, 6e6 + 1, 6e6 + 2.4, 6e6 + 3}, false, 1, "number 3"},
  };
  for (const Row& row : rows) {
    const EvenAxis axis = FindSpacing(row.values, row.areSinglePrecision);
    EXPECT_THAT(axis.error, HasSubstr(row.error));
    EXPECT_EQ(axis.error.empty(), *row.error == '\0') << axis.error;
    if (axis.error.empty()) {
      EXPECT_NEAR(axis.spacing, row.spacing, 1e-4);
    }
  }
}

TEST(FileGeometry, BecomesTheGridOfAModelWhereItsCellsAreSquares) {
  const auto geometry = [](double cellSize, double cellHeight) {
    FileGeometry file;
    file.nx = 4;
    file.ny = 3;
    file.cellSize = cellSize;
    file.cellHeight = cellHeight;
    file.x0 = 1000;
    file.rotation = 90;
    return file;
  };
  const struct {
    FileGeometry file;
    double cellSize;
    const char* reason;
  } cases[] = {
      {geometry(50, 50), 50, ""},
      {geometry(50, 50.01), 50, ""},  // But for what rounding loses.
      {geometry(50, 25), 0, "cells of 50 x 25, square ones were expected"},
      {geometry(0, 0), 1, ""},  // Without a place.
  };
  for (const auto& c : cases) {
    GridGeometry grid;
    EXPECT_EQ(ToModelGrid(c.file, grid), c.reason);
    if (*c.reason == '\0') {
      EXPECT_EQ(grid, (GridGeometry{4, 3, c.cellSize, 1000, 0, 90, {}}));
    }
  }
  // Its extent is known all the same.
  EXPECT_EQ(EnvelopeOf(geometry(50, 25)), (Envelope{925, 0, 1000, 200}));
}

}  // namespace
}  // namespace tervane::file_geometry_test
