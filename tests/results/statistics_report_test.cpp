// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/statistics_report.h"

#include <filesystem>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "data/datafile_writer.h"
#include "geometry/shapes.h"
#include "platform/item_types.h"
#include "tests/support/data_files.h"
#include "tests/support/temp_folder.h"

namespace tervane::statistics_report_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;
using testing::StartsWith;

constexpr int kDays = 7;
const ComparedPeriod kPeriod{CYbDateTime(2001, 1, 1), CYbDateTime(2001, 2, 1)};

/// Seven days of each item, in the base unit.
void WriteSeries(const std::string& path, int itemType, const std::vector<std::vector<float>>& items) {
  DataFileWriter writer;
  NewDataFile content;
  content.dimensions = 0;
  for (std::size_t i = 0; i < items.size(); ++i)
    content.items.push_back({fmt::format("Item {}", i + 1), itemType, BaseUnit(*FindItemType(itemType)).key});
  test::Require(writer.Create(path, content));
  for (int day = 0; day < kDays; ++day) {
    test::Require(writer.AddStep(CYbDateTime(2001, 1, 2 + day)));
    for (std::size_t i = 0; i < items.size(); ++i)
      test::Require(writer.Put(static_cast<int>(i) + 1, std::span(&items[i][static_cast<std::size_t>(day)], 1)));
  }
  test::Require(writer.Finish().error);
}

struct StatisticsReport : testing::Test {
  test::TempFolder folder;
  DisplayUnits units;
  std::vector<DetailedPoint> points;
  StatisticsTable table;

  /// A report with a point for each text, whose keys count before those that all have.
  std::string WriteReport(const std::vector<std::string>& items) {
    std::string text =
        fmt::format("target Extra_Data {{\nsection DetailedTimeseriesOutput {{\nNumberOfItems = {}\n", items.size());
    for (std::size_t i = 0; i < items.size(); ++i)
      text += fmt::format(
          "section Item_{} {{\n{}X = 1500.0\nY = 250.5\niX = 3\niY = 4\nInclObsData = 1\n"
          "SimDataFileName = file \"sim.nds0\"\nSimDataFileItemNo = {}\nObsDataFileName = file \"obs.nds0\"\n"
          "ObsDataFileItemNo = 1\n}}\n",
          i + 1, items[i], i + 1);
    return folder.Write("karup_PreProcessed.kvf", text + "}\n}\n");
  }
  void WriteBothSeries() {
    WriteSeries(folder.File("sim.nds0"), quantity::kElevation, {{3, 4.5, 6.5, 7, 2.5, 2.5, 4}, {1, 1, 1, 1, 1, 1, 1}});
    WriteSeries(folder.File("obs.nds0"), quantity::kElevation, {{3.5, 4.25, 8, 6.5, 2, 2.75, 5}});
  }
  void Compute(const std::string& report) {
    test::Require(ReadDetailedPoints(report, points).error);
    test::Require(ComputeStatistics(points, kPeriod, units, table).error);
  }
};

constexpr const char* kHead =
    "<html>\n<body>\n<table border=1>\nStart date for statistical analysis: 2001/01/01  00:00<br />\n"
    "End date for statistical analysis  : 2001/02/01  00:00<br />\n<tr>\n  <td>Name</td>\n  <td>Data type</td>\n"
    "  <td>X</td>\n  <td>Y</td>\n  <td>Layer</td>\n  <td>ME</td>\n  <td>MAE</td>\n  <td>RMSE</td>\n"
    "  <td>STDres</td>\n  <td>R(Correlation)</td>\n  <td>R2(Nash_Sutcliffe)</td>\n</tr>\n";

TEST_F(StatisticsReport, TheTableInHtml) {
  WriteBothSeries();
  Compute(WriteReport({"Name = \"Well <3> & more\"\nDataTypeName = \"head elevation\"\niLay = 2\n", "iLay = 0\n",
                       "InclObsData = 0\n"}));
  ASSERT_EQ(points.size(), 3U);
  EXPECT_EQ(points[0].column, 3);
  EXPECT_EQ(points[0].row, 4);
  EXPECT_FALSE(points[2].includesObserved);
  EXPECT_EQ(StatisticsPage(table, units),
            std::string(kHead) +
                "<tr>\n  <td>Well &lt;3&gt; &amp; more</td>\n  <td>head elevation</td>\n  <td>1500</td>\n"
                "  <td>250.5</td>\n  <td>2</td>\n  <td>0.285714</td>\n  <td>0.642857</td>\n  <td>0.767649</td>\n"
                "  <td>0.769586</td>\n  <td>0.933445</td>\n  <td>0.846307</td>\n</tr>\n"
                "<tr>\n  <td>&nbsp;</td>\n  <td>&nbsp;</td>\n  <td>1500</td>\n  <td>250.5</td>\n  <td>&nbsp;</td>\n"
                "  <td>3.57143</td>\n  <td>3.57143</td>\n  <td>4.07299</td>\n  <td>2.115</td>\n"
                "  <td>&nbsp;</td>\n  <td>-3.32668</td>\n</tr>\n</table>\n</body>\n</html>\n");
}

