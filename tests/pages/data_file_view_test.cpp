// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/data_file_view.h"

#include <filesystem>

#include <gmock/gmock.h>

#include "data/datafile_writer.h"
#include "tests/support/temp_folder.h"

namespace tervane::data_file_view_test {
namespace {

using test::TempFolder;
using testing::HasSubstr;

constexpr int kSteps = 3000;

/// Rain and flow by the hour; the value of a step is its number, and that plus `offset`.
void WriteSeries(const std::string& path, float offset) {
  NewDataFile content;
  content.dimensions = 0;
  content.items = {{"Rain", 100182, 2001, ValueType::MeanStep}, {"Level", 100180, 1000, {}}};
  DataFileWriter writer;
  ASSERT_EQ(writer.Create(path, content), "");
  for (int step = 0; step < kSteps; ++step) {
    const float rain = step == 7 ? kDeleteValue : static_cast<float>(step), level = static_cast<float>(step) + offset;
    ASSERT_EQ(writer.AddStep(CYbDateTime(2000, 1, 1) + CYbDateTimeSpan{3600 * step}), "");
    ASSERT_EQ(writer.Put(1, {&rain, 1}), "");
    ASSERT_EQ(writer.Put(2, {&level, 1}), "");
  }
  ASSERT_EQ(writer.Finish().error, "");
}

/// 4 by 3 cells in 2 layers over 5 days: 1000 times the step, 100 times the layer, and the number of the cell.
void WriteGrid(const std::string& path) {
  NewDataFile content;
  content.dimensions = 3;
  content.geometry.nx = 4;
  content.geometry.ny = 3;
  content.geometry.nz = 2;
  content.geometry.cellSize = 50;
  content.items = {{"Head", 100180, 1000, {}}};
  DataFileWriter writer;
  ASSERT_EQ(writer.Create(path, content), "");
  for (int step = 0; step < 5; ++step) {
    std::vector<float> values;
    for (int i = 0; i < 24; ++i) values.push_back(static_cast<float>(1000 * step + 100 * (i / 12) + i % 12));
    ASSERT_EQ(writer.AddStep(CYbDateTime(2000, 1, 1 + step)), "");
    ASSERT_EQ(writer.Put(1, values), "");
  }
  ASSERT_EQ(writer.Finish().error, "");
}

TEST(DataFileView, ShowsSeriesAsRowsOfTimesWithUnitsInTheHeads) {
  const TempFolder folder;
  WriteSeries(folder.File("a.nds0"), 0.5F);
  DataFileView view(folder.File("a.nds0"), nullptr);
  ASSERT_EQ(view.Problem(), "");
  EXPECT_EQ(view.RowCount(), kSteps);
  EXPECT_EQ(view.CellsAsText(6, 8, 0, 1, true),
            "Time\tRain [mm/h]\tLevel [m]\n"
            "2000-01-01 06:00\t6\t6.5\n2000-01-01 07:00\t\t7.5\n2000-01-01 08:00\t8\t8.5\n");
  EXPECT_EQ(view.Cell(kSteps - 1, 1), "2999.5");
  view.Choose({2, 1});
  const SeriesContent chart = Finished<SeriesContent>([&view] { return view.Chart(); });
  ASSERT_EQ(chart.series.size(), 2U);
  EXPECT_EQ(chart.series[0].name, "Level");
  EXPECT_EQ(view.ColumnOf(2), 1U);
  std::size_t step = 0;
  EXPECT_EQ(view.FindDate("2000-01-02 01:31", step), "");
  EXPECT_EQ(step, 26U);
  EXPECT_EQ(view.FindDate("1990/01/01", step), "");
  EXPECT_EQ(step, 0U);
  EXPECT_THAT(view.FindDate("soon", step), HasSubstr("2000/01/31"));
}

TEST(DataFileView, ASeriesKeepsItsColourWhileOthersComeAndGo) {
  const TempFolder folder;
  WriteSeries(folder.File("gauge.nds0"), 1);
  DataFileView view(folder.File("gauge.nds0"), nullptr);
  const auto colors = [&view](std::vector<int> numbers) {
    view.Choose(std::move(numbers));
    std::vector<std::size_t> all;
    for (const Series& series : Finished<SeriesContent>([&view] { return view.Chart(); }).series)
      all.push_back(series.color.value());
    return all;
  };
  EXPECT_THAT(colors({1}), testing::ElementsAre(0));
  EXPECT_THAT(colors({2, 1}), testing::ElementsAre(1, 0));
  EXPECT_THAT(colors({2}), testing::ElementsAre(1));
  EXPECT_THAT(colors({1, 2}), testing::ElementsAre(0, 1));
}

TEST(DataFileView, ShowsTheChosenStepAndLayerOfAGridTheNorthFirst) {
  const TempFolder folder;
  WriteGrid(folder.File("a.nds3"));
  DisplayUnits feet;
  DataFileView view(folder.File("a.nds3"), &feet);
  ASSERT_EQ(view.Problem(), "");
  EXPECT_EQ(view.Layers(), 2);
  EXPECT_EQ(view.Steps(), 5U);
  view.ChooseSlice({3, 1});
  EXPECT_EQ(view.StepText(3), "2000-01-04 00:00");
  EXPECT_EQ(view.Cell(0, 0), "");  // not read yet
  const auto grid = std::make_shared<CTvn2DOrthoRotatedGridData>();
  ASSERT_EQ(ReadGridData(view.Path(), 1, *grid, {}, view.Slice()).error, "");
  view.ShowGrid(grid);
  EXPECT_EQ(view.CellsAsText(0, 2, 0, 3, false),
            "3108\t3109\t3110\t3111\n3104\t3105\t3106\t3107\n3100\t3101\t3102\t3103\n");
  EXPECT_EQ(view.RowHead(0), "2");
  EXPECT_EQ(view.TableCellOf(1, 2), std::pair(std::size_t{0}, std::size_t{1}));
  EXPECT_EQ(view.TableText(), "Head [m]");
  feet.Choose(100180, 1003);
  EXPECT_EQ(view.TableText(), "Head [ft]");
  EXPECT_EQ(view.Cell(2, 0).substr(0, 5), "10170");
}

TEST(DataFileView, FollowsTheFileOnTheDisk) {
  const TempFolder folder;
  const std::string path = folder.File("a.nds0");
  WriteSeries(path, 0.5F);
  DataFileView view(path, nullptr);
  view.Choose({2});
  EXPECT_EQ(view.Cell(1, 1), "1.5");
  EXPECT_FALSE(view.Reopen());
  WriteSeries(path, 0.25F);
  std::filesystem::last_write_time(path, std::filesystem::file_time_type::clock::now() + std::chrono::seconds(2));
  EXPECT_TRUE(view.Reopen());
  EXPECT_EQ(view.Chosen(), std::vector{2});
  EXPECT_EQ(view.Cell(1, 1), "1.25");
  std::filesystem::remove(path);
  EXPECT_TRUE(view.Reopen());
  EXPECT_THAT(view.Problem(), HasSubstr("not there any more"));
  EXPECT_EQ(view.RowCount(), 0U);
  EXPECT_EQ(view.RowHead(1) + view.ColumnHead(0) + view.Cell(1, 0), "") << "a table asks on while it is shown";
  folder.Write("a.nds0", "no data file");
  EXPECT_TRUE(view.Reopen());
  EXPECT_THAT(view.Problem(), HasSubstr("a.nds0"));
  WriteSeries(path, 0);
  EXPECT_TRUE(view.Reopen());
  EXPECT_EQ(view.Problem(), "");
  EXPECT_EQ(view.Cell(1, 1), "1");
}

}  // namespace
}  // namespace tervane::data_file_view_test
