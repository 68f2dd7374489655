// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/charts/time_bars.h"

#include <QApplication>

#include <gmock/gmock.h>

#include "core/host.h"
#include "shell/charts/series_plot.h"
#include "tests/shell/plot_events.h"

namespace tervane::time_bars_test {
namespace {

CYbDateTime Day(int day) { return CYbDateTime(2001, 1, 1) + CYbDateTimeSpan::Days(day); }

/// A curve over 100 days below maize for 40 days, rye from day 30 on, and nothing from day 60 on.
SeriesContent Crops() {
  SeriesContent content;
  content.series = {{"LAI", "-", {Day(0), Day(100)}, {0, 5}}};
  content.bars = {{"Maize", Day(0), Day(40)},
                  {"Rye", Day(30), Day(60)},
                  {"too early", Day(30), Day(40), TimeBar::Kind::Overlap},
                  {"no crop", Day(60), Day(100), TimeBar::Kind::Gap},
                  {"no date", CYbDateTime(), Day(10)}};
  return content;
}

class TimeBars : public testing::Test {
 protected:
  TimeBars() {
    plot_.resize(800, 400);
    Show(Crops());
    plot_.show();
    QApplication::processEvents();
  }
  void Show(SeriesContent content) {
    plot_.Show(std::move(content));
    for (int i = 0; i < 3; ++i) QApplication::processEvents();
  }
  QList<QCPAxisRect*> Rects() { return plot_.Chart().axisRects(); }
  std::string StatusAt(double day) {
    const double at = static_cast<double>(CYbDateTime(2001, 1, 1).SecondsSinceEpoch()) + day * 86400;
    const QPointF point(plot_.Chart().xAxis->coordToPixel(at), plot_.Chart().axisRect()->center().y());
    test::Hover(plot_.Chart(), point);
    return plot_.Status().toStdString();
  }
  QColor ColorAt(double day) {
    const double at = static_cast<double>(CYbDateTime(2001, 1, 1).SecondsSinceEpoch()) + day * 86400;
    const QImage image = plot_.Chart().toPixmap(plot_.Chart().width(), plot_.Chart().height()).toImage();
    return image.pixelColor(static_cast<int>(plot_.Chart().xAxis->coordToPixel(at)),
                            plot_.Chart().axisRect()->bottom() - 2);
  }

  NobodyToAsk host_;
  SeriesPlot plot_{host_};
};

TEST_F(TimeBars, StandInAStripAboveTheCurvesAndAreToldAtThePointer) {
  ASSERT_EQ(Rects().size(), 2);
  EXPECT_LT(Rects()[0]->height() * 5, Rects()[1]->height());
  EXPECT_LT(Rects()[0]->bottom(), Rects()[1]->top());
  const std::pair<double, const char*> cases[] = {
      {10, "Maize"}, {35, "Maize, Rye, too early"}, {50, "Rye"}, {80, "no crop"}};
  for (const auto& [day, names] : cases) EXPECT_THAT(StatusAt(day), testing::EndsWith(std::string("   ") + names));
  // Each crop has a colour of its own.
  EXPECT_NE(ColorAt(28), ColorAt(58));
}

TEST_F(TimeBars, ThingsAtOnceStandBelowEachOtherWhereNoOverlapTellsOfThem) {
  EXPECT_EQ(TimeBarPlottable::LanesOf(Crops().bars), 1);
  const int oneLine = Rects()[0]->height();
  SeriesContent sources = Crops();
  sources.bars = {{"North", Day(0), Day(100)}, {"South", Day(0), Day(40)}, {"West", Day(40), Day(60)}};
  EXPECT_EQ(TimeBarPlottable::LanesOf(sources.bars), 2);
  Show(std::move(sources));
  EXPECT_EQ(Rects()[0]->height(), 2 * oneLine);
  // In one lane they would have one colour, that of what lies above the other.
  EXPECT_NE(ColorAt(20), ColorAt(50));
  EXPECT_THAT(StatusAt(50), testing::EndsWith("North, West"));
}

TEST_F(TimeBars, ComeAndGoWithTheContent) {
  SeriesContent without = Crops();
  without.bars.clear();
  Show(std::move(without));
  ASSERT_EQ(Rects().size(), 1);
  EXPECT_GT(Rects()[0]->height(), 200);
  EXPECT_THAT(StatusAt(10), testing::EndsWith("LAI 0 -"));
  Show(Crops());
  EXPECT_EQ(Rects().size(), 2);
  // Zooming moves strip and curves together.
  plot_.Zoom(4);
  EXPECT_EQ(Rects()[0]->axis(QCPAxis::atBottom)->range(), Rects()[1]->axis(QCPAxis::atBottom)->range());
}

}  // namespace
}  // namespace tervane::time_bars_test
