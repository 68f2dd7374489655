// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/run_comparison_view.h"

#include <QLabel>
#include <QTableWidget>

#include <gmock/gmock.h>

#include "shell/difference_list.h"
#include "tests/shell/next_answer.h"
#include "tests/shell/opened_setup.h"

namespace tervane::run_comparison_view_test {
namespace {

TEST(RunComparisonView, ShowsBothFiguresAndTheirDifference) {
  RunComparison comparison;
  comparison.firstTitle = "karup.tvd, 2026-11-25 10:00:00 UTC";
  comparison.secondTitle = "karup.tvd, 2026-11-26 10:00:00 UTC";
  comparison.points = {{"Mill", "Discharge", "m³/s", 0, RunStatistics{}, RunStatistics{}},
                       {"Weir", "Discharge", "m³/s", 2, {}, RunStatistics{}}};
  comparison.points[0].first->nashSutcliffe = 0.5;
  comparison.points[0].second->nashSutcliffe = 0.75;
  comparison.points[1].second->meanError = -2;
  const RunComparisonView view(comparison);
  EXPECT_EQ(view.Title(), "karup.tvd, two runs");
  const auto& table = *view.findChild<QTableWidget*>();
  const auto row = [&table](int number) {
    std::vector<std::string> texts;
    for (int column = 0; column < table.columnCount(); ++column)
      texts.push_back(FromQt(table.item(number, column)->text()));
    return texts;
  };
  EXPECT_THAT(row(0),
              testing::ElementsAre("Mill", "Discharge", "", "m³/s", "", "", "", "", "", "", "0.5", "0.75", "0.25"));
  EXPECT_THAT(row(1), testing::ElementsAre("Weir", "Discharge", "2", "m³/s", "", "-2", "", "", "", "", "", "", ""));
}

TEST(RunComparisonView, ARunThatLeftNoPassportIsTold) {
  test::OpenedSetup setup;
  test::NextAnswer answer("OK");
  EXPECT_FALSE(setup.Window().CompareRunWith(setup.Frame(), setup.Folder().File("other_Passport.kvf")));
  EXPECT_THAT(answer.Text(), testing::HasSubstr("karup_Passport.kvf is not there"));
}

}  // namespace
}  // namespace tervane::run_comparison_view_test
