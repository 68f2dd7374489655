// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/run_comparison.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "core/kvf.h"
#include "data/datafile_writer.h"
#include "execution/run_passport.h"
#include "tests/support/data_files.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::run_comparison_test {
namespace {

using testing::HasSubstr;
using testing::IsEmpty;
using testing::SizeIs;

void WriteSeries(const std::string& path, const std::vector<float>& values) {
  NewDataFile content;
  content.dimensions = 0;
  content.items = {{"Discharge", quantity::kDischarge, BaseUnit(*FindItemType(quantity::kDischarge)).key, {}}};
  DataFileWriter writer;
  test::Require(writer.Create(path, content));
  for (std::size_t day = 0; day < values.size(); ++day) {
    test::Require(writer.AddStep(CYbDateTime(2000, 1, 1 + static_cast<int>(day))));
    test::Require(writer.Put(1, {&values[day], 1}));
  }
  test::Require(writer.Finish().error);
}

struct TwoRuns : testing::Test {
  test::TempFolder folder;

  /// What a run leaves: its passport, its setup, and a report that names points.
  ComparedRun Leave(const std::string& name, std::string_view sections, const std::vector<std::string>& points,
                    const std::vector<float>& simulated) {
    const ComparedRun files = ComparedRunOf(folder.File(name + "_Passport.kvf"));
    RunPassport passport;
    passport.id = name;
    passport.setup = folder.File(name + ".tvd");
    passport.begun = "2026-11-26 14:00:05";
    EXPECT_EQ(WritePassport(passport, files.passport).error, "");
    folder.Write(name + "_Passport.tvd", test::SetupText(14, sections));
    WriteSeries(folder.File(name + ".nds0"), simulated);
    WriteSeries(folder.File("observed.nds0"), {1, 2, 4, 8});
    std::vector<DetailedPoint> all;
    for (const std::string& point : points)
      all.push_back({point,
                     "Discharge",
                     0,
                     0,
                     1,
                     1,
                     0,
                     {folder.File(name + ".nds0"), 1},
                     true,
                     {folder.File("observed.nds0"), 1}});
    KvfFile* report = kvfCreate();
    kvfAddTarget(report, "Extra_Data");
    WriteDetailedPoints(report, all, folder.Path());
    kvfEndSection(report);
    kvfWrite(report, files.report);
    kvfClose(&report);
    return files;
  }
  static std::string Period(int startDay, int endDay) {
    return fmt::format(
        "section SimSpec {{ section SimulationPeriod {{ SIMSTART = 2000, 1, {}, 0, 0\n SIMEND = 2000, 1, {}, 0, 0\n }} "
        "}}",
        startDay, endDay);
  }
  static RunComparison Compared(const ComparedRun& first, const ComparedRun& second) {
    RunComparison comparison;
    EXPECT_EQ(ReadRuns(first, second, comparison).error, "");
    EXPECT_EQ(CompareFigures({}, comparison).error, "");
    return comparison;
  }
};

TEST_F(TwoRuns, FiguresAreMadeInTheTimeThatBothSimulate) {
  const ComparedRun first = Leave("first", Period(1, 4), {"Bridge", "Mill"}, {1, 2, 4, 8});
  const ComparedRun second = Leave("second", Period(2, 9), {"Mill", "Weir"}, {9, 3, 5, 9});
  const RunComparison comparison = Compared(first, second);
  EXPECT_EQ(comparison.firstTitle, "first.tvd, 2026-11-26 14:00:05 UTC");
  EXPECT_THAT(comparison.differences, testing::Not(IsEmpty()));
  EXPECT_EQ(comparison.period, (ComparedPeriod{CYbDateTime(2000, 1, 2), CYbDateTime(2000, 1, 4)}));
  EXPECT_EQ(comparison.pointsProblem, "");
  ASSERT_THAT(comparison.points, SizeIs(3));
  EXPECT_EQ(comparison.points[0].name, "Bridge");
  EXPECT_FALSE(comparison.points[0].second);
  EXPECT_FALSE(comparison.points[0].Difference(&RunStatistics::meanError));
  EXPECT_EQ(comparison.points[1].name, "Mill");
  EXPECT_EQ(comparison.points[1].first->pairs, 3U);
  EXPECT_EQ(comparison.points[1].Difference(&RunStatistics::meanError), -1);
  EXPECT_EQ(comparison.points[1].Difference(&RunStatistics::rootMeanSquareError), 1);
  EXPECT_EQ(comparison.points[2].name, "Weir");
  EXPECT_FALSE(comparison.points[2].first);
}

TEST_F(TwoRuns, WhatOneOfThemLacksIsTold) {
  const ComparedRun whole = Leave("whole", Period(1, 4), {"Mill"}, {1, 2, 4, 8});
  const ComparedRun later = Leave("later", Period(10, 14), {"Mill"}, {1, 2, 4, 8});
  EXPECT_THAT(Compared(whole, later).pointsProblem, HasSubstr("no time in common"));
  const ComparedRun none = Leave("none", Period(1, 4), {}, {1, 2, 4, 8});
  EXPECT_THAT(Compared(none, none).pointsProblem, HasSubstr("Neither run has a point"));
  EXPECT_THAT(Compared(none, none).differences, IsEmpty());
  std::filesystem::remove(none.report);
  EXPECT_THAT(Compared(whole, none).pointsProblem, HasSubstr("none_PreProcessed.kvf"));
  EXPECT_THAT(Compared(whole, none).points, SizeIs(1));
  std::filesystem::remove(none.setup);
  EXPECT_THAT(Compared(whole, none).setupProblem, HasSubstr("none_Passport.tvd"));
  RunComparison comparison;
  EXPECT_THAT(ReadRuns(whole, ComparedRunOf(folder.File("gone_Passport.kvf")), comparison).error,
              HasSubstr("gone_Passport.kvf"));
  folder.Write("odd_Passport.kvf", "no passport");
  EXPECT_THAT(ReadRuns(ComparedRunOf(folder.File("odd_Passport.kvf")), whole, comparison).error,
              HasSubstr("odd_Passport.kvf"));
}

}  // namespace
}  // namespace tervane::run_comparison_test