TEST_F(StatisticsReport, FiguresAndPlacesAreInTheUsersUnits) {
  WriteBothSeries();
  ASSERT_TRUE(units.Choose(quantity::kElevation, 1002));
  ASSERT_TRUE(units.Choose(quantity::kPosition, 1003));
  Compute(WriteReport({"Name = \"A\"\n"}));
  ASSERT_EQ(table.rows.size(), 1U);
  const double factor = Convert(1, *FindUnit(1000), *FindUnit(1002));
  EXPECT_NE(factor, 1);
  EXPECT_NEAR(table.rows[0].figures.meanError.value(), 0.2857142857142857 * factor, 1e-4 * factor);
  EXPECT_NEAR(table.rows[0].figures.nashSutcliffe.value(), 0.846307385229541, 1e-5);
  EXPECT_EQ(table.rows[0].unit, FindUnit(1002)->abbreviation);
  const double x = Convert(1500, *FindUnit(1000), *FindUnit(1003));
  EXPECT_THAT(StatisticsPage(table, units), HasSubstr("  <td>" + FormatNumber(x, "%g") + "</td>\n"));
}

TEST_F(StatisticsReport, BothFilesTakeTheirPlaceTogether) {
  WriteBothSeries();
  // 20 letters of two bytes and one more: the cut falls between characters.
  std::string name = "x";
  for (int i = 0; i < 20; ++i) name += "ø";
  const std::string report =
      WriteReport({fmt::format("Name = \"{}\"\nDataTypeName = \"head\"\niLay = 2\n", name), "iLay = 1234567\n"});
  Compute(report);
  const StatisticsFiles files = StatisticsFilesBeside(report);
  EXPECT_EQ(files.html, folder.File("karup_PreProcessed_Stat.Html"));
  EXPECT_EQ(files.shape, folder.File("karup_PreProcessed_Stat.shp"));
  test::Require(WriteStatistics(table, units, files).error);
  EXPECT_EQ(test::ReadFile(files.html), StatisticsPage(table, units));

  CYbShapeData shapes;
  test::Require(shapes.ReadShapeAndDbfFile(files.shape, "").error);
  std::vector<std::string> names;
  for (const ShapeField& field : shapes.Fields()) names.push_back(field.name);
  EXPECT_THAT(names,
              ElementsAre("Name", "Data_type", "Layer", "ME", "MAE", "RMSE", "STDres", "R_Correlat", "R2_Nash_Su"));
  ASSERT_EQ(shapes.GetData().size(), 2U);
  const Shape &first = shapes.GetData()[0], &second = shapes.GetData()[1];
  EXPECT_EQ(first.points.front().x, 1500);
  EXPECT_EQ(TextOf(first.values[0]), name.substr(0, 39));
  EXPECT_EQ(TextOf(first.values[2]), "2");
  EXPECT_EQ(std::get<double>(first.values[8]), 0.8463);
  EXPECT_EQ(second.values[2], ShapeValue());  // wider than its column
  EXPECT_EQ(second.values[7], ShapeValue());  // no variance
  // Each attribute is as wide as it is told: 2 * 40 + 5 + 6 * 12, and the mark of deletion.
  const std::string dbf = test::ReadFile(folder.File("karup_PreProcessed_Stat.dbf"));
  EXPECT_EQ(static_cast<unsigned char>(dbf[10]) + 256 * static_cast<unsigned char>(dbf[11]), 158);

  // What cannot be written leaves both old files.
  const std::string old = test::ReadFile(files.html);
  table.rows.clear();
  const std::string blocked = folder.File("karup_PreProcessed_Stat.dbf");
  std::filesystem::remove(blocked);
  std::filesystem::create_directory(blocked);
  EXPECT_THAT(WriteStatistics(table, units, files).error, StartsWith("Error creating dbf file:\n" + blocked));
  EXPECT_EQ(test::ReadFile(files.html), old);
  EXPECT_THAT(WriteStatistics(table, units, {folder.File("none/a.Html"), files.shape}).error,
              StartsWith("Could not open ASCII-file for writing:\n\n" + folder.File("none/a.Html")));
}

TEST_F(StatisticsReport, ASeriesThatCannotBeOpenedEndsTheTable) {
  WriteBothSeries();
  Compute(WriteReport({"Name = \"A\"\n", "Name = \"B\"\n"}));
  ASSERT_EQ(points.size(), 2U);
  points[1].observed.path = folder.File("gone.nds0");
  test::Require(ComputeStatistics(points, kPeriod, units, table).error);
  EXPECT_EQ(table.rows.size(), 1U);
  EXPECT_THAT(table.stopped, HasSubstr("gone.nds0"));
  EXPECT_THAT(StatisticsPage(table, units), Not(HasSubstr("</table>")));
}

