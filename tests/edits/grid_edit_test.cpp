// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "edits/grid_edit.h"

#include <cmath>

#include <gmock/gmock.h>

#include "data/datafile_writer.h"
#include "edits/cell_figures.h"
#include "tests/support/data_files.h"
#include "tests/support/temp_folder.h"

namespace tervane::grid_edit_test {
namespace {

using test::Require;
using test::TempFolder;
using testing::ElementsAre;
using testing::HasSubstr;

constexpr int kNx = 6, kNy = 5;

/// Two items, levels and codes, of two layers and three steps. A cell of a step and layer has the value
/// 1000 step + 100 layer + its number from 0.
class GridEditTest : public testing::Test {
 public:
  TempFolder folder;
  std::string path = folder.File("a.nds3");

  void Make(double rotation = 0, bool isCompressed = false) const {
    NewDataFile content;
    content.dimensions = 3;
    content.geometry.nx = kNx;
    content.geometry.ny = kNy;
    content.geometry.nz = 2;
    content.geometry.cellSize = 10;
    content.geometry.x0 = 1000;
    content.geometry.y0 = 2000;
    content.geometry.rotation = rotation;
    content.items = {{"Level", quantity::kElevation, 1000, {}}, {"Zone", quantity::kCode, kWholeNumberUnit, {}}};
    content.isCompressed = isCompressed;
    DataFileWriter writer;
    Require(writer.Create(path, content));
    for (int step = 0; step < 3; ++step) {
      Require(writer.AddStep(CYbDateTime(2000, 1, 1 + step)));
      std::vector<float> values;
      for (int layer = 0; layer < 2; ++layer)
        for (int cell = 0; cell < kNx * kNy; ++cell)
          values.push_back(static_cast<float>(1000 * step + 100 * layer + cell));
      Require(writer.Put(1, values));
      Require(writer.Put(2, values));
    }
    Require(writer.Finish().error);
  }
  /// The middle of a cell on the map.
  static MapPoint At(const GridEdit& edit, int i, int j) { return edit.Grid()->CellCentre(i, j); }
};

std::vector<float> Values(const GridEdit& edit) { return edit.Grid()->Values(); }

/// The cells that have a value, as a picture with the north above.
std::string Picture(const GridEdit& edit, float value) {
  std::string picture;
  for (int j = kNy - 1; j >= 0; --j) {
    for (int i = 0; i < kNx; ++i) picture += edit.ValueOf(i, j) == value ? '#' : '.';
    picture += '\n';
  }
  return picture;
}

TEST_F(GridEditTest, WhatIsPaintedIsOneStepAndTheSameOnTurnedGrids) {
  struct Row {
    const char* name;
    std::function<std::string(GridEdit&)> paint;
    const char* picture;
  };
  const auto at = [](const GridEdit& edit, int i, int j) { return At(edit, i, j); };
  const Row rows[] = {
      {"brush of one cell",
       [&](GridEdit& edit) {
         std::string why = edit.BeginStroke("Paint", 7777);
         edit.StrokeTo(at(edit, 1, 1), at(edit, 1, 1), 1);
         edit.StrokeTo(at(edit, 1, 1), at(edit, 4, 3), 1);
         edit.EndStroke();
         return why;
       },
       "......\n...##.\n..##..\n.##...\n......\n"},
      {"brush of three cells that leaves the grid",
       [&](GridEdit& edit) {
         std::string why = edit.BeginStroke("Paint", 7777);
         edit.StrokeTo(at(edit, 5, 0), at(edit, 9, 0), 3);
         edit.EndStroke();
         return why;
       },
       "......\n......\n......\n....##\n....##\n"},
      {"line",
       [&](GridEdit& edit) {
         return edit.PaintLine({at(edit, 0, 4), at(edit, 3, 4), at(edit, 3, 2)}, 1, 7777);
       },
       "####..\n...#..\n...#..\n......\n......\n"},
      {"polygon",
       [&](GridEdit& edit) {
         return edit.PaintPolygon({at(edit, 0, 0), at(edit, 0, 3), at(edit, 4, 3), at(edit, 4, 0)}, 7777);
       },
       nullptr},
  };
  for (const double rotation : {0.0, 30.0}) {
    for (const Row& row : rows) {
      SCOPED_TRACE(row.name);
      Make(rotation);
      GridEdit edit(path);
      ASSERT_EQ(edit.Problem(), "");
      const std::vector<float> before = Values(edit);
      ASSERT_EQ(row.paint(edit), "");
      if (row.picture) {
        EXPECT_EQ(Picture(edit, 7777), row.picture);
      }
      const std::vector<float> after = Values(edit);
      EXPECT_NE(after, before);
      EXPECT_TRUE(edit.IsModified());
      EXPECT_FALSE(edit.TakeChanged().empty());
      EXPECT_EQ(edit.Undo(), "");
      EXPECT_EQ(Values(edit), before);
      EXPECT_FALSE(edit.CanUndo());
      EXPECT_FALSE(edit.IsModified());
      EXPECT_EQ(edit.Redo(), "");
      EXPECT_EQ(Values(edit), after);
    }
  }
}

TEST_F(GridEditTest, PlacesFarFromTheGridChangeNothing) {
  GridGeometry grid{kNx, kNy, 10, 1000, 2000, 0, {}};
  for (const double far : {1e38, -1e38, 1e12})
    for (const double width : {1.0, 3.0})
      for (const auto& [from, to] :
           {std::pair{MapPoint{1010, far}, MapPoint{1010, far}}, std::pair{MapPoint{far, 2010}, MapPoint{far, 2010}},
            std::pair{MapPoint{far, far}, MapPoint{far, far}}})
        CellsAlong(grid, from, to, width, [&](int j, int begin, int end) {
          ADD_FAILURE() << far << ": row " << j << " from " << begin << " to " << end;
        });
}

TEST_F(GridEditTest, FillStopsAtOtherValues) {
  Make();
  GridEdit edit(path);
  ASSERT_EQ(edit.Apply(CellOperation::Set, 1), "");
  // A wall with a gap, which a corner does not pass.
  ASSERT_EQ(edit.PaintLine({At(edit, 2, 0), At(edit, 2, 3)}, 1, 9), "");
  ASSERT_EQ(edit.PutCells("Change Cells", {{3, 4, 9.F}}), "");
  ASSERT_EQ(edit.Fill(0, 0, 5), "");
  EXPECT_EQ(Picture(edit, 5), "###...\n##....\n##....\n##....\n##....\n");
  EXPECT_EQ(edit.UndoName(), "Fill");
  ASSERT_EQ(edit.Fill(0, 0, kDeleteValue), "");
  ASSERT_EQ(edit.Fill(1, 1, 3), "");
  EXPECT_EQ(Picture(edit, 3), "###...\n##....\n##....\n##....\n##....\n");
  ASSERT_EQ(edit.Fill(-1, 99, 3), "");
}

TEST_F(GridEditTest, EditsOfAllSlicesAreSavedAndNothingElse) {
  for (const bool isCompressed : {false, true}) {
    Make(12.5, isCompressed);
    const auto all = [&] {
      DataFile file;
      Require(file.Open(path));
      std::vector<float> values;
      for (const int item : {1, 2}) {
        ValueSelection selection{item, 0, 3, {}};
        std::vector<float> part(file.SizeOf(selection));
        Require(file.Read(selection, part));
        values.insert(values.end(), part.begin(), part.end());
      }
      return values;
    };
    std::vector<float> expected = all();
    GridEdit edit(path);
    ASSERT_EQ(edit.PutCells("Change Cells", {{2, 1, -5.F}}), "");
    ASSERT_EQ(edit.Show(2, {2, 1}), "");
    ASSERT_EQ(edit.PutCells("Change Cells", {{0, 4, kDeleteValue}, {5, 4, 42.F}}), "");
    ASSERT_EQ(edit.Show(1, {1, 0}), "");
    EXPECT_EQ(edit.ValueOf(2, 1), 1008);
    expected[2 + 1 * kNx] = -5;
    const std::size_t layer = kNx * kNy, item = 6 * layer;
    expected[item + 5 * layer + 4 * kNx] = kDeleteValue;
    expected[item + 5 * layer + 4 * kNx + 5] = 42;
    ASSERT_EQ(edit.Save(path).error, "");
    EXPECT_FALSE(edit.IsModified());
    EXPECT_FALSE(edit.IsOtherOnDisk());
    EXPECT_EQ(all(), expected);
    // Undo leads back beyond the save, and to the place that it changes.
    ASSERT_EQ(edit.Undo(), "");
    EXPECT_EQ(edit.Item(), 2);
    EXPECT_EQ(edit.Slice(), (GridSlice{2, 1}));
    EXPECT_TRUE(edit.IsModified());
    ASSERT_EQ(edit.Undo(), "");
    ASSERT_EQ(edit.Save(folder.File("b.nds3")).error, "");
    EXPECT_EQ(all(), expected) << "the file under the old name is another one";
    EXPECT_EQ(edit.Path(), folder.File("b.nds3"));
    GridEdit other(edit.Path());
    EXPECT_EQ(other.ValueOf(2, 1), 8);
    ASSERT_EQ(other.Show(2, {2, 1}), "");
    EXPECT_EQ(other.ValueOf(0, 4), 2124);
  }
}

TEST_F(GridEditTest, SelectionsMeetAndAreCounted) {
  Make();
  GridEdit edit(path);
  const SelectionStatistics whole = edit.Statistics();
  EXPECT_EQ(whole.count, 30u);
  EXPECT_DOUBLE_EQ(whole.mean, 14.5);
  edit.SelectRectangle(At(edit, 1, 1), At(edit, 3, 2), SelectionMode::Replace);
  EXPECT_EQ(edit.Selection().Count(), 6u);
  edit.SelectRange(9, 100, SelectionMode::Keep);
  SelectionStatistics found = edit.Statistics();
  EXPECT_EQ(found.count, 4u);  // 9, 13, 14, 15
  EXPECT_EQ(found.smallest, 9);
  EXPECT_EQ(found.largest, 15);
  EXPECT_DOUBLE_EQ(found.sum, 51);
  EXPECT_NEAR(found.deviation, std::sqrt(20.75 / 4), 1e-12);
  EXPECT_EQ(found.area, 400);
  edit.SelectPolygon({{1000, 2000}, {1010, 2000}, {1010, 2010}, {1000, 2010}}, SelectionMode::Add);
  EXPECT_EQ(edit.Statistics().smallest, 0);
  const CellWindow window = *edit.SelectedWindow();
  EXPECT_EQ((std::vector{window.i, window.j, window.nx, window.ny}), (std::vector{0, 0, 4, 3}));
  ASSERT_EQ(edit.DeleteValues(), "");
  EXPECT_EQ(edit.Statistics().missing, 5u);
  edit.SelectMissing(SelectionMode::Remove);
  EXPECT_FALSE(edit.HasSelection());
}

TEST_F(GridEditTest, ArithmeticLeavesMissingCellsAndRefusesWhatCannotBe) {
  struct Row {
    CellOperation operation;
    double operand;
    std::vector<float> cells;  ///< Of 1, 2, 3 and a missing one.
  };
  const float no = kDeleteValue;
  const Row rows[] = {{CellOperation::Set, 5, {5, 5, 5, 5}},         {CellOperation::Add, 0.5, {1.5, 2.5, 3.5, no}},
                      {CellOperation::Subtract, 1, {0, 1, 2, no}},   {CellOperation::Multiply, 2, {2, 4, 6, no}},
                      {CellOperation::Divide, 2, {0.5, 1, 1.5, no}}, {CellOperation::AtLeast, 2, {2, 2, 3, no}},
                      {CellOperation::AtMost, 2, {1, 2, 2, no}}};
  for (const Row& row : rows) {
    test::WriteGrid(path, {4, 1, 1, 0, 0, 0, {}}, {1, 2, 3, kUsualDeleteValue}, quantity::kElevation);
    GridEdit edit(path);
    ASSERT_EQ(edit.Apply(row.operation, row.operand), "");
    EXPECT_EQ(Values(edit), row.cells);
    ASSERT_EQ(edit.Undo(), "");
    EXPECT_EQ(Values(edit), (std::vector<float>{1, 2, 3, no}));
    EXPECT_THAT(edit.Apply(CellOperation::Divide, 0), HasSubstr("0"));
    EXPECT_THAT(edit.Apply(CellOperation::Multiply, 1e39), HasSubstr("too large"));
    EXPECT_THAT(edit.Apply(CellOperation::Add, std::nan("")), HasSubstr("number"));
    EXPECT_EQ(Values(edit), (std::vector<float>{1, 2, 3, no}));
    ASSERT_EQ(edit.Replace(no, 8), "");
    ASSERT_EQ(edit.Replace(2, no), "");
    EXPECT_EQ(Values(edit), (std::vector<float>{1, no, 3, 8}));
  }
  test::WriteCodes(path, {1, 2});
  GridEdit codes(path);
  EXPECT_TRUE(codes.IsCodes());
  EXPECT_THAT(codes.Apply(CellOperation::Divide, 2), HasSubstr("whole number"));
  EXPECT_THAT(codes.PutCells("Change Cells", {{0, 0, 1.5F}}), HasSubstr("whole number"));
  EXPECT_EQ(codes.Apply(CellOperation::Add, 3), "");
  EXPECT_EQ(Values(codes), (std::vector<float>{4, 5}));
}

TEST_F(GridEditTest, ShapesAreBurnt) {
  test::WriteGrid(path, {3, 1, 10, 0, 0, 0, {}}, {0, 0, 0}, quantity::kElevation);
  GridEdit edit(path);
  std::string note;
  const std::string zones = folder.File("zones.shp");
  test::WriteShapes(zones, ShapeKind::Polygon, AttributeKind::Real,
                    {ShapeValue(2.5), {}, ShapeValue(4.5), ShapeValue(9.0)});
  ASSERT_EQ(edit.Burn({zones, "code", 0}, note), "");
  EXPECT_EQ(Values(edit), (std::vector<float>{2.5, 0, 4.5}));
  EXPECT_THAT(note, HasSubstr("2 shapes gave 2 cells"));
  EXPECT_THAT(note, HasSubstr("1 shapes have no cell"));
  EXPECT_THAT(note, HasSubstr("1 shapes have no number as code"));
  test::WriteShapes(zones, ShapeKind::Point, AttributeKind::Text,
                    {ShapeValue(std::string("7")), ShapeValue(std::string("x"))});
  ASSERT_EQ(edit.Burn({zones, "CODE", 0}, note), "");
  EXPECT_EQ(Values(edit), (std::vector<float>{7, 0, 4.5}));
  ASSERT_EQ(edit.Burn({zones, "", 1}, note), "");
  EXPECT_EQ(Values(edit), (std::vector<float>{1, 1, 4.5}));
  ASSERT_EQ(edit.Undo(), "");
  ASSERT_EQ(edit.Undo(), "");
  EXPECT_EQ(Values(edit), (std::vector<float>{2.5, 0, 4.5}));
  EXPECT_THAT(edit.Burn({folder.File("none.shp"), "", 1}, note), HasSubstr("none.shp"));
}

TEST_F(GridEditTest, AStepCostsWhatItChangedHoweverLargeTheGrid) {
  test::WriteGrid(path, {1000, 1000, 1, 0, 0, 0, {}}, std::vector<float>(1'000'000, 1), quantity::kElevation);
  GridEdit edit(path);
  ASSERT_EQ(edit.BeginStroke("Paint", 2), "");
  // To and fro over the same cells.
  for (int turn = 0; turn < 20; ++turn) edit.StrokeTo(At(edit, 100, 100), At(edit, 200, 130), 5);
  edit.EndStroke();
  EXPECT_GT(edit.BytesOfSteps(), 0u);
  EXPECT_LT(edit.BytesOfSteps(), 20'000u);
  EXPECT_EQ(edit.UndoName(), "Paint");
}

TEST_F(GridEditTest, WhatCannotBeEditedSaysWhy) {
  const std::string raster = folder.Write("a.asc", "ncols 1\nnrows 1\nxllcorner 0\nyllcorner 0\ncellsize 1\n5\n");
  EXPECT_THAT(GridEdit(raster).Problem(), HasSubstr("import"));
  EXPECT_THAT(GridEdit(folder.Write("b.nds2", "text")).Problem(), HasSubstr("b.nds2"));
  EXPECT_THAT(GridEdit(folder.File("none.nds2")).Problem(), HasSubstr("none.nds2"));
}

TEST_F(GridEditTest, AFileOfAnotherProgramIsKnownByItsContent) {
  Make();
  GridEdit edit(path);
  ASSERT_EQ(edit.PutCells("Change Cells", {{0, 0, 5.F}}), "");
  const std::string same = test::ReadFile(path);
  folder.Write("a.nds3", same);
  EXPECT_FALSE(edit.IsOtherOnDisk());
  Make(45);
  EXPECT_TRUE(edit.IsOtherOnDisk());
  edit.KeepMine();
  EXPECT_FALSE(edit.IsOtherOnDisk());
  // What is saved over it is the whole of what was read, with the change.
  ASSERT_EQ(edit.Save(path).error, "");
  GridEdit saved(path);
  EXPECT_EQ(saved.ItemFacts().geometry.rotation, 0);
  EXPECT_EQ(saved.ValueOf(0, 0), 5);
  EXPECT_EQ(saved.ValueOf(1, 0), 1);
  folder.Write("a.nds3", "no data");
  EXPECT_THAT(saved.Reload(), HasSubstr("a.nds3"));
  EXPECT_EQ(saved.ValueOf(0, 0), 5);
}

}  // namespace
}  // namespace tervane::grid_edit_test
