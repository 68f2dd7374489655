// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/projection_copy.h"

#include <cmath>

#include <gmock/gmock.h>

#include "data/datafile.h"
#include "data/datafile_writer.h"
#include "geometry/cart.h"
#include "geometry/shapes.h"
#include "platform/item_types.h"
#include "tests/support/data_files.h"
#include "tests/support/temp_folder.h"

namespace tervane::projection_copy_test {
namespace {

using testing::HasSubstr;

const char* const kZone32 = "EPSG:32632";
const char* const kZone33 = "EPSG:32633";
/// Half way between two zones, where the grids of both are turned against each other by some degrees.
const GridGeometry kModel{20, 15, 500, 730'000, 5'200'000, 0, kZone32};

/// A cell's value, by its place in zone 32.
float ValueAt(double x, double y) { return static_cast<float>((x - 700'000) / 100 + (y - 5'200'000) / 1000); }

/// Grids around the model in zone 33: layers of the second item are 100 above each other, steps 1000.
void WriteForeignGrids(const std::string& path, double y0, int layers, int steps) {
  const CYbProjectionChange change(kZone33, kZone32);
  double x = 735'000, y = 5'203'750;
  ASSERT_TRUE(change.Back(x, y));
  NewDataFile content;
  content.dimensions = layers > 1 ? 3 : 2;
  content.geometry = FileGeometryOf({160, 160, 250, x - 20'000, y - 20'000 + y0, 0, kZone33});
  content.geometry.nz = layers;
  content.items = {{"Level", quantity::kElevation, 1000, ValueType::Instantaneous},
                   {"Zone", quantity::kCode, kWholeNumberUnit, ValueType::Instantaneous}};
  DataFileWriter writer;
  test::Require(writer.Create(path, content));
  for (int step = 0; step < steps; ++step) {
    test::Require(writer.AddStep(CYbDateTime(2000, 1, 1 + step)));
    for (int item = 1; item <= 2; ++item) {
      std::vector<float> values;
      for (int layer = 0; layer < layers; ++layer)
        for (int j = 0; j < 160; ++j)
          for (int i = 0; i < 160; ++i) {
            double cellX = content.geometry.x0 + 250 * (i + 0.5), cellY = content.geometry.y0 + 250 * (j + 0.5);
            ASSERT_TRUE(change.Forward(cellX, cellY));
            values.push_back(item == 1 ? ValueAt(cellX, cellY) + static_cast<float>(100 * layer + 1000 * step)
                                       : static_cast<float>(cellX < 735'000 ? 3 : 8));
          }
      test::Require(writer.Put(item, values));
    }
  }
  test::Require(writer.Finish().error);
}

TEST(ProjectionCopy, GridsStandOnTheModelsCellsWithAllItemsStepsAndLayers) {
  const test::TempFolder folder;
  WriteForeignGrids(folder.File("a.nds3"), 0, 2, 2);
  test::Require(CopyGridsOnto(kModel, folder.File("a.nds3"), folder.File("b.nds3")).error);
  DataFile copy;
  test::Require(copy.Open(folder.File("b.nds3")));
  ASSERT_EQ(copy.Items().size(), 2U);
  EXPECT_EQ(copy.Items()[0].name, "Level");
  EXPECT_EQ(copy.Items()[1].itemType, quantity::kCode);
  const FileGeometry& geometry = copy.Items()[0].geometry;
  EXPECT_EQ(std::tie(geometry.nx, geometry.ny, geometry.nz), std::tuple(20, 15, 2));
  EXPECT_TRUE(CYbMapProjection(geometry.projection).IsSameAs(CYbMapProjection(kZone32)));
  ASSERT_EQ(copy.Time().steps, 2U);
  EXPECT_EQ(copy.Time().End(), CYbDateTime(2000, 1, 2));
  std::vector<float> values(600);
  for (int step = 0; step < 2; ++step) {
    test::Require(copy.Read({.item = 1, .step = static_cast<std::size_t>(step), .layer = {}}, values));
    for (int layer = 0; layer < 2; ++layer)
      for (int j = 0; j < 15; ++j)
        for (int i = 0; i < 20; ++i) {
          const float wanted = ValueAt(kModel.x0 + 500 * (i + 0.5), kModel.y0 + 500 * (j + 0.5)) +
                               static_cast<float>(100 * layer + 1000 * step);
          // Averages of cells of 250 m that are turned against the model's.
          EXPECT_NEAR(values[static_cast<std::size_t>((layer * 15 + j) * 20 + i)], wanted, 1.5) << i << ' ' << j;
        }
  }
  test::Require(copy.Read({.item = 2, .layer = 0}, std::span(values).first(300)));
  for (std::size_t cell = 0; cell < 300; ++cell) EXPECT_TRUE(values[cell] == 3 || values[cell] == 8);
}

TEST(ProjectionCopy, WhatCannotBeCopiedIsToldAndLeavesNoFile) {
  const test::TempFolder folder;
  WriteForeignGrids(folder.File("far.nds2"), 500'000, 1, 1);
  GridGeometry plane = kModel;
  plane.projection = CYbMapProjection::IDtoProjectionString(1);
  const struct {
    GridGeometry grid;
    std::string file, reason;
  } rows[] = {{kModel, "far.nds2", "no value within the model grid"},
              {plane, "far.nds2", "far.nds2"},
              {kModel, "gone.nds2", "gone.nds2"}};
  for (const auto& row : rows) {
    EXPECT_THAT(CopyGridsOnto(row.grid, folder.File(row.file), folder.File("out.nds2")).error, HasSubstr(row.reason));
    EXPECT_FALSE(FileExists(folder.File("out.nds2")));
  }
  Progress cancelled;
  cancelled.Cancel();
  EXPECT_FALSE(CopyGridsOnto(kModel, folder.File("far.nds2"), folder.File("out.nds2"), cancelled).Ok());
  EXPECT_FALSE(FileExists(folder.File("out.nds2")));
}

TEST(ProjectionCopy, ShapesKeepTheirAttributesAndComeBack) {
  const test::TempFolder folder;
  CTvnShapeData shapes;
  shapes.Create(ShapeKind::Polygon, {{"CODE", AttributeKind::Whole}, {"NAME", AttributeKind::Text}}, kZone32);
  const double x = 730'000, y = 5'200'000;
  shapes.AddShape({{{x, y}, {x, y + 1000}, {x + 1000, y + 1000}, {x + 1000, y}, {x, y}},
                   {},
                   {},
                   {0},
                   {std::int64_t{7}, std::string("Müller")}});
  test::Require(shapes.SaveShapeFile(folder.File("a.shp")).error);
  // A thousandth of the file's unit is a meter.
  constexpr int kKilometer = 1003;
  test::Require(CopyShapesInto(kZone33, kKilometer, folder.File("a.shp"), folder.File("b.shp")).error);
  CYbShapeData other;
  other.SetAxisLengthUnit(kKilometer);
  test::Require(other.ReadShapeAndDbfFile(folder.File("b.shp"), "").error);
  ASSERT_EQ(other.GetData().size(), 1U);
  EXPECT_EQ(other.GetData()[0].values, shapes.GetData()[0].values);
  EXPECT_TRUE(CYbMapProjection(other.Projection()).IsSameAs(CYbMapProjection(kZone33)));
  const CYbProjectionChange change(kZone33, kZone32);
  for (std::size_t point = 0; point < 5; ++point) {
    MapPoint back = other.GetData()[0].points[point];
    EXPECT_GT(std::abs(back.x - shapes.GetData()[0].points[point].x), 1000);
    ASSERT_TRUE(change.Forward(back.x, back.y));
    EXPECT_NEAR(back.x, shapes.GetData()[0].points[point].x, 1e-3);
    EXPECT_NEAR(back.y, shapes.GetData()[0].points[point].y, 1e-3);
  }
}

}  // namespace
}  // namespace tervane::projection_copy_test
