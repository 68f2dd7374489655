// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/grid_polygons.h"

#include <algorithm>
#include <cmath>
#include <random>
#include <string>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/support/temp_folder.h"

namespace tervane::grid_polygons_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using Grid = CTvn2DOrthoRotatedGridData;

/// A rectangle as a ring behind what the shape has.
void AddRing(Shape& shape, double x0, double y0, double x1, double y1) {
  shape.parts.push_back(shape.points.size());
  for (const MapPoint p : {MapPoint{x0, y0}, {x0, y1}, {x1, y1}, {x1, y0}, {x0, y0}}) shape.points.push_back(p);
}

Shape Rectangle(double x0, double y0, double x1, double y1, ShapeValue value = {}) {
  Shape shape;
  AddRing(shape, x0, y0, x1, y1);
  shape.values = {std::move(value)};
  return shape;
}

/// The rows from the north: '.' for an empty cell.
std::string Picture(const std::vector<float>& values, const GridGeometry& geometry, float deleteValue) {
  std::string picture;
  for (int j = geometry.ny - 1; j >= 0; --j) {
    for (int i = 0; i < geometry.nx; ++i) {
      const float value = values[static_cast<std::size_t>(j * geometry.nx + i)];
      picture += value == deleteValue ? "." : std::to_string(static_cast<int>(value));
    }
    picture += '\n';
  }
  return picture;
}

/// Even-odd by the number of edges that a ray to the east crosses.
bool IsInside(const Shape& shape, MapPoint p) {
  bool isInside = false;
  for (std::size_t part = 0; part < shape.parts.size(); ++part) {
    const std::size_t begin = shape.parts[part], end = shape.PartEnd(part);
    for (std::size_t i = begin, before = end - 1; i < end; before = i++) {
      const MapPoint a = shape.points[before], b = shape.points[i];
      if ((a.y <= p.y) != (b.y <= p.y) && p.x < a.x + (p.y - a.y) / (b.y - a.y) * (b.x - a.x)) isInside = !isInside;
    }
  }
  return isInside;
}

TEST(Polygons, FillTheCellsWhoseCentreTheyHold) {
  std::mt19937 random(11);
  std::uniform_real_distribution<double> coordinate(-20, 80);
  for (const double rotation : {0.0, 33.0, 90.0, -120.0}) {
    const GridGeometry geometry{35, 25, 1.7, 10, 5, rotation, ""};
    const GridTransform transform(geometry);
    for (int round = 0; round < 20; ++round) {
      // Rings that cross themselves and each other and reach off the grid.
      Shape shape;
      for (int part = 0; part < 3; ++part) {
        shape.parts.push_back(shape.points.size());
        for (int i = 0; i < 3 + part; ++i) shape.points.push_back({coordinate(random), coordinate(random)});
      }
      std::vector<float> values(geometry.CellCount(), -1);
      PutPolygons({shape}, {1}, geometry, -1, values);
      for (int cell = 0; cell < 35 * 25; ++cell) {
        const MapPoint centre = transform.ToWorld({cell % 35 + 0.5, cell / 35 + 0.5});
        EXPECT_EQ(values[static_cast<std::size_t>(cell)] == 1, IsInside(shape, centre)) << cell;
      }
    }
  }
}

TEST(Polygons, ThatShareEdgesLeaveNoGapAndDoNotOverlap) {
  // Corners and edges lie just on centres.
  const GridGeometry geometry{8, 8, 1, 0, 0, 0, ""};
  std::vector<float> sum(64);
  for (const auto& [x, y] : {std::pair{0.5, 0.5}, {3.5, 0.5}, {0.5, 3.5}, {3.5, 3.5}}) {
    std::vector<float> values(64);
    PutPolygons({Rectangle(x, y, x + 3, y + 3)}, {1}, geometry, -1, values);
    for (std::size_t i = 0; i < 64; ++i) sum[i] += values[i];
  }
  EXPECT_EQ(Picture(sum, geometry, 0),
            "........\n........\n111111..\n111111..\n111111..\n111111..\n111111..\n111111..\n");
}

