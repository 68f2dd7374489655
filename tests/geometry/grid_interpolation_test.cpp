// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/grid_interpolation.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <limits>
#include <random>
#include <thread>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "geometry/shapes.h"
#include "tests/support/temp_folder.h"

namespace tervane::grid_interpolation_test {
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
  const GridTransform transform(kGrid);
  const struct {
    const char* name;
    int points;
    double factor, offset;
    bool leavesEmpty;
  } rows[] = {
      {"few points", 60, 1, 0, true},
      {"thousands within reach of a row", 9000, 1, 0, false},
      {"small differences of large values", 60, 1e-3, 1e4, true},
      {"values whose squares no float holds", 60, 1e30, 0, true},
  };
  for (const auto& row : rows) {
    std::vector<ScatteredPoint> points = RandomPoints(row.points);
    for (ScatteredPoint& point : points) point.z = point.z * row.factor + row.offset;
    for (const auto& [method, power] : {std::pair{InverseDistance, 1}, {InverseDistanceSquared, 2}}) {
      const std::vector<float> values = Interpolated(points, kGrid, Options(method, 12));
      int empty = 0, different = 0;
      for (int cell = 0; cell < 40 * 30; ++cell) {
        const MapPoint centre = transform.ToWorld({cell % 40 + 0.5, cell / 40 + 0.5});
        double weights = 0, sum = 0;
        for (const ScatteredPoint& point : points) {
          const double distance2 =
              (point.x - centre.x) * (point.x - centre.x) + (point.y - centre.y) * (point.y - centre.y);
          if (distance2 > 12 * 12) continue;
          const double weight = 1 / (power == 1 ? std::sqrt(distance2) : distance2);
          weights += weight;
          sum += weight * point.z;
        }
        empty += weights == 0;
        const double expected = weights > 0 ? sum / weights : kEmpty, found = values[static_cast<std::size_t>(cell)];
        different += !(std::abs(found - expected) <= 1e-6 * std::abs(expected));
      }
      EXPECT_EQ(different, 0) << row.name << ", power " << power;
      EXPECT_EQ(empty > 10, row.leavesEmpty) << row.name;
    }
  }
}

/// The value at (0, 0) of a + b x + c y + d x y through four points, by elimination; not a number when there is none.
double SurfaceThrough(std::array<ScatteredPoint, 4> points) {
  std::array<std::array<double, 5>, 4> rows;
  for (std::size_t k = 0; k < 4; ++k) rows[k] = {points[k].x * points[k].y, points[k].y, points[k].x, 1, points[k].z};
  for (std::size_t k = 0; k < 3; ++k) {
    std::swap(rows[k],
              *std::max_element(rows.begin() + static_cast<std::ptrdiff_t>(k), rows.end(),
                                [k](const auto& a, const auto& b) { return std::abs(a[k]) < std::abs(b[k]); }));
    for (std::size_t other = k + 1; other < 4; ++other) {
      const double factor = rows[other][k] / rows[k][k];
      for (std::size_t i = k; i < 5; ++i) rows[other][i] -= factor * rows[k][i];
    }
  }
  return rows[3][4] / rows[3][3];
}

/// The bilinear method, straight from its definition.
double BilinearAt(const std::vector<ScatteredPoint>& points, double x, double y, double radius) {
  struct Found {
    double distance = std::numeric_limits<double>::infinity();
    ScatteredPoint point;
  };
  std::array<Found, 4> found;
  for (const ScatteredPoint& each : points) {
    const ScatteredPoint point{each.x - x, each.y - y, each.z};
    const double distance = std::hypot(point.x, point.y);
    if (distance == 0) return point.z;
    const std::size_t quadrant = point.x > 0 && point.y >= 0   ? 0
                                 : point.x <= 0 && point.y > 0 ? 1
                                 : point.x < 0                 ? 2
                                                               : 3;
    if (distance <= radius && distance < found[quadrant].distance) found[quadrant] = {distance, point};
  }
  double weights = 0, sum = 0;
  for (const Found& each : found) {
    weights += 1 / each.distance;
    sum += each.point.z / each.distance;
  }
  // A surface stays between the values when all weights are above 0: then it does whatever the values are.
  bool isSurface =
      std::all_of(found.begin(), found.end(), [](const Found& each) { return std::isfinite(each.distance); });
  for (std::size_t k = 0; k < 4 && isSurface; ++k) {
    std::array<ScatteredPoint, 4> corners;
    for (std::size_t i = 0; i < 4; ++i) corners[i] = {found[i].point.x, found[i].point.y, i == k ? 1.0 : 0.0};
    isSurface = SurfaceThrough(corners) > -1e-10;
  }
  if (!isSurface) return weights > 0 ? sum / weights : static_cast<double>(kEmpty);
  return SurfaceThrough({found[0].point, found[1].point, found[2].point, found[3].point});
}

TEST(Interpolation, FindsTheNearestPointOfEachQuadrant) {
  const GridGeometry grid{37, 29, 1, 0, 0, 0, ""};
  std::mt19937 random(5);
  const auto scattered = [&random](int count, double from, double to, bool isRound) {
    std::uniform_real_distribution<double> place(from, to), z(100, 200);
    std::vector<ScatteredPoint> points;
    for (int i = 0; i < count; ++i) {
      const double x = place(random), y = place(random);
      points.push_back(isRound ? ScatteredPoint{std::round(2 * x) / 2, y, z(random)} : ScatteredPoint{x, y, z(random)});
    }
    return points;
  };
  const struct {
    const char* name;
    std::vector<ScatteredPoint> points;
    double radius;
  } rows[] = {
      {"fewer points than cells", scattered(40, -3, 40, false), 9},
      {"many points in each cell", scattered(5000, 0, 37, false), 6},
      {"a radius far beyond the grid", scattered(60, -100, 100, false), 1e9},
      {"points on the axes of the centres", scattered(200, -3, 40, true), 5},
      {"all points off the grid", scattered(60, -30, -1, false), 50},
      {"a radius below a cell", scattered(3000, 0, 37, false), 0.3},
  };
  for (const auto& row : rows) {
    const std::vector<float> values = Interpolated(row.points, grid, Options(Bilinear, row.radius, 2));
    std::size_t cell = 0;
    int empty = 0, different = 0;
    for (int j = 0; j < grid.ny; ++j) {
      for (int i = 0; i < grid.nx; ++i, ++cell) {
        const double expected = BilinearAt(row.points, i + 0.5, j + 0.5, row.radius);
        empty += expected == static_cast<double>(kEmpty);
        different += !(std::abs(static_cast<double>(values[cell]) - expected) < 1e-3);
      }
    }
    EXPECT_EQ(different, 0) << row.name;
    EXPECT_LT(empty, 37 * 29) << row.name;
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
}  // namespace tervane::grid_interpolation_test
