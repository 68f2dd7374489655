// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/sampled_grid.h"

#include <gmock/gmock.h>

#include "data/datafile_writer.h"
#include "tests/support/data_files.h"
#include "tests/support/temp_folder.h"

namespace tervane::sampled_grid_test {
namespace {

using testing::ElementsAre;

TEST(SampledGrid, TakesTheMiddleOfEverySoManyRowsAndColumns) {
  const test::TempFolder folder;
  // 7 by 4 cells in two layers over two steps; the value tells step, layer, row and column.
  NewDataFile content;
  content.dimensions = 3;
  content.geometry = FileGeometryOf({7, 4, 10, 100, 200, 30, "NON-UTM"});
  content.geometry.nz = 2;
  content.items = {{"Head", quantity::kElevation, 1000, {}}};
  for (const bool isCompressed : {false, true}) {
    content.isCompressed = isCompressed;
    DataFileWriter writer;
    const std::string path = folder.File(isCompressed ? "packed.nds3" : "plain.nds3");
    test::Require(writer.Create(path, content));
    for (int step = 0; step < 2; ++step) {
      std::vector<float> values;
      for (int cell = 0; cell < 56; ++cell)
        values.push_back(static_cast<float>(1000 * step + 100 * (cell / 28) + 10 * (cell % 28 / 7) + cell % 7));
      values[28 + 7 + 1] = kDeleteValue;
      test::Require(writer.AddStep(CYbDateTime(2000, 1, 1 + step)));
      test::Require(writer.Put(1, values));
    }
    test::Require(writer.Finish().error);
    CTvn2DOrthoRotatedGridData grid;
    ASSERT_EQ(ReadSampledGrid(path, 1, {1, 1}, 3, grid).error, "");
    EXPECT_EQ(grid.Geometry(), (GridGeometry{3, 2, 30, 100, 200, 30, grid.Geometry().projection}));
    // The last column and row stand for what is left of them.
    EXPECT_THAT(grid.Values(), ElementsAre(kUsualDeleteValue, 1114, 1116, 1131, 1134, 1136));
    ASSERT_EQ(ReadSampledGrid(path, 1, {0, 0}, 1, grid).error, "");
    EXPECT_EQ(grid.Values().size(), 28U);
    EXPECT_NE(ReadSampledGrid(path, 2, {0, 0}, 3, grid).error, "");
    EXPECT_NE(ReadSampledGrid(path, 1, {2, 0}, 3, grid).error, "");
  }
}

}  // namespace
}  // namespace tervane::sampled_grid_test
