// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "libraries/river_import.h"

#include <gmock/gmock.h>

namespace tervane::river_import_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::UnorderedElementsAre;

class RiverImportTest : public testing::Test {
 public:
  CTvnShapeData shapes;
  RiverImportOptions options;

  RiverImportTest() { Create({}); }
  void Create(const std::string& projection, ShapeKind kind = ShapeKind::Line) {
    shapes.Create(kind, {{"Name", AttributeKind::Text}, {"RIVER", AttributeKind::Text}}, projection);
  }
  void Add(const std::string& name, std::vector<MapPoint> points, std::vector<std::size_t> parts = {0}) {
    Shape shape;
    shape.points = std::move(points);
    if (!shape.points.empty()) shape.parts = std::move(parts);
    shape.values = {name.empty() ? ShapeValue() : ShapeValue(name), ShapeValue("of " + name)};
    shapes.AddShape(std::move(shape));
  }
  RiverImport Import() const { return BranchesOfLines(shapes, options); }
  /// "A > B 100" for each joined end.
  static std::vector<std::string> Joints(const RiverImport& import) {
    std::vector<std::string> joints;
    for (const RiverBranch& branch : import.branches) {
      if (!branch.upstream.IsNone())
        joints.push_back(branch.name + " < " + branch.upstream.branch + " " +
                         std::to_string(std::lround(branch.upstream.chainage)));
      if (!branch.downstream.IsNone())
        joints.push_back(branch.name + " > " + branch.downstream.branch + " " +
                         std::to_string(std::lround(branch.downstream.chainage)));
    }
    return joints;
  }
};

TEST_F(RiverImportTest, ChainagesCountFromTheBeginAlongTheLine) {
  Add("A", {{0, 0}, {300, 400}, {300, 400}, {300, 1000}});
  const RiverImport import = Import();
  ASSERT_EQ(import.branches.size(), 1u);
  std::vector<double> chainages;
  for (const RiverPoint& point : import.branches[0].points) chainages.push_back(point.chainage);
  // A point that is there twice is one place.
  EXPECT_THAT(chainages, ElementsAre(0, 500, 1100));
  EXPECT_THAT(import.warnings, IsEmpty());
}

TEST_F(RiverImportTest, EndsThatMeetAreJoined) {
  Add("Upper", {{0, 2000}, {0, 1000}});
  Add("Side", {{500, 1500}, {0.6, 1000.5}});  // ends where the upper one ends
  Add("Lower", {{0, 1000.3}, {0, 0}});        // goes on from there
  Add("Brook", {{700, 400}, {0.9, 400}});     // into the middle of the lower one
  Add("Canal", {{0.5, 600}, {-700, 600}});    // out of its middle
  Add("Far", {{5000, 5000}, {5000, 6000}});
  const RiverImport import = Import();
  EXPECT_THAT(Joints(import), UnorderedElementsAre("Upper > Lower 0", "Side > Lower 0", "Lower < Upper 1000",
                                                   "Brook > Lower 600", "Canal < Lower 400"));
  EXPECT_EQ(import.junctions, 5u);
  EXPECT_THAT(import.warnings, IsEmpty());
}

TEST_F(RiverImportTest, WithAGroundTheyFlowDownhill) {
  CTvn2DOrthoRotatedGridData ground;
  GridGeometry geometry{.nx = 10, .ny = 10, .cellSize = 100, .x0 = 0, .y0 = 0, .projection = {}};
  std::vector<float> heights;
  for (int j = 0; j < 10; ++j)
    for (int i = 0; i < 10; ++i) heights.push_back(static_cast<float>(10 * j));
  ASSERT_EQ(ground.TakeValues(geometry, heights, kUsualDeleteValue, 1000, quantity::kElevation), "");
  options.ground = &ground;
  Add("Down", {{500, 900}, {500, 500}});
  Add("Up", {{300, 100}, {500, 500}});
  Add("Level", {{100, 300}, {400, 300}});
  Add("Out", {{200, 200}, {200, -900}});
  const RiverImport import = Import();
  EXPECT_EQ(import.branches[1].points.front().place, (MapPoint{500, 500}));
  EXPECT_EQ(import.branches[1].points.front().chainage, 0);
  EXPECT_EQ(import.turned, 1u);
  EXPECT_THAT(Joints(import), testing::Contains("Down > Up 0"));
  EXPECT_THAT(import.warnings, testing::IsSupersetOf({HasSubstr("the ends of Level lie at one height"),
                                                      HasSubstr("Out leaves the ground grid")}));
}

