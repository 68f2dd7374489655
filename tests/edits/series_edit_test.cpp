// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "edits/series_edit.h"

#include <cmath>

#include <gmock/gmock.h>

#include "data/datafile_writer.h"
#include "platform/text.h"
#include "tests/support/data_files.h"
#include "tests/support/temp_folder.h"

namespace tervane::series_edit_test {
namespace {

using test::Require;
using test::TempFolder;
using testing::ElementsAre;
using testing::HasSubstr;

constexpr float kNo = kDeleteValue;
const RowSpan kAll{0, 1000};

/// Two series of five days, a level (of moments) and rain (over the step), from 2000-01-01 on.
class SeriesEditTest : public testing::Test {
 public:
  TempFolder folder;
  std::string path = folder.File("a.nds0");

  SeriesEditTest() { Make({10, 20, kNo, 40, kNo}, {1, 2, 3, 4, 5}); }
  void Make(const std::vector<float>& level, const std::vector<float>& rain, bool isCompressed = false) const {
    NewDataFile content;
    content.dimensions = 0;
    content.items = {{"Level", quantity::kElevation, 1000, {}},
                     {"Rain", quantity::kRainfall, 1002, ValueType::StepAccumulated}};
    content.isCompressed = isCompressed;
    DataFileWriter writer;
    Require(writer.Create(path, content));
    for (std::size_t i = 0; i < level.size(); ++i) {
      Require(writer.AddStep(Day(1) + CYbDateTimeSpan{static_cast<std::int64_t>(i) * 86400}));
      Require(writer.Put(1, {&level[i], 1}));
      Require(writer.Put(2, {&rain[i], 1}));
    }
    Require(writer.Finish().error);
  }
  static CYbDateTime Day(int day, int hour = 0) { return {2000, 1, day, hour}; }
};

/// Rows as text: "01 00:00 10 1", a missing value as "-".
std::vector<std::string> Lines(const SeriesEdit& edit) {
  std::vector<std::string> lines;
  for (std::size_t row = 0; row < edit.Rows(); ++row) {
    lines.push_back(edit.TimeOf(row).Format("%d %H:%M"));
    for (std::size_t series = 0; series < edit.SeriesCount(); ++series) {
      const float value = edit.ValueOf(series, row);
      lines.back() += value == kNo ? " -" : " " + ShortestNumber(value);
    }
  }
  return lines;
}

TEST_F(SeriesEditTest, EachOperationIsOneStepThatIsTakenBackAndSaved) {
  std::string note;
  struct Row {
    const char* name;
    std::function<std::string(SeriesEdit&)> change;
    std::vector<std::string> expected;
  };
  const Row rows[] = {
      {"Change Value",
       [](SeriesEdit& edit) { return edit.SetValue(0, 2, 30); },
       {"01 00:00 10 1", "02 00:00 20 2", "03 00:00 30 3", "04 00:00 40 4", "05 00:00 - 5"}},
      {"Delete Values",
       [](SeriesEdit& edit) {
         return edit.DeleteValues({1, 2}, {0, 1});
       },
       {"01 00:00 10 1", "02 00:00 - -", "03 00:00 - -", "04 00:00 40 4", "05 00:00 - 5"}},
      {"Scale",
       [](SeriesEdit& edit) {
         return edit.Scale({0, 3}, {0}, 2, 1);
       },
       {"01 00:00 21 1", "02 00:00 41 2", "03 00:00 - 3", "04 00:00 40 4", "05 00:00 - 5"}},
      {"Fill Gaps",
       [](SeriesEdit& edit) {
         return edit.FillGaps(kAll, {0, 1}, GapFill::Linear, 0);
       },
       {"01 00:00 10 1", "02 00:00 20 2", "03 00:00 30 3", "04 00:00 40 4", "05 00:00 - 5"}},
      {"Fill Gaps",
       [](SeriesEdit& edit) { return edit.FillGaps(kAll, {0}, GapFill::Previous, 0); },
       {"01 00:00 10 1", "02 00:00 20 2", "03 00:00 20 3", "04 00:00 40 4", "05 00:00 40 5"}},
      {"Fill Gaps",
       [](SeriesEdit& edit) {
         return edit.FillGaps({4, 1}, {0}, GapFill::Constant, 7);
       },
       {"01 00:00 10 1", "02 00:00 20 2", "03 00:00 - 3", "04 00:00 40 4", "05 00:00 7 5"}},
      {"Change Time",
       [](SeriesEdit& edit) { return edit.SetTime(1, Day(2, 6)); },
       {"01 00:00 10 1", "02 06:00 20 2", "03 00:00 - 3", "04 00:00 40 4", "05 00:00 - 5"}},
      {"Insert Row",
       [](SeriesEdit& edit) { return edit.InsertRow(1); },
       {"01 00:00 10 1", "01 12:00 - -", "02 00:00 20 2", "03 00:00 - 3", "04 00:00 40 4", "05 00:00 - 5"}},
      {"Insert Row",
       [](SeriesEdit& edit) { return edit.InsertRow(99); },
       {"01 00:00 10 1", "02 00:00 20 2", "03 00:00 - 3", "04 00:00 40 4", "05 00:00 - 5", "06 00:00 - -"}},
      {"Delete Rows",
       [](SeriesEdit& edit) {
         return edit.DeleteRows({0, 2});
       },
       {"03 00:00 - 3", "04 00:00 40 4", "05 00:00 - 5"}},
      {"Cut to Period",
       [](SeriesEdit& edit) { return edit.Cut(Day(2), Day(3, 12)); },
       {"02 00:00 20 2", "03 00:00 - 3"}},
      {"Shift Times",
       [](SeriesEdit& edit) { return edit.ShiftTimes(7200, 1); },
       {"01 02:00 10 1", "02 02:00 20 2", "03 02:00 - 3", "04 02:00 40 4", "05 02:00 - 5"}},
      {"Resample",
       [](SeriesEdit& edit) {
         return edit.ResampleTo({2 * 86400, 0});
       },
       {"02 00:00 20 3", "04 00:00 40 7"}},
      {"Paste",
       [&](SeriesEdit& edit) { return edit.Paste(2, 0, "31\t3.5\n\t4.5\n", note); },
       {"01 00:00 10 1", "02 00:00 20 2", "03 00:00 31 3.5", "04 00:00 - 4.5", "05 00:00 - 5"}},
      {"Paste",
       [&](SeriesEdit& edit) {
         return edit.Paste(0, 1, "Time\tRain\n2000-01-02\t22\n2000-01-01 06:00\t11\n2000/01/07 00:00:00\t77", note);
       },
       {"01 00:00 10 1", "01 06:00 - 11", "02 00:00 20 22", "03 00:00 - 3", "04 00:00 40 4", "05 00:00 - 5",
        "07 00:00 - 77"}},
  };
  for (const bool isCompressed : {false, true})
    for (const Row& row : rows) {
      SCOPED_TRACE(row.name);
      Make({10, 20, kNo, 40, kNo}, {1, 2, 3, 4, 5}, isCompressed);
      SeriesEdit edit(path);
      ASSERT_EQ(edit.Problem(), "");
      const std::vector<std::string> before = Lines(edit);
      ASSERT_EQ(row.change(edit), "");
      EXPECT_EQ(Lines(edit), row.expected);
      EXPECT_EQ(edit.UndoName(), row.name);
      EXPECT_TRUE(edit.IsModified());
      ASSERT_EQ(edit.Undo(), "");
      EXPECT_EQ(Lines(edit), before);
      EXPECT_FALSE(edit.IsModified());
      ASSERT_EQ(edit.Redo(), "");
      EXPECT_EQ(Lines(edit), row.expected);
      ASSERT_EQ(edit.Save(path).error, "");
      EXPECT_FALSE(edit.IsOtherOnDisk());
      const SeriesEdit saved(path);
      EXPECT_EQ(Lines(saved), row.expected);
      EXPECT_EQ(saved.ItemOf(1).valueType, ValueType::StepAccumulated);
      // And back again beyond the save.
      ASSERT_EQ(edit.Undo(), "");
      ASSERT_EQ(edit.Save(path).error, "");
      EXPECT_EQ(Lines(SeriesEdit(path)), before);
    }
}

TEST_F(SeriesEditTest, WhatCannotBeIsRefusedAndChangesNothing) {
  SeriesEdit edit(path);
  std::string note;
  const std::vector<std::string> before = Lines(edit);
  EXPECT_THAT(edit.SetTime(1, Day(3)), HasSubstr("next row"));
  EXPECT_THAT(edit.SetTime(1, Day(1)), HasSubstr("row before"));
  EXPECT_THAT(edit.SetTime(1, CYbDateTime(2000, 13, 1)), HasSubstr("date"));
  EXPECT_THAT(edit.DeleteRows(kAll), HasSubstr("needs a row"));
  EXPECT_THAT(edit.Cut(Day(20), Day(30)), HasSubstr("no row"));
  EXPECT_THAT(edit.Cut(Day(3), Day(2)), HasSubstr("later"));
  EXPECT_THAT(edit.Scale(kAll, {0}, 1e38, 1), HasSubstr("too large"));
  EXPECT_THAT(edit.SetValue(0, 0, std::nanf("")), HasSubstr("number"));
  EXPECT_THAT(edit.ShiftTimes(0, 12 * 9000), HasSubstr("years"));
  EXPECT_THAT(edit.ResampleTo({}), HasSubstr("step"));
  EXPECT_THAT(edit.Paste(3, 0, "1\n2\n3\n", note), HasSubstr("2 rows"));
  EXPECT_THAT(edit.Paste(0, 1, "1\t2\n", note), HasSubstr("more values"));
  EXPECT_THAT(edit.Paste(0, 0, "1\nx\n", note), HasSubstr("line 2: x is no number"));
  EXPECT_THAT(edit.Paste(0, 0, "", note), HasSubstr("no numbers"));
  EXPECT_THAT(edit.Paste(0, 0, "2000-01-01\t1\n2000-01-01\t2\n", note), HasSubstr("two lines"));
  EXPECT_EQ(Lines(edit), before);
  EXPECT_FALSE(edit.CanUndo());
  EXPECT_EQ(edit.StepSeconds(), 86400);
  EXPECT_EQ(edit.Statistics(0, kAll).count, 3u);
  EXPECT_EQ(edit.Statistics(1, {1, 2}).sum, 5);
}

TEST_F(SeriesEditTest, OneChangedValueCostsOneValueOfUndo) {
  Make(std::vector<float>(2000, 1), std::vector<float>(2000, 2));
  SeriesEdit edit(path);
  ASSERT_EQ(edit.SetValue(0, 7, 3), "");
  ASSERT_EQ(edit.FillGaps(kAll, {0, 1}, GapFill::Linear, 0), "");
  EXPECT_EQ(edit.UndoName(), "Change Value");
  EXPECT_LT(edit.BytesOfSteps(), 500u);
}

TEST_F(SeriesEditTest, MonthsThatAreTooShortAreTold) {
  SeriesEdit edit(path);
  std::string note;
  ASSERT_EQ(edit.Paste(0, 0, "2000-01-30\t1\n2000-01-31\t2\n", note), "");
  EXPECT_THAT(note, HasSubstr("2 rows were added"));
  EXPECT_THAT(edit.ShiftTimes(0, 1), HasSubstr("2000-02-29"));
  EXPECT_EQ(edit.UndoName(), "Paste");
}

TEST_F(SeriesEditTest, AFileThatWasTakenAwayIsSavedAll) {
  SeriesEdit edit(path);
  ASSERT_EQ(edit.InsertRow(1), "");
  std::remove(path.c_str());
  EXPECT_TRUE(edit.IsOtherOnDisk());
  ASSERT_EQ(edit.Save(path).error, "");
  EXPECT_EQ(Lines(SeriesEdit(path)), Lines(edit));
}

}  // namespace
}  // namespace tervane::series_edit_test
