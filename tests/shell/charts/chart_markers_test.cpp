// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/charts/chart_markers.h"

#include <QTest>
#include <optional>

#include <gmock/gmock.h>
#include <qcustomplot.h>

#include "shell/charts/series_plot.h"

namespace tervane::chart_markers_test {
namespace {

CYbDateTime Day(int day) { return CYbDateTime(2000, 1, 1) + CYbDateTimeSpan::Days(day); }

class ShownYear {
 public:
  ShownYear() {
    Series series{"Level", "m", {}, {}};
    for (int day = 0; day < 100; ++day) {
      series.times.push_back(Day(day));
      series.values.push_back(day % 7);
    }
    content.series = {series};
  }
  void Show() {
    plot.resize(900, 400);
    plot.Show(content);
    plot.show();
    for (int i = 0; i < 3; ++i) QApplication::processEvents();
  }
  QPoint At(int day) const {
    const double place = static_cast<double>(Day(day).SecondsSinceEpoch());
    return {static_cast<int>(plot.Chart().xAxis->coordToPixel(place)), plot.Chart().axisRect()->center().y()};
  }
  void Drag(int from, int to) {
    QTest::mousePress(&plot.Chart(), Qt::LeftButton, {}, At(from));
    QTest::mouseMove(&plot.Chart(), At(to));
    QTest::mouseRelease(&plot.Chart(), Qt::LeftButton, {}, At(to));
  }

  NobodyToAsk host;
  SeriesPlot plot{host};
  SeriesContent content;
};

TEST(ChartMarkers, AMarkerIsDraggedToAWholeDayWhereThePageTakesIt) {
  std::optional<CYbDateTime> moved;
  ShownYear year;
  year.content.markers = {{"Sowing", Day(20), [&](const CYbDateTime& time) { moved = time; }}, {"Fixed", Day(60)}};
  year.Show();
  const QCPRange shown = year.plot.Chart().xAxis->range();
  year.Drag(20, 31);
  ASSERT_TRUE(moved.has_value());
  EXPECT_LE(std::abs((*moved - Day(31)).InDays()), 1);
  EXPECT_EQ(moved->SecondsSinceEpoch() % 86400, 0);
  EXPECT_EQ(year.plot.Chart().xAxis->range(), shown);
  // Shown anew with the page's own words for the move; a marker that none takes stays, and the chart moves.
  moved.reset();
  year.content.markers[0].time = Day(31);
  year.plot.Show(year.content);
  year.Drag(31, 31);
  EXPECT_FALSE(moved.has_value());
  year.Drag(60, 70);
  EXPECT_FALSE(moved.has_value());
  EXPECT_NE(year.plot.Chart().xAxis->range(), shown);
}

TEST(ChartMarkers, ADateIsAskedForUntilAClickOrEsc) {
  std::vector<CYbDateTime> taken;
  int left = 0;
  ShownYear year;
  year.content.request =
      DateRequest{"Click the harvest.", [&](const CYbDateTime& time) { taken.push_back(time); }, [&] { ++left; }};
  year.Show();
  year.Drag(20, 40);  // moves the chart
  EXPECT_TRUE(taken.empty());
  QTest::mouseClick(&year.plot.Chart(), Qt::LeftButton, {}, year.At(50));
  ASSERT_EQ(taken.size(), 1U);
  EXPECT_LE(std::abs((taken[0] - Day(50)).InDays()), 1);
  QTest::mouseClick(&year.plot.Chart(), Qt::LeftButton, {}, year.At(55));
  EXPECT_EQ(taken.size(), 1U);
  year.plot.Show(year.content);
  QTest::keyClick(&year.plot.Chart(), Qt::Key_Escape);
  EXPECT_EQ(left, 1);
  QTest::mouseClick(&year.plot.Chart(), Qt::LeftButton, {}, year.At(55));
  EXPECT_EQ(taken.size(), 1U);
  // Without a mouse: at the reading mark.
  year.content.request->prompt = "Click the sowing.";
  year.plot.Show(year.content);
  QTest::keyClick(&year.plot.Chart(), Qt::Key_Return);
  EXPECT_EQ(taken.size(), 1U) << "nothing is pointed at";
  for (int i = 0; i < 3; ++i) QTest::keyClick(&year.plot.Chart(), Qt::Key_Left, Qt::ControlModifier);
  QTest::keyClick(&year.plot.Chart(), Qt::Key_Return);
  ASSERT_EQ(taken.size(), 2U);
  EXPECT_LT(taken[1], Day(50));
  EXPECT_GT(taken[1], Day(10));
}

}  // namespace
}  // namespace tervane::chart_markers_test