TEST_F(RiverImportTest, WhatIsOddIsToldAndNothingIsHidden) {
  Add("", {});
  Add("Dot", {{1, 1}, {1, 1}});
  Add("Two", {{0, 0}, {0, 500}, {900, 0}, {900, 500}}, {0, 2});
  Add("Sliver", {{3000, 0}, {3000, 60}});
  Add("Ring", {{5000, 0}, {5000, 500}, {5500, 500}, {5000, 0.5}});
  Add("Ring", {{7000, 0}, {7000, 500}});
  Add("Gap", {{7000, 506.25}, {7000, 900}});
  Add("Not", {{0, 0}, {std::numeric_limits<double>::quiet_NaN(), 9}});
  const RiverImport import = Import();
  std::vector<std::string> names;
  for (const RiverBranch& branch : import.branches) names.push_back(branch.name);
  EXPECT_THAT(names, ElementsAre("Two (1)", "Two (2)", "Sliver", "Ring", "Ring 2", "Gap"));
  EXPECT_THAT(
      import.warnings,
      ElementsAre("shape 1 has no points and is left out", "shape 2 (Dot) is a single place and is left out",
                  "shape 3 (Two) has 2 parts: each is a branch", "Sliver (shape 4) is only 60.0 m long, at 3000.0, 0.0",
                  "Ring (shape 5) ends where it begins, at 5000.0, 0.0",
                  "shape 8 (Not) has a coordinate that is no number and is left out",
                  "1 line has the name of another one: a number stands behind it",
                  "Ring 2 nearly meets Gap: 6.25 m are between them, at 7000.0, 500.0"));
}

TEST_F(RiverImportTest, NamesComeFromTheAttributeThatIsAskedFor) {
  Add("A", {{0, 0}, {0, 500}});
  Add("", {{900, 0}, {900, 500}});
  EXPECT_EQ(Import().branches[0].name, "A");
  EXPECT_EQ(Import().branches[1].name, "Branch 2");
  options.nameAttribute = "river";
  EXPECT_EQ(Import().branches[0].name, "of A");
  options.nameAttribute = "stream";
  EXPECT_EQ(Import().error, "there is no attribute stream: the file has Name, RIVER");
}

TEST_F(RiverImportTest, WhatIsNoLineInMetresIsRefused) {
  EXPECT_THAT(Import().error, HasSubstr("there are no lines"));
  Create(
      "GEOGCS[\"WGS 84\",DATUM[\"WGS_1984\",SPHEROID[\"WGS 84\",6378137,298.257223563]],PRIMEM[\"Greenwich\",0],"
      "UNIT[\"degree\",0.0174532925199433]]");
  Add("A", {{7, 46}, {8, 46}});
  EXPECT_THAT(Import().error, HasSubstr("the lines are in degrees"));
  Create({}, ShapeKind::Polygon);
  EXPECT_THAT(Import().error, HasSubstr("the file holds polygons"));
}

TEST_F(RiverImportTest, APointFarFromAllOthersTakesNoTime) {
  // An empty coordinate of another program: a segment that is far longer than all others.
  for (int i = 0; i < 1000; ++i) Add("", {{4e6 + i, 5e6}, {4e6 + i, 5e6 + 10}});
  Add("Zero", {{4e6, 5e6}, {0, 0}});
  EXPECT_EQ(Import().branches.size(), 1001u);
}

}  // namespace
}  // namespace tervane::river_import_test
