// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/grid_interpolation.h"

#include <cmath>
#include <limits>
#include <random>
#include <thread>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "geometry/shapes.h"
#include "tests/support/temp_folder.h"

namespace tervane {
namespace {

using testing::Each;
using testing::ElementsAre;
using testing::HasSubstr;
using enum InterpolationMethod;

constexpr float kEmpty = -99;
const GridGeometry kGrid{40, 30, 2.5, 1000, -500, 25, ""};

std::vector<ScatteredPoint> RandomPoints(int count) {
  std::mt19937 random(3);
  const Envelope area = EnvelopeOf(kGrid);
  std::uniform_real_distribution<double> x(area.xMin, area.xMax), y(area.yMin, area.yMax), z(100, 200);
  std::vector<ScatteredPoint> points;
  for (int i = 0; i < count; ++i) points.push_back({x(random), y(random), z(random)});
  return points;
}

InterpolationOptions Options(InterpolationMethod method, double radius, int threads = 1) {
  InterpolationOptions options;
  options.method = method;
  options.searchRadius = radius;
  options.threads = threads;
  return options;
}

std::vector<float> Interpolated(const std::vector<ScatteredPoint>& points, const GridGeometry& geometry,
                                const InterpolationOptions& options) {
  std::vector<float> values;
  EXPECT_EQ(Interpolate(points, geometry, kEmpty, options, values).error, "");
  return values;
}

TEST(Interpolation, WeighsWithInverseDistances) {
  const std::vector<ScatteredPoint> points = RandomPoints(60);
  const GridTransform transform(kGrid);
  for (const auto& [method, power] : {std::pair{InverseDistance, 1}, {InverseDistanceSquared, 2}}) {
    const std::vector<float> values = Interpolated(points, kGrid, Options(method, 12));
    int empty = 0;
    for (int cell = 0; cell < 40 * 30; ++cell) {
      const MapPoint centre = transform.ToWorld({cell % 40 + 0.5, cell / 40 + 0.5});
      double weights = 0, sum = 0;
      for (const ScatteredPoint& point : points) {
        const double distance = std::hypot(point.x - centre.x, point.y - centre.y);
        if (distance > 12) continue;
        weights += std::pow(distance, -power);
        sum += std::pow(distance, -power) * point.z;
      }
      empty += weights == 0;
      EXPECT_NEAR(values[static_cast<std::size_t>(cell)], weights > 0 ? sum / weights : kEmpty, 1e-4) << cell;
    }
    EXPECT_GT(empty, 10);
  }
}

TEST(Interpolation, FollowsItsDefinitionInSmallCases) {
  const GridGeometry three{3, 1, 10, 0, 0, 0, ""};
  const struct {
    const char* name;
    std::vector<ScatteredPoint> points;
    InterpolationMethod method;
    double radius;
    std::vector<float> values;
  } rows[] = {
      {"a point at a centre gives its value", {{5, 5, 7}, {15, 6, 9}}, InverseDistance, 5, {7, 9, kEmpty}},
      {"the same, with the bilinear method", {{5, 5, 7}, {15, 6, 9}}, Bilinear, 5, {7, 9, kEmpty}},
      {"the radius itself counts", {{5, 5, 7}}, InverseDistance, 10, {7, 7, kEmpty}},
      {"also for quadrants", {{5, 5, 7}}, Bilinear, 10, {7, 7, kEmpty}},
      {"coincident points are one with their mean",
       {{10, 5, 2}, {10, 5, 4}, {20, 5, 9}},
       InverseDistance,
       5,
       {3, 6, 9}},
      {"power 1", {{5, 5, 0}, {20, 5, 3}}, InverseDistance, 11, {0, 2, 3}},
      {"power 2", {{5, 5, 0}, {20, 5, 5}}, InverseDistanceSquared, 11, {0, 4, 5}},
      {"an empty quadrant: inverse distance of one point in each",
       {{5, 5, 0}, {20, 5, 3}, {24, 5, 99}},
       Bilinear,
       11,
       {0, 2, 99}},
      {"four quadrants: a twisted surface",
       {{0, 0, 0}, {20, 0, 2}, {0, 20, 4}, {20, 20, 10}, {40, 10, 99}},
       Bilinear,
       25,
       {1.75f, 3.25f, -1}},
      {"a triangle, and empty outside of it", {{0, 0, 0}, {20, 0, 20}, {0, 20, 0}}, Triangular, 1, {5, 15, kEmpty}},
      {"far away", {{1e9, 1e9, 7}}, InverseDistanceSquared, 10, {kEmpty, kEmpty, kEmpty}},
  };
  for (const auto& row : rows) {
    const std::vector<float> values = Interpolated(row.points, three, Options(row.method, row.radius));
    for (std::size_t i = 0; i < 3; ++i) {
      if (row.values[i] == -1) continue;
      EXPECT_NEAR(values[i], row.values[i], 1e-5) << row.name << ", cell " << i;
    }
  }
}

TEST(Interpolation, GivesBackPlanes) {
  const auto plane = [](double x, double y) { return 3 + 0.25 * x - 0.5 * y; };
  const GridTransform transform(kGrid);
  std::vector<ScatteredPoint> scattered = RandomPoints(400), atCentres, onGrid;
  for (int cell = 0; cell < 40 * 30; ++cell) {
    const MapPoint centre = transform.ToWorld({cell % 40 + 0.5, cell / 40 + 0.5});
    atCentres.push_back({centre.x, centre.y, 0});
    const MapPoint wide = transform.ToWorld({cell % 40 * 1.7 - 2, cell / 40 * 1.7 - 2});
    onGrid.push_back({wide.x, wide.y, 0});
  }
  for (const auto& [points, method] : {std::pair{&scattered, Triangular},
                                       {&atCentres, Triangular},
                                       {&onGrid, Triangular},
                                       {&onGrid, Bilinear},
                                       {&atCentres, Bilinear},
                                       {&atCentres, InverseDistance}}) {
    for (ScatteredPoint& point : *points) point.z = plane(point.x, point.y);
    const std::vector<float> values = Interpolated(*points, kGrid, Options(method, method == InverseDistance ? 1 : 10));
    int empty = 0;
    for (int cell = 0; cell < 40 * 30; ++cell) {
      const float value = values[static_cast<std::size_t>(cell)];
      const MapPoint centre = transform.ToWorld({cell % 40 + 0.5, cell / 40 + 0.5});
      const bool isEmpty = value == kEmpty;
      empty += isEmpty;
      EXPECT_TRUE(isEmpty || std::abs(value - plane(centre.x, centre.y)) < 1e-3) << cell << ": " << value;
    }
    EXPECT_LE(empty, points == &scattered ? 60 : 0);
  }
}

TEST(Interpolation, IsTheSameWithThreadsAndCanBeCancelled) {
  const std::vector<ScatteredPoint> points = RandomPoints(200);
  for (const InterpolationMethod method : {Bilinear, Triangular, InverseDistance, InverseDistanceSquared}) {
    InterpolationOptions options = Options(method, 20, 3);
    Progress progress;
    options.progress = progress;
    EXPECT_EQ(Interpolated(points, kGrid, options), Interpolated(points, kGrid, Options(method, 20)));
    EXPECT_EQ(progress.Done(), 1);
    progress.Cancel();
    std::vector<float> values;
    EXPECT_EQ(Interpolate(points, kGrid, kEmpty, options, values).error, kCancelled);
    EXPECT_TRUE(values.empty());
  }
}

TEST(Interpolation, EndsSoonAfterItIsCancelledAndItsProgressNeverFalls) {
  // Every point reaches every cell: a single row would take longer than anybody wants to wait.
  const std::vector<ScatteredPoint> points = RandomPoints(150'000);
  const GridGeometry large{4000, 3000, 0.025, 1000, -500, 25, ""};
  for (const InterpolationMethod method : {Bilinear, Triangular, InverseDistance}) {
    SCOPED_TRACE(static_cast<int>(method));
    InterpolationOptions options = Options(method, 100, 2);
    Progress progress;
    options.progress = progress;
    std::vector<float> values;
    std::string error;
    std::thread work([&] { error = Interpolate(points, large, kEmpty, options, values).error; });
    double before = 0;
    for (int i = 0; i < 200; ++i) {
      const double done = progress.Done();
      EXPECT_GE(done, before);
      before = done;
      std::this_thread::sleep_for(std::chrono::microseconds(500));
    }
    progress.Cancel();
    const auto cancelled = std::chrono::steady_clock::now();
    work.join();
    // A generous limit for a busy machine; undisturbed it is a few milliseconds.
    EXPECT_LT(std::chrono::steady_clock::now() - cancelled, std::chrono::milliseconds(500));
    EXPECT_EQ(error, kCancelled);
    EXPECT_TRUE(values.empty());
  }
}

TEST(Interpolation, TellsWhyNot) {
  constexpr double kNan = std::numeric_limits<double>::quiet_NaN();
  const struct {
    std::vector<ScatteredPoint> points;
    GridGeometry geometry;
    InterpolationOptions options;
    const char* error;
  } rows[] = {
      {{}, kGrid, Options(InverseDistance, 5), "no points"},
      {{{1, 2, 3}}, kGrid, Options(InverseDistance, 0), "search radius is 0"},
      {{{1, 2, 3}}, kGrid, Options(Bilinear, kNan), "search radius is nan"},
      {{{1, 2, 3}}, kGrid, Options(static_cast<InterpolationMethod>(4), 5), "no interpolation method 4"},
      {{{1, 2, 3}}, {0, 1, 1, 0, 0, 0, ""}, Options(InverseDistance, 5), "columns and rows"},
      {{{1, 2, 1e300}}, kGrid, Options(InverseDistance, 5), "has the value 1e+300"},
      {{{kNan, 2, 1}}, kGrid, Options(InverseDistance, 5), "the point (nan, 2)"},
  };
  for (const auto& row : rows) {
    std::vector<float> values{1};
    EXPECT_THAT(Interpolate(row.points, row.geometry, kEmpty, row.options, values).error, HasSubstr(row.error));
    EXPECT_TRUE(values.empty());
  }
  std::vector<float> values;
  const auto line = Interpolate({{0, 0, 1}, {10, 10, 2}, {20, 20, 3}}, kGrid, kEmpty, Options(Triangular, 1), values);
  EXPECT_THAT(line.note, HasSubstr("one line"));
  EXPECT_THAT(values, Each(kEmpty));
}

TEST(Interpolation, ReadsPointsOfFilesInTheirUnits) {
  const test::TempFolder folder;
  CTvnShapeData lines;
  lines.Create(ShapeKind::Line, {{"LEVEL", AttributeKind::Whole}, {"NAME", AttributeKind::Text}}, "");
  lines.AddShape({{{0, 0}, {10, 0}}, {}, {}, {0}, {std::int64_t{5}, "a"}});
  lines.AddShape({{{20, 0}, {30, 0}}, {}, {}, {0}, {std::monostate(), "b"}});
  EXPECT_EQ(lines.SaveShapeFile(folder.File("lines.shp")).error, "");
  folder.Write("points.txt", "x y z\n0 0 5\n10 0 5\n");
  CTvnShapeData().SaveShapeFile(folder.File("zones.shp"));
  const struct {
    const char* file;
    const char* attribute;
    int axisUnit, itemUnit, itemType;
    const char* error;
    const char* note;
    double factor;
  } rows[] = {
      {"lines.shp", "LEVEL", 1000, 1000, 100180, "", "1 shapes without a value", 1},
      {"lines.shp", "LEVEL", 1001, 1006, 100180, "", "1 shapes", 1000},
      {"points.txt", "Not used", 1001, 1006, 100180, "", "", 1000},
      {"points.txt", "Not used", 1000, 0, 999, "", "", 1},
      {"lines.shp", "NAME", 1000, 1000, 100180, "lines.shp: attribute NAME is text", "", 0},
      {"lines.shp", "", 1000, 1000, 100180, "no shape has both", "", 0},
      {"lines.shp", "LEVEL", 1000, 1400, 100180, "the unit 1400", "", 0},
      {"lines.shp", "LEVEL", 1400, 1000, 100180, "no length", "", 0},
      {"zones.shp", "ID", 1000, 1000, 100180, "the file holds polygons", "", 0},
  };
  for (const auto& row : rows) {
    const std::string path = folder.File(row.file);
    const bool isXyz = path.ends_with(".txt");
    std::vector<ScatteredPoint> points;
    const FileResult result =
        ReadScatteredFile({path, isXyz, row.attribute, row.axisUnit, row.itemUnit, row.itemType}, points);
    EXPECT_THAT(result.error, HasSubstr(row.error));
    EXPECT_THAT(result.note, HasSubstr(row.note));
    if (row.error[0] != '\0') continue;
    const double level = row.itemUnit == 1006 ? 0.05 : 5;
    EXPECT_THAT(points, ElementsAre(ScatteredPoint{0, 0, level}, ScatteredPoint{10 * row.factor, 0, level}));
  }
  CTvn2DOrthoRotatedGridData grid;
  EXPECT_EQ(
      grid.CreateGridData_GIS({2, 1, 10, 0, -5, 0, "p"}, kEmpty,
                              {folder.File("points.txt"), true, "", 1000, 1006, 100180}, Options(InverseDistance, 5))
          .error,
      "");
  EXPECT_THAT(grid.Values(), Each(0.05f));
  EXPECT_EQ(grid.ItemUnit(), 1000);
}

}  // namespace
}  // namespace tervane
