// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/charts/series_plot.h"

#include <QTest>
#include <cmath>
#include <limits>

#include <gmock/gmock.h>
#include <qcustomplot.h>

#include "tests/shell/plot_events.h"

namespace tervane {
namespace {

using test::Hover;
using test::Wheel;

constexpr double kGap = std::numeric_limits<double>::quiet_NaN();

Series Daily(std::string name, std::string unit, std::vector<double> values, bool isStepped = false) {
  Series series{std::move(name), std::move(unit), {}, std::move(values), isStepped};
  for (std::size_t i = 0; i < series.values.size(); ++i)
    series.times.push_back(CYbDateTime(2000, 1, 1) + CYbDateTimeSpan::Days(static_cast<double>(i)));
  return series;
}

class ShownChart {
 public:
  explicit ShownChart(SeriesContent content) : plot_(host_) {
    plot_.resize(800, 400);
    plot_.Show(std::move(content));
    plot_.show();
    for (int i = 0; i < 3; ++i) QApplication::processEvents();
  }
  SeriesPlot& Plot() { return plot_; }
  QCustomPlot& Chart() { return plot_.Chart(); }
  /// A point of the chart above a time, counted in days from the first.
  QPointF At(double days) {
    const double start = static_cast<double>(CYbDateTime(2000, 1, 1).SecondsSinceEpoch());
    return {Chart().xAxis->coordToPixel(start + days * 86400), Chart().axisRect()->center().y() + 0.0};
  }
  std::string TextAt(double days) {
    Hover(Chart(), At(days));
    return plot_.Status().toStdString();
  }

 private:
  NobodyToAsk host_;
  SeriesPlot plot_;
};

TEST(SeriesPlot, TheValuesUnderThePointerAreToldAndAStepHoldsBeforeItsTime) {
  SeriesContent content;
  content.series = {Daily("Rain", "mm", {0, 5, kGap, 7, 1}, true), Daily("Level", "m", {1, 2, 3, 4, 5})};
  ShownChart chart(std::move(content));
  EXPECT_EQ(chart.TextAt(0.4), "2000/01/02 00:00   Rain 5 mm   Level 1 m");
  EXPECT_EQ(chart.TextAt(1.4), "2000/01/03 00:00   Rain no value   Level 2 m");
  EXPECT_EQ(chart.TextAt(2.6), "2000/01/04 00:00   Rain 7 mm   Level 4 m");
  EXPECT_TRUE(chart.Chart().yAxis2->tickLabels());  // two units, two axes
  EXPECT_EQ(chart.Plot().ValuesAsText().toStdString(),
            "Time\tRain [mm]\tLevel [m]\n2000-01-01 00:00:00\t0\t1\n2000-01-02 00:00:00\t5\t2\n"
            "2000-01-03 00:00:00\t\t3\n2000-01-04 00:00:00\t7\t4\n2000-01-05 00:00:00\t1\t5\n");
}

TEST(SeriesPlot, AGapIsEmptyAlsoAmongManyValues) {
  constexpr std::size_t kValues = 100'000;
  std::vector<double> values(kValues);
  for (std::size_t i = 0; i < kValues; ++i)
    values[i] = i > 40'000 && i < 60'000 ? kGap : std::sin(static_cast<double>(i) / 50);
  for (const bool isStepped : {false, true}) {
    SCOPED_TRACE(isStepped);
    SeriesContent content;
    content.series = {Daily("Flow", "m3/s", values, isStepped)};
    ShownChart chart(std::move(content));
    const QImage picture = chart.Chart().grab().toImage();
    const QColor curve = chart.Chart().graph(0)->pen().color();
    const auto isDrawn = [&](double fromDay, double toDay) {
      for (int x = static_cast<int>(chart.At(fromDay).x()); x < chart.At(toDay).x(); ++x)
        for (int y = chart.Chart().axisRect()->top(); y < chart.Chart().axisRect()->bottom(); ++y)
          if (picture.pixelColor(x, y) == curve) return true;
      return false;
    };
    EXPECT_TRUE(isDrawn(30'000, 39'000));
    EXPECT_FALSE(isDrawn(41'000, 59'000));
    EXPECT_TRUE(isDrawn(61'000, 70'000));
  }
}

TEST(SeriesPlot, TheWheelZoomsInTimeTowardsThePointerAndHomeShowsEverything) {
  SeriesContent content;
  content.series = {Daily("Level", "m", {1, 2, 3, 4, 5})};
  content.period = {{CYbDateTime(2000, 1, 2), CYbDateTime(2000, 1, 3)}};
  ShownChart chart(std::move(content));
  // The simulated time is shaded.
  const QImage picture = chart.Chart().grab().toImage();
  EXPECT_NE(picture.pixelColor((chart.At(1.5) + QPointF(0, 60)).toPoint()),
            picture.pixelColor((chart.At(2.3) + QPointF(0, 60)).toPoint()));
  const QCPRange whole = chart.Chart().xAxis->range(), values = chart.Chart().yAxis->range();
  const double pointer = chart.At(3).x(), time = chart.Chart().xAxis->pixelToCoord(pointer);
  Wheel(chart.Chart(), chart.At(3), 4);
  EXPECT_LT(chart.Chart().xAxis->range().size(), whole.size() / 1.5);
  EXPECT_NEAR(chart.Chart().xAxis->pixelToCoord(pointer), time, 600);
  EXPECT_EQ(chart.Chart().yAxis->range(), values);
  QTest::keyClick(&chart.Chart(), Qt::Key_Home);
  EXPECT_EQ(chart.Chart().xAxis->range(), whole);
}

TEST(SeriesPlot, NothingToShowShowsItsMessageUntilThereIsSomething) {
  SeriesContent content;
  content.message = "No time series is chosen.";
  ShownChart chart(content);
  const auto* message = chart.Chart().findChild<QLabel*>();
  EXPECT_TRUE(message->isVisible());
  EXPECT_EQ(message->text(), "No time series is chosen.");
  EXPECT_EQ(message->size(), chart.Chart().size());
  content.series = {Daily("Level", "m", {1, 2})};
  chart.Plot().Show(content);
  EXPECT_FALSE(message->isVisible());
}

}  // namespace
}  // namespace tervane