TEST(Polygons, MayCrossMoreRowsThanAreHeldAtOnce) {
  const GridGeometry geometry{3, 20000, 1, 0, 0, 0, ""};
  for (const int turns : {275, 276}) {
    // Once round is inside, twice round is outside again.
    Shape shape = Rectangle(1, 0, 2, 20000);
    const std::vector<MapPoint> ring = shape.points;
    for (int k = 1; k < turns; ++k) shape.points.insert(shape.points.end(), ring.begin(), ring.end());
    std::vector<float> values(geometry.CellCount());
    PutPolygons({shape}, {1}, geometry, -1, values);
    EXPECT_EQ(std::count(values.begin(), values.end(), 1.0f), turns % 2 * 20000);
    EXPECT_EQ(values[3 * 19999 + 1], static_cast<float>(turns % 2));
  }
}

TEST(Polygons, CountInTheOrderOfTheFileHoweverManyThereAre) {
  std::mt19937 random(12);
  std::uniform_real_distribution<double> coordinate(-20, 120);
  const GridGeometry geometry{100, 101, 1, 0, 0, 0, ""};
  std::vector<Shape> shapes;
  std::vector<float> codes, expected(geometry.CellCount(), -1);
  std::size_t spans = 0;
  PolygonRaster raster(geometry);
  for (int k = 0; k < 1500; ++k) {
    Shape& shape = shapes.emplace_back();
    shape.parts = {0};
    for (int i = 0; i < 7; ++i) shape.points.push_back({coordinate(random), coordinate(random)});
    codes.push_back(static_cast<float>(k % 7 == 0 ? -1 : k));
    if (codes.back() == -1) continue;
    for (const PolygonRaster::Span& span : raster.Spans(shape, 0, 1)) {
      const auto row = expected.begin() + span.j * 100;
      std::fill(row + span.begin, row + span.end, codes.back());
      ++spans;
    }
  }
  // More than are held before they are put into the cells.
  EXPECT_GT(spans, 150'000U);
  std::vector<float> values(geometry.CellCount(), -1);
  PutPolygons(shapes, codes, geometry, -1, values);
  EXPECT_EQ(values, expected);
}

TEST(Polygons, GiveADomainWithItsOuterBoundary) {
  const GridGeometry geometry{9, 8, 10, 0, 0, 0, ""};
  Shape withHole = Rectangle(10, 10, 70, 70);
  AddRing(withHole, 30, 30, 50, 50);
  Shape withIsland = withHole;
  AddRing(withIsland, 40, 40, 50, 50);
  Shape open = Rectangle(-100, -100, 500, 35);
  const struct {
    std::vector<Shape> shapes;
    const char* picture;
  } rows[] = {
      {{withHole}, ".........\n.222222..\n.211112..\n.21..12..\n.21..12..\n.211112..\n.222222..\n.........\n"},
      {{withIsland}, ".........\n.222222..\n.211112..\n.21.112..\n.21..12..\n.211112..\n.222222..\n.........\n"},
      // A neighbour in another polygon is not outside.
      {{Rectangle(0, 0, 40, 30), Rectangle(40, 0, 90, 30)},
       ".........\n.........\n.........\n.........\n.........\n222222222\n211111112\n222222222\n"},
      {{open}, ".........\n.........\n.........\n.........\n.........\n222222222\n211111112\n222222222\n"},
      {{Shape{}}, ".........\n.........\n.........\n.........\n.........\n.........\n.........\n.........\n"},
  };
  for (const auto& row : rows) {
    EXPECT_EQ(Picture(DomainOfPolygons(row.shapes, geometry), geometry, kUsualDeleteValue), row.picture);
  }
}

class PolygonFiles : public testing::Test {
 protected:
  std::string Save(AttributeKind kind, const std::vector<Shape>& shapes) {
    CTvnShapeData data;
    data.Create(ShapeKind::Polygon, {{"CODE", kind}}, "");
    for (const Shape& shape : shapes) data.AddShape(shape);
    EXPECT_EQ(data.SaveShapeFile(folder.File("zones.shp")).error, "");
    return folder.File("zones.shp");
  }
  test::TempFolder folder;
  const GridGeometry geometry{4, 2, 10, 0, 0, 0, "p"};
};

TEST_F(PolygonFiles, GiveCodesAndTheirTable) {
  const auto zones = [](ShapeValue a, ShapeValue b) {
    return std::vector<Shape>{Rectangle(0, 0, 10, 20, a), Rectangle(20, 0, 30, 20, b), Rectangle(10, 0, 20, 10, a),
                              Rectangle(30, 0, 40, 20)};
  };
  const struct {
    AttributeKind kind;
    ShapeValue a, b;
    const char* gapFill;
    const char* picture;
    std::vector<ZoneTable::Zone> zones;
  } rows[] = {
      {AttributeKind::Whole, std::int64_t{7}, std::int64_t{0}, "", "7.0.\n770.\n", {{7, "7"}, {0, "0"}}},
      {AttributeKind::Whole, std::int64_t{7}, std::int64_t{3}, "3", "7333\n7733\n", {{7, "7"}, {3, "3"}}},
      {AttributeKind::Real, 3.0, 0.5, "", "1.2.\n112.\n", {{1, "3.000000"}, {2, "0.500000"}}},
      {AttributeKind::Text, "loam", "clay", "loam", "1123\n1123\n", {{1, "loam"}, {2, "clay"}, {3, ""}}},
  };
  for (const auto& row : rows) {
    Grid grid;
    ZoneTable table;
    const std::string path = Save(row.kind, zones(row.a, row.b));
    const FileResult result = grid.CreateGridData_GIS_Polygon(geometry, -1, {path, "code", row.gapFill, 1000}, table);
    EXPECT_EQ(result.error, "");
    EXPECT_EQ(result.note.empty(), row.kind == AttributeKind::Text) << result.note;
    EXPECT_EQ(table.zones, row.zones);
    EXPECT_EQ(Picture(grid.Values(), geometry, -1), row.picture);
  }
}

TEST_F(PolygonFiles, AreRefusedWithTheCause) {
  const Shape square = Rectangle(0, 0, 10, 10, std::int64_t{7});
  const struct {
    std::vector<Shape> shapes;
    PolygonFile file;
    const char* error;
  } rows[] = {
      {{square}, {"", "", "", 1000}, "no attribute is selected"},
      {{square}, {"", "NAME", "", 1000}, "has no attribute NAME"},
      {{square}, {"", "CODE", "8", 1000}, "no polygon has the value \"8\""},
      {{square}, {"", "CODE", "", 99}, "no length"},
      {{square, Rectangle(0, 0, 1, 1, std::int64_t{1} << 25)}, {"", "CODE", "", 1000}, "shape 2: the code 33554432"},
      {{square, Rectangle(0, 0, 1, 1, std::int64_t{-1})}, {"", "CODE", "", 1000}, "shape 2: the code -1 is the delete"},
  };
  for (const auto& row : rows) {
    Grid grid;
    ZoneTable table;
    PolygonFile file = row.file;
    file.path = Save(AttributeKind::Whole, row.shapes);
    EXPECT_THAT(grid.CreateGridData_GIS_Polygon(geometry, -1, file, table).error, HasSubstr(row.error));
    EXPECT_TRUE(grid.Values().empty());
  }
}

TEST_F(PolygonFiles, MakeADomain) {
  const std::string path = Save(AttributeKind::Whole, {Rectangle(0.01, 0, 0.03, 0.02)});
  Grid grid;
  EXPECT_EQ(grid.MakeCatchmentGriddataFromShapefile(path, 1001, geometry).error, "");
  EXPECT_EQ(Picture(grid.Values(), geometry, kUsualDeleteValue), ".22.\n.22.\n");
  EXPECT_THAT(grid.MakeCatchmentGriddataFromShapefile(path, 1000, geometry).error,
              HasSubstr("check origin, cell size and unit"));
  EXPECT_THAT(grid.MakeCatchmentGriddataFromShapefile(path, 1000, {0, 1, 1, 0, 0, 0, ""}).error, HasSubstr("columns"));
  CTvnShapeData points;
  points.Create(ShapeKind::Point, {}, "");
  EXPECT_EQ(points.SaveShapeFile(path).error, "");
  EXPECT_THAT(grid.MakeCatchmentGriddataFromShapefile(path, 1000, geometry).error, HasSubstr("the file holds points"));
  EXPECT_THAT(grid.Values(),
              ElementsAre(kUsualDeleteValue, 2, 2, kUsualDeleteValue, kUsualDeleteValue, 2, 2, kUsualDeleteValue));
}

}  // namespace
}  // namespace tervane::grid_polygons_test
