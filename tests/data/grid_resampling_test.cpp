// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/grid_resampling.h"

#include <cmath>
#include <optional>

#include <gmock/gmock.h>

#include "data/datafile.h"

namespace tervane::grid_resampling_test {
namespace {

using testing::ElementsAre;

/// A raster of cells of 10 by 10 around (1000, 2000), turned, whose values are those of a plane over the map.
class Resampled : public testing::Test {
 protected:
  static constexpr int kColumns = 60, kRows = 50;

  static double Plane(double x, double y) { return 5 + 0.5 * (x - 1000) - 0.25 * (y - 2000); }

  ResamplingTask Task(const GridGeometry& grid, double rotation = 0) {
    raster_ = {kColumns, kRows, 10, 1000, 2000, rotation, {}};
    ResamplingTask task;
    task.raster.nx = kColumns;
    task.raster.ny = kRows;
    task.raster.cellSize = task.raster.cellHeight = 10;
    task.raster.x0 = 1000;
    task.raster.y0 = 2000;
    task.raster.rotation = rotation;
    task.read = [this](const CellWindow& window, std::span<float> values) {
      EXPECT_GE(window.i, 0);
      EXPECT_GE(window.j, 0);
      EXPECT_LE(window.i + window.nx, kColumns);
      EXPECT_LE(window.j + window.ny, kRows);
      largestWindow_ = std::max(largestWindow_, window.CellCount());
      std::size_t next = 0;
      for (int j = window.j; j < window.j + window.ny; ++j) {
        for (int i = window.i; i < window.i + window.nx; ++i) {
          const MapPoint centre = GridTransform(raster_).ToWorld({i + 0.5, j + 0.5});
          const bool isHole = i == hole_ && j == hole_;
          values[next++] = isHole ? kDeleteValue : static_cast<float>(Plane(centre.x, centre.y));
        }
      }
      return std::string();
    };
    task.grid = grid;
    return task;
  }

