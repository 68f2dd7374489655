// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/data2d.h"

#include <cmath>
#include <functional>

#include <gmock/gmock.h>

#include "simspec/model_components.h"
#include "spatial/domain.h"
#include "tests/support/data_files.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::data2d_test {
namespace {

using testing::HasSubstr;

class Data2D : public testing::Test {
 protected:
  Data2D() {
    domain.Type = CCatchmentKvf::kShapeFile;
    domain.nxShp = domain.nyShp = 2;
    domain.sizeShp = 10;
    test::WriteGrid(folder.File("dem.nds2"), {3, 1, 5, 0, 0, 0, {}}, {1, 2, 3}, 100180);
    test::WriteShapes(folder.File("points.shp"), ShapeKind::Point, AttributeKind::Real, {4.0, 6.0});
    ground.GridFile().Choose(FileName("dem.nds2", folder.Path()));
    ground.ShapeFile().Choose(FileName("points.shp", folder.Path()), "CODE");
    ground.XyzFile().File = FileName(folder.Write("points.txt", "5 5 9\n"), "");
  }

  test::TempFolder folder;
  CFlowModelDoc document;
  CCatchmentKvf& domain = *document.Root().Important(kDomain);
  CData2DKvf& ground = *document.Root().Important(kTopography);
};

TEST_F(Data2D, AGridIsBuiltAnewWhenWhatDecidesItHasChangedAndOnlyThen) {
  enum Expected { kSame, kNew, kNone };
  const struct {
    const char* what;
    std::function<void()> change;
    Expected expected;
    std::size_t cells;
  } steps[] = {
      {"uniform", [] {}, kNone, 0},
      {"a grid keeps its own geometry", [&] { ground.Type = CData2DKvf::kGridFile; }, kNew, 3},
      {"asked again", [] {}, kSame, 3},
      {"the uniform value", [&] { ground.FixedValue = 55; }, kSame, 3},
      {"the model grid", [&] { domain.rotationShp = 30; }, kSame, 3},
      {"the file",
       [&] {
         test::WriteGrid(folder.File("dem.nds2"), {2, 1, 5, 0, 0, 0, {}}, {8, 9}, 100180);
       },
       kNew, 2},
      {"no item selected", [&] { ground.GridFile().Items.clear(); }, kSame, 2},
      {"an item that is not there", [&] { ground.GridFile().Items = {2}; }, kNone, 0},
      {"a file of another quantity",
       [&] {
         test::WriteGrid(folder.File("rain.nds2"), {2, 1, 5, 0, 0, 0, {}}, {8, 9}, 100431);
         ground.GridFile().Choose(FileName("rain.nds2", folder.Path()));
       },
       kNone, 0},
      {"points", [&] { ground.Type = CData2DKvf::kShapeFile; }, kNew, 4},
      {"asked again", [] {}, kSame, 4},
      {"the rotation", [&] { domain.rotationShp = 0; }, kNew, 4},
      {"the cells", [&] { domain.nxShp = 3; }, kNew, 6},
      {"the radius", [&] { ground.SearchRadius = 500; }, kNew, 6},
      {"the method", [&] { ground.InterpMethod = 3; }, kNew, 6},
      {"the unit of the values", [&] { ground.ShapeItemUnit = 1002; }, kNew, 6},
      {"what the page shows", [&] { ground.ShowGridData = 0; }, kSame, 6},
      {"a refresh", [&] { ground.SetGridDataValid(0); }, kNew, 6},
      {"the file is gone", [&] { ground.ShapeFile().Choose(FileName("none.shp", folder.Path()), "CODE"); }, kNone, 0},
      {"a text of points", [&] { ground.Type = CData2DKvf::kXyzFile; }, kNew, 6},
      {"a radius that is no number", [&] { ground.SearchRadius = std::nanf(""); }, kNone, 0},
      {"a corner that is no number", [&] { domain.x0Shp = std::nan(""); }, kNone, 0},
  };
  std::shared_ptr<const CTvn2DOrthoRotatedGridData> before;
  for (const auto& step : steps) {
    SCOPED_TRACE(step.what);
    step.change();
    EXPECT_EQ(ground.GridComputation(), ground.GridComputation());
    std::string problem;
    const auto grid = ground.GetGridData(&problem);
    EXPECT_EQ(grid == nullptr, step.expected == kNone);
    EXPECT_EQ(problem.empty(), step.expected != kNone || ground.Type == CData2DKvf::kUniform) << problem;
    if (grid) {
      EXPECT_EQ(grid == before, step.expected == kSame);
      EXPECT_EQ(grid->Values().size(), step.cells);
    }
    before = grid;
  }
}

TEST_F(Data2D, ShapesAreKeptLikewiseAndANewGridLeavesTheKeptOneAlone) {
  ground.Type = CData2DKvf::kGridFile;
  EXPECT_EQ(ground.GetShapeData(), nullptr);
  ground.Type = CData2DKvf::kShapeFile;
  const auto shapes = ground.GetShapeData();
  ASSERT_NE(shapes, nullptr);
  EXPECT_EQ(shapes->GetData().size(), 2U);
  EXPECT_EQ(ground.GetShapeData(), shapes);
  ground.SearchRadius = std::nanf("");
  EXPECT_EQ(ground.ShapeComputation(), ground.ShapeComputation());
  ground.SearchRadius = 1000;
  const auto grid = ground.GetGridData();
  const auto made = ground.CreateGridData();
  ASSERT_NE(made, nullptr);
  EXPECT_NE(made, grid);
  EXPECT_EQ(made->Values(), grid->Values());
  EXPECT_EQ(made->ItemName(), "Topography");
  EXPECT_EQ(ground.GetGridData(), grid);
}

TEST_F(Data2D, OldSetupsWereInterpolatedBilinearlyAndOnlySomeQuantitiesKnowTheGround) {
  const char* sections =
      "section Topography {\nInterpMethod = 3\nRelativeToGround = 1\n}\n"
      "section GroundwaterTable {\nInterpMethod = 3\nRelativeToGround = 0\n}\n";
  for (const auto& [version, method] : {std::pair{-1, "0"}, {3, "0"}, {4, "3"}, {14, "3"}}) {
    CFlowModelDoc opened;
    ASSERT_TRUE(opened.OpenText(test::SetupText(version, sections), "a.tvd"));
    EXPECT_EQ(test::ValueOf(opened, "Topography:InterpMethod"), method) << version;
    EXPECT_EQ(test::ValueOf(opened, "GroundwaterTable:RelativeToGround"), "0");
    // A quantity that knows no ground does not write the key back; it is told of as unread.
    EXPECT_EQ(test::ValueOf(opened, "Topography:RelativeToGround"), "");
    EXPECT_EQ(opened.Report().unread.size(), 1U);
  }
  document.Root().Important(kModelComponents)->SZ = 0;
  auto& table = dynamic_cast<CData2DKvf&>(*FindNode(document.Root(), {{"GroundwaterTable", 1}}));
  EXPECT_EQ(table.GetItemType(), 100364);
  table.Type = CData2DKvf::kGridFile;
  table.GridFile().Choose(FileName("dem.nds2", folder.Path()));
  table.ValidateData();
  EXPECT_FALSE(table.GridFile().Validate());
  EXPECT_THAT(table.GridFile().Findings().front().detail, HasSubstr("Height above Ground was expected"));
  table.RelativeToGround = 0;
  table.ValidateData();
  EXPECT_TRUE(table.GridFile().Validate());
}

}  // namespace
}  // namespace tervane::data2d_test