TEST_F(StatisticsReport, WhatCannotBeComparedIsToldAndHasNoFigures) {
  WriteBothSeries();
  WriteSeries(folder.File("flow.nds0"), quantity::kDischarge, {{1, 2, 3, 4, 5, 6, 7}});
  Compute(WriteReport({"", "", "", ""}));
  ASSERT_EQ(points.size(), 4U);
  points[0].observed = {folder.File("flow.nds0"), 1};
  points[1].observed.item = 3;
  points[2].simulated.item = 0;
  points[3].simulated.item = 1;
  test::Require(ComputeStatistics(points, {CYbDateTime(2001, 1, 2), CYbDateTime(2001, 1, 2)}, units, table).error);
  ASSERT_EQ(table.rows.size(), 4U);
  EXPECT_THAT(table.rows[0].problem, HasSubstr("which cannot be compared with m"));
  EXPECT_THAT(table.rows[1].problem, HasSubstr("obs.nds0 has no item 3"));
  EXPECT_THAT(table.rows[2].problem, HasSubstr("sim.nds0 has no item 0"));
  EXPECT_THAT(table.rows[3].problem, HasSubstr("one observed value alone"));
  for (const PointStatistics& row : table.rows) EXPECT_FALSE(row.HasFigures());
  test::Require(ComputeStatistics(points, {CYbDateTime(), CYbDateTime()}, units, table).error);
  EXPECT_THAT(table.rows[3].problem, HasSubstr("no observed value"));
}

TEST_F(StatisticsReport, ManySeriesOfAFileAreReadAsEachByItself) {
  // More than are read one by one, with a gap, and one point that comes twice.
  std::vector<std::vector<float>> simulated, measured;
  for (int item = 0; item < 12; ++item) {
    simulated.emplace_back();
    for (int day = 0; day < kDays; ++day)
      simulated.back().push_back(static_cast<float>(day * item % 5) + 0.25F * static_cast<float>(item));
    measured.emplace_back(simulated.back().rbegin(), simulated.back().rend());
    measured.back()[static_cast<std::size_t>(item % kDays)] = kDeleteValue;
  }
  WriteSeries(folder.File("sim.nds0"), quantity::kElevation, simulated);
  WriteSeries(folder.File("obs.nds0"), quantity::kElevation, measured);
  for (int i = 0; i < 13; ++i) {
    DetailedPoint& point = points.emplace_back();
    point.simulated = {folder.File("sim.nds0"), i < 12 ? 12 - i : 3};
    point.observed = {folder.File("obs.nds0"), 1 + i * 5 % 12};
    point.includesObserved = i != 4;
  }
  points[6].simulated.item = 77;
  test::Require(ComputeStatistics(points, kPeriod, units, table).error);
  ASSERT_EQ(table.rows.size(), 12);
  PointComparer comparer(kPeriod, units);
  for (const PointStatistics& row : table.rows) {
    const PointComparison alone = comparer.Compare(row.point);
    EXPECT_EQ(row.problem, alone.problem);
    EXPECT_EQ(row.figures.pairs, alone.figures.pairs);
    EXPECT_EQ(row.figures.meanError, alone.figures.meanError);
    EXPECT_EQ(row.figures.correlation, alone.figures.correlation);
  }
  EXPECT_THAT(table.rows[5].problem, HasSubstr("no item 77"));
  EXPECT_EQ(table.rows[0].figures.pairs, 6);
}

TEST_F(StatisticsReport, CanBeStopped) {
  WriteBothSeries();
  test::Require(ReadDetailedPoints(WriteReport({"", ""}), points).error);
  Progress progress;
  progress.Cancel();
  EXPECT_EQ(ComputeStatistics(points, kPeriod, units, table, progress).error, kCancelled);
}

TEST_F(StatisticsReport, ReportsThatTellNoPoints) {
  const std::string missing = folder.File("none.kvf");
  EXPECT_EQ(ReadDetailedPoints(missing, points).error, "Can not open file :\n" + missing);
  const std::string torn = folder.Write("torn.kvf", "target A {\n x = \n");
  EXPECT_THAT(ReadDetailedPoints(torn, points).error, HasSubstr("Syntax error in file: \n" + torn));
  for (const char* text :
       {"target Other {\n}\n", "target Extra_Data {\n}\n",
        "target Extra_Data {\nsection DetailedTimeseriesOutput {\nNumberOfItems = 2000000000\n}\n}\n",
        "target Extra_Data {\nsection DetailedTimeseriesOutput {\nNumberOfItems = -5\n}\n}\n"}) {
    EXPECT_EQ(ReadDetailedPoints(folder.Write("empty.kvf", text), points).error, "") << text;
    EXPECT_THAT(points, IsEmpty());
  }
}

}  // namespace
}  // namespace tervane::statistics_report_test