  GridGeometry raster_;
  int hole_ = -1;
  std::size_t largestWindow_ = 0;
};

TEST_F(Resampled, TheMethodFollowsTheCells) {
  struct Row {
    GridGeometry grid;
    double rotation;
    bool areCodes;
    Resampling expected;
  };
  const Row rows[] = {
      {{5, 5, 10, 1020, 2030, 0, {}}, 0, false, Resampling::CellForCell},
      {{5, 5, 10, 990, 2030, 0, {}}, 0, true, Resampling::CellForCell},
      {{5, 5, 10, 1025, 2030, 0, {}}, 0, false, Resampling::Bilinear},
      {{5, 5, 10, 1020, 2030, 15, {}}, 0, false, Resampling::Bilinear},
      {{5, 5, 10, 1000, 2000, 15, {}}, 15, false, Resampling::CellForCell},
      {{5, 5, 19, 1020, 2030, 0, {}}, 0, false, Resampling::Bilinear},
      {{5, 5, 20, 1020, 2030, 45, {}}, 0, false, Resampling::Average},
      {{5, 5, 50, 1020, 2030, 0, {}}, 0, false, Resampling::Average},
      {{5, 5, 50, 1020, 2030, 0, {}}, 0, true, Resampling::Nearest},
      {{5, 5, 2, 1020, 2030, 0, {}}, 0, false, Resampling::Bilinear},
  };
  for (const Row& row : rows) {
    EXPECT_EQ(SuitableResampling(Task(row.grid, row.rotation), row.areCodes), row.expected)
        << row.grid.cellSize << " from " << row.grid.x0 << ", turned by " << row.grid.rotation;
  }
}

TEST_F(Resampled, APlaneStaysAPlane) {
  struct Row {
    GridGeometry grid;
    double rotation;
    Resampling method;
    double tolerance;
  };
  const Row rows[] = {
      {{5, 5, 10, 1020, 2030, 0, {}}, 0, Resampling::CellForCell, 0},
      {{40, 30, 7, 1100, 2060, 25, {}}, 0, Resampling::Bilinear, 1e-4},
      {{40, 30, 7, 900, 2333, -20, {}}, 40, Resampling::Bilinear, 1e-4},
      {{10, 8, 30, 1100, 2060, 0, {}}, 0, Resampling::Average, 1e-4},
      // Not every cell has its share of the raster's cells on all sides.
      {{6, 5, 50, 1200, 2060, 30, {}}, 0, Resampling::Average, 3},
      {{40, 30, 7, 1100, 2060, 25, {}}, 0, Resampling::Nearest, 0.75 * 5 + 1e-3},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(testing::Message() << ResamplingText(row.method) << ", turned by " << row.grid.rotation);
    const ResamplingTask task = Task(row.grid, row.rotation);
    std::vector<float> values;
    ASSERT_EQ(Resample(task, row.method, values), "");
    const GridTransform transform(row.grid);
    std::size_t next = 0;
    for (int j = 0; j < row.grid.ny; ++j) {
      for (int i = 0; i < row.grid.nx; ++i) {
        const MapPoint centre = transform.ToWorld({i + 0.5, j + 0.5});
        ASSERT_NEAR(static_cast<double>(values[next++]), Plane(centre.x, centre.y), row.tolerance) << i << ", " << j;
      }
    }
  }
}

TEST_F(Resampled, CellsWithoutAValueAreEmpty) {
  hole_ = 5;
  std::vector<float> values;
  // Three cells: beside the raster, in it, and in it over the hole.
  ASSERT_EQ(Resample(Task({3, 1, 10, 992, 2052, 0, {}}), Resampling::Bilinear, values), "");
  EXPECT_EQ(values[0], kDeleteValue);
  EXPECT_NE(values[1], kDeleteValue);
  ASSERT_EQ(Resample(Task({3, 1, 10, 1042, 2052, 0, {}}), Resampling::Bilinear, values), "");
  EXPECT_EQ(values[1], kDeleteValue);
  // Neighbours of the hole stay between the values around them.
  EXPECT_NEAR(static_cast<double>(values[0]), Plane(1047, 2057), 3);
  ASSERT_EQ(Resample(Task({2, 1, 20, 1040, 2040, 0, {}}), Resampling::Average, values), "");
  EXPECT_NEAR(static_cast<double>(values[0]), (Plane(1045, 2045) + Plane(1055, 2045) + Plane(1045, 2055)) / 3, 1e-4);
  ASSERT_EQ(Resample(Task({2, 2, 10, 9000, 9000, 0, {}}), Resampling::Average, values), "");
  EXPECT_THAT(values, ElementsAre(kDeleteValue, kDeleteValue, kDeleteValue, kDeleteValue));
  // No more is read than lies there.
  largestWindow_ = 0;
  ASSERT_EQ(Resample(Task({2, 2, 10, 1105, 2105, 0, {}}), Resampling::Nearest, values), "");
  EXPECT_LE(largestWindow_, 36u);
}

TEST_F(Resampled, PlacesGoThroughTheProjections) {
  // A raster in degrees whose values are longitude + 100 latitude, on a grid in meters.
  ResamplingTask task;
  task.raster.nx = 400;
  task.raster.ny = 300;
  task.raster.cellSize = task.raster.cellHeight = 0.01;
  task.raster.x0 = 6;
  task.raster.y0 = 45;
  const auto value = [](double longitude, double latitude) { return longitude + 100 * latitude; };
  task.read = [&](const CellWindow& window, std::span<float> values) {
    std::size_t next = 0;
    for (int j = window.j; j < window.j + window.ny; ++j)
      for (int i = window.i; i < window.i + window.nx; ++i)
        values[next++] = static_cast<float>(value(6 + 0.01 * (i + 0.5), 45 + 0.01 * (j + 0.5)));
    return std::string();
  };
  const CYbProjectionChange change("EPSG:4326", "EPSG:32632");
  ASSERT_EQ(change.Problem(), "");
  task.change = &change;
  const CYbCartography toDegrees("EPSG:32632", 0, 0, 0);
  for (const auto& [cellSize, method] :
       {std::pair{500.0, Resampling::Bilinear}, std::pair{5000.0, Resampling::Average}}) {
    task.grid = {20, 15, cellSize, 360000, 5060000, 12, "EPSG:32632"};
    EXPECT_EQ(SuitableResampling(task, false), method);
    std::vector<float> values;
    ASSERT_EQ(Resample(task, method, values), "");
    std::size_t next = 0;
    for (int j = 0; j < task.grid.ny; ++j) {
      for (int i = 0; i < task.grid.nx; ++i) {
        const MapPoint centre = GridTransform(task.grid).ToWorld({i + 0.5, j + 0.5});
        double longitude = 0, latitude = 0;
        ASSERT_TRUE(toDegrees.Proj2Geo(centre.x, centre.y, longitude, latitude));
        // A hundredth of a degree is 1 in the value.
        ASSERT_NEAR(static_cast<double>(values[next++]), value(longitude, latitude), cellSize > 1000 ? 0.3 : 2e-3);
      }
    }
  }
  EXPECT_NE(CYbProjectionChange("EPSG:4326", "").Problem(), "");
  EXPECT_NE(CYbProjectionChange("nonsense", "EPSG:4326").Problem(), "");
}

}  // namespace
}  // namespace tervane::grid_resampling_test
