// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/charts/series_plot.h"

#include <QClipboard>
#include <QLineEdit>
#include <QListWidget>
#include <QScrollBar>
#include <QTest>
#include <algorithm>
#include <cmath>
#include <functional>
#include <limits>
#include <set>
#include <string>
#include <vector>

#include <fmt/format.h>
#include <gmock/gmock.h>
#include <qcustomplot.h>

#include "shell/charts/chart_style.h"
#include "shell/charts/series_chooser.h"
#include "shell/widgets/layer_colors.h"
#include "tests/shell/plot_events.h"

namespace tervane::series_plot_test {
namespace {

using test::Hover;
using test::Wheel;
using testing::ElementsAre;

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

TEST(SeriesPlot, KeysPointAtOneValueAfterTheOther) {
  SeriesContent content;
  content.series = {Daily("Level", "m", {1, 2, 3, 4, 5})};
  ShownChart chart(content);
  const auto move = [&](Qt::Key key) {
    QTest::keyClick(&chart.Chart(), key, Qt::ControlModifier);
    return chart.Plot().Status().toStdString();
  };
  EXPECT_EQ(move(Qt::Key_Right), chart.Plot().TextAt(chart.Chart().xAxis->range().center()).toStdString());
  EXPECT_EQ(move(Qt::Key_Right), "2000/01/04 00:00   Level 4 m");
  EXPECT_EQ(move(Qt::Key_Left), "2000/01/03 00:00   Level 3 m");
  EXPECT_EQ(move(Qt::Key_Left), "2000/01/02 00:00   Level 2 m");
  // What is seen goes along.
  chart.Plot().Zoom(4);
  move(Qt::Key_Right);
  const QCPRange seen = chart.Chart().xAxis->range();
  EXPECT_EQ(move(Qt::Key_Right), "2000/01/04 00:00   Level 4 m");
  EXPECT_NE(chart.Chart().xAxis->range(), seen);
  Hover(chart.Chart(), {2, 2});
  EXPECT_EQ(chart.Plot().Status(), "");
}

TEST(SeriesPlot, TheListOfFurtherSeriesIsSearchedAndWhatIsCheckedIsLaidOverTheChart) {
  std::vector<SeriesOffer> offers;
  for (int i = 0; i < 30; ++i) offers.push_back({"Gauge " + std::to_string(i), i < 20 ? "Stations" : "File", "f", i});
  std::vector<SeriesOffer> chosen;
  const auto isShown = [&](const SeriesOffer& offer) {
    return std::ranges::any_of(chosen, [&](const SeriesOffer& other) { return other.IsSame(offer); });
  };
  const auto content = [&] {
    SeriesContent made;
    made.series = {Daily("Rain", "mm", {0, 5, 3, 7, 1})};
    for (const SeriesOffer& offer : chosen) {
      made.series.push_back(Daily(offer.name, "mm", {1, 2, 3, 4, 5}));
      made.series.back().color = 5;
    }
    made.choice = SeriesChoice{[&] { return offers; }, isShown,
                               [&](const SeriesOffer& offer, bool shown) {
                                 std::erase_if(chosen, [&](const SeriesOffer& other) { return other.IsSame(offer); });
                                 if (shown) chosen.push_back(offer);
                               },
                               [](Host&) { return false; }};
    return made;
  };
  ShownChart chart({});
  auto* button = chart.Plot().findChild<SeriesChooser*>();
  EXPECT_FALSE(button->isVisible());
  chart.Plot().ShowWhenThere(content);
  ASSERT_TRUE(button->isVisible());
  chart.Plot().Zoom(4);
  const QCPRange zoomed = chart.Chart().xAxis->range();
  button->click();
  auto* list = chart.Plot().findChild<QListWidget*>();
  ASSERT_TRUE(list);
  ASSERT_EQ(list->count(), 32) << "two heads";
  QTest::keyClicks(chart.Plot().findChild<QLineEdit*>(), "gauge 25");
  int visible = 0;
  for (int row = 0; row < list->count(); ++row) visible += list->item(row)->isHidden() ? 0 : 1;
  EXPECT_EQ(visible, 2);
  list->findItems("Gauge 25", Qt::MatchExactly).front()->setCheckState(Qt::Checked);
  ASSERT_EQ(chart.Chart().graphCount(), 2);
  EXPECT_EQ(chart.Chart().graph(1)->name(), "Gauge 25 [mm]");
  EXPECT_EQ(chart.Chart().graph(1)->pen().color(), CurveColor(5, false));
  EXPECT_EQ(chart.Chart().xAxis->range(), zoomed) << "the time that is looked at stays";
  list->findItems("Gauge 25", Qt::MatchExactly).front()->setCheckState(Qt::Unchecked);
  EXPECT_EQ(chart.Chart().graphCount(), 1);
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

/// The uppermost and the lowest pixel of a colour in each column of the chart's frame; -1 where there is none.
std::vector<std::pair<int, int>> DrawnColumns(QCustomPlot& chart, const QColor& color) {
  chart.replot();
  const QImage picture = chart.grab().toImage();
  const QRect frame = chart.axisRect()->rect().adjusted(1, 1, -1, -1);
  std::vector<std::pair<int, int>> columns;
  for (int x = frame.left(); x <= frame.right(); ++x) {
    auto& [top, bottom] = columns.emplace_back(-1, -1);
    for (int y = frame.top(); y <= frame.bottom(); ++y) {
      if (picture.pixelColor(x, y) != color) continue;
      if (top < 0) top = y;
      bottom = y;
    }
  }
  return columns;
}

TEST(SeriesPlot, ManyValuesLookAsIfEachLineWereDrawn) {
  constexpr std::size_t kValues = 20'000;
  const auto values = [](const std::function<double(double)>& value) {
    std::vector<double> made(kValues);
    for (std::size_t i = 0; i < kValues; ++i) made[i] = value(static_cast<double>(i));
    return made;
  };
  const auto wave = [](double i) { return std::sin(i / 700) + 0.1 * std::sin(i * 2.3); };
  const struct {
    const char* name;
    std::vector<double> values;
    bool isStepped;
    std::size_t jump;  ///< Days without a value before the second half.
    double zoom;
  } rows[] = {
      {"a wave", values(wave), false, 0, 1},
      {"steps", values(wave), true, 0, 1},
      {"a single peak", values([](double i) { return i == 7777 ? 3 : 1; }), false, 0, 1},
      {"gaps of all lengths", values([&](double i) { return std::fmod(i, 997) < i / 30 ? kGap : wave(i); }), false, 0,
       1},
      {"steps with gaps", values([&](double i) { return std::fmod(i, 997) < i / 30 ? kGap : wave(i); }), true, 0, 1},
      {"a long line between two times", values(wave), false, 9000, 1},
      {"a long step", values(wave), true, 9000, 1},
      {"a part of the time", values(wave), false, 0, 3.3},
      {"a cliff at the edge of a part", values([](double i) { return i < 7000 ? 5 : 1; }), false, 0, 3.3},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.name);
    SeriesContent content;
    content.series = {Daily("Flow", "m3/s", row.values, row.isStepped)};
    for (std::size_t i = kValues / 2; i < kValues; ++i)
      content.series[0].times.Change()[i] =
          content.series[0].times[i] + CYbDateTimeSpan::Days(static_cast<double>(row.jump));
    ShownChart shown(std::move(content));
    QCustomPlot& chart = shown.Chart();
    shown.Plot().Zoom(row.zoom);
    QCPGraph* const ours = chart.graph(0);
    const auto found = DrawnColumns(chart, ours->pen().color());
    ours->setVisible(false);
    QCPGraph* const plain = chart.addGraph();
    plain->setData(ours->data());
    plain->setPen(ours->pen());
    plain->setBrush(ours->brush());
    plain->setAdaptiveSampling(false);
    plain->setAntialiased(false);
    const auto expected = DrawnColumns(chart, plain->pen().color());
    // Where a line ends between two pixels either may be taken, so that a column is compared with it and its
    // neighbours.
    const auto around = [](const std::vector<std::pair<int, int>>& columns, std::size_t i) {
      std::pair<int, int> all(-1, -1);
      for (std::size_t k = i > 0 ? i - 1 : 0; k < std::min(i + 2, columns.size()); ++k) {
        if (columns[k].first < 0) continue;
        all.first = all.first < 0 ? columns[k].first : std::min(all.first, columns[k].first);
        all.second = std::max(all.second, columns[k].second);
      }
      return all;
    };
    const auto isWithin = [](const std::pair<int, int>& column, const std::pair<int, int>& other) {
      return column.first < 0 ||
             (other.first >= 0 && column.first >= other.first - 1 && column.second <= other.second + 1);
    };
    int drawn = 0, different = 0;
    for (std::size_t i = 0; i < found.size(); ++i) {
      drawn += expected[i].first >= 0;
      different += !isWithin(found[i], around(expected, i)) || !isWithin(expected[i], around(found, i));
    }
    EXPECT_GT(drawn, 300);
    EXPECT_EQ(different, 0);
  }
}

TEST(SeriesPlot, AValueBetweenTwoGapsIsSeen) {
  for (const std::size_t count : {100U, 20'000U}) {
    for (const bool isStepped : {false, true}) {
      SCOPED_TRACE(testing::Message() << count << " values, stepped " << isStepped);
      std::vector<double> values(count, kGap);
      const std::size_t lone = count / 3;
      values[0] = values[1] = 1;  // from here on the chart shows
      values[lone] = 2;
      for (std::size_t i = count / 2; i < count; ++i) values[i] = 1 + static_cast<double>(i % 3);
      SeriesContent content;
      content.series = {Daily("Flow", "m3/s", values, isStepped)};
      ShownChart shown(std::move(content));
      // Smoothed lines mix their colour with the ground's.
      shown.Chart().graph(0)->setAntialiased(false);
      const auto found = DrawnColumns(shown.Chart(), shown.Chart().graph(0)->pen().color());
      const auto column =
          static_cast<std::size_t>(shown.At(static_cast<double>(lone)).x() - shown.Chart().axisRect()->left());
      EXPECT_TRUE(found[column].first >= 0 || found[column - 1].first >= 0) << column;
    }
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

TEST(SeriesPlot, ChartsBelowEachOtherShareTheirTimeAndHaveAxesOfTheirOwn) {
  SeriesContent content;
  content.series = {Daily("Level", "m", {1, 2, 3, 4, 5}), Daily("Rain", "mm", {0, 5, 2, 7, 1}, true),
                    Daily("Flow", "m3/s", {30, 20, 10, 20, 30})};
  content.series[1].panel = content.series[2].panel = 1;
  ShownChart chart(content);
  ASSERT_EQ(chart.Chart().axisRectCount(), 2);
  QCPAxisRect &upper = *chart.Chart().axisRect(0), &lower = *chart.Chart().axisRect(1);
  EXPECT_EQ(upper.left(), lower.left());
  EXPECT_EQ(upper.right(), lower.right());
  EXPECT_LT(upper.bottom(), lower.top());
  EXPECT_FALSE(upper.axis(QCPAxis::atBottom)->tickLabels());
  EXPECT_TRUE(lower.axis(QCPAxis::atBottom)->tickLabels());
  EXPECT_EQ(lower.axis(QCPAxis::atRight)->label(), "m3/s");
  EXPECT_LT(upper.axis(QCPAxis::atLeft)->range().upper, 7);
  // Zoomed in either, both move.
  const QPointF inLower(chart.At(3).x(), lower.center().y());
  Wheel(chart.Chart(), inLower, 3);
  EXPECT_EQ(upper.axis(QCPAxis::atBottom)->range(), lower.axis(QCPAxis::atBottom)->range());
  EXPECT_LT(upper.axis(QCPAxis::atBottom)->range().size(), 3 * 86400);
  Hover(chart.Chart(), inLower);
  // One chart again, with nothing left of the other.
  content.series.pop_back();
  content.series[1].panel = 0;
  chart.Plot().Show(content);
  EXPECT_EQ(chart.Chart().axisRectCount(), 1);
  EXPECT_TRUE(chart.Chart().xAxis->tickLabels());
}

TEST(SeriesPlot, OfManyChartsThoseInSightAreMadeAndTheOthersAreScrolledTo) {
  constexpr int kPanels = 30;
  SeriesContent content;
  for (int panel = 0; panel < kPanels; ++panel) {
    Series& series = content.series.emplace_back(Daily(fmt::format("Well {}", panel + 1), "m", {1.0 * panel, 2, 3}));
    series.panel = panel;
  }
  // The last one is later than all others.
  content.series.back().times = {CYbDateTime(2000, 1, 1), CYbDateTime(2000, 1, 5), CYbDateTime(2000, 1, 11)};
  content.markers = {{.name = "1", .time = CYbDateTime(2000, 1, 2)}};
  ShownChart chart(content);
  SeriesPlot& plot = chart.Plot();
  const auto shown = [&] {
    std::vector<std::string> names;
    for (int i = 0; i < chart.Chart().graphCount(); ++i) names.push_back(chart.Chart().graph(i)->name().toStdString());
    return names;
  };
  auto* const bar = plot.findChild<QScrollBar*>();
  ASSERT_TRUE(bar->isVisible());
  EXPECT_THAT(shown(), ElementsAre("Well 1 [m]", "Well 2 [m]", "Well 3 [m]", "Well 4 [m]"));
  // All of them decide what is shown of the time, and a table has all.
  EXPECT_EQ(chart.Chart().xAxis->range().size(), 10 * 86400);
  EXPECT_THAT(plot.ValuesAsText().toStdString(), testing::HasSubstr("Well 30 [m]"));
  const QColor secondColor = chart.Chart().graph(1)->pen().color();

  plot.Zoom(2);
  const QCPRange seen = chart.Chart().xAxis->range();
  bar->setValue(1);
  EXPECT_THAT(shown(), ElementsAre("Well 2 [m]", "Well 3 [m]", "Well 4 [m]", "Well 5 [m]"));
  EXPECT_EQ(chart.Chart().graph(0)->pen().color(), secondColor);
  for (const QCPAxisRect* rect : chart.Chart().axisRects()) EXPECT_EQ(rect->axis(QCPAxis::atBottom)->range(), seen);
  QTest::keyClick(&chart.Chart(), Qt::Key_PageDown);
  EXPECT_EQ(shown().front(), "Well 6 [m]");
  bar->setValue(bar->maximum());
  EXPECT_EQ(shown().back(), "Well 30 [m]");
  // A marked date moves, and all else stays as the user has it.
  content.markers[0].time = CYbDateTime(2000, 1, 3);
  plot.Show(content);
  EXPECT_EQ(shown().back(), "Well 30 [m]");
  EXPECT_EQ(chart.Chart().xAxis->range(), seen);
  // More room shows more of them.
  plot.resize(800, 900);
  for (int i = 0; i < 3; ++i) QApplication::processEvents();
  EXPECT_GT(chart.Chart().graphCount(), 6);
  EXPECT_EQ(shown().back(), "Well 30 [m]");
  EXPECT_EQ(bar->maximum(), kPanels - chart.Chart().graphCount());
  plot.resize(800, 400);
  for (int i = 0; i < 3; ++i) QApplication::processEvents();

  // A picture that is taken along shows all, those out of sight too.
  for (QAction* action : chart.Chart().actions())
    if (action->text() == "&Copy picture") action->trigger();
  const QImage picture = QApplication::clipboard()->image();
  EXPECT_GT(picture.height(), 2 * 100 * kPanels);
  std::set<QRgb> colors;
  for (int y = 0; y < picture.height(); ++y)
    for (int x = 0; x < picture.width(); x += 3) colors.insert(picture.pixel(x, y));
  for (std::size_t curve = 0; curve < 8; ++curve) EXPECT_TRUE(colors.contains(CurveColor(curve, false).rgb())) << curve;
  EXPECT_EQ(shown().size(), 4);

  content.series.resize(2);
  plot.Show(content);
  EXPECT_FALSE(bar->isVisible());
  EXPECT_THAT(shown(), ElementsAre("Well 1 [m]", "Well 2 [m]"));
}

TEST(SeriesPlot, CurvesOverANumberTellItWithItsUnit) {
  SeriesContent content;
  Series curve{"Sand", "-", {}, {0.43, 0.4, 0.2, 0.06}, false, {0, 1, 100, 10000}};
  content.series = {curve};
  content.numbers = NumberAxis{"Suction", "cm", false};
  {
    ShownChart chart(content);
    EXPECT_EQ(chart.Chart().xAxis->label(), "Suction [cm]");
    EXPECT_EQ(chart.Plot().TextAt(90), "Suction 100 cm   Sand 0.2 -");
    EXPECT_EQ(chart.Plot().ValuesAsText().toStdString(),
              "Suction [cm]\tSand [-]\n0\t0.43\n1\t0.4\n100\t0.2\n10000\t0.06\n");
  }
  content.numbers->isLogarithmic = true;
  ShownChart chart(content);
  // Equal factors are equally wide, and 0 has no place.
  const QCPAxis& axis = *chart.Chart().xAxis;
  EXPECT_NEAR(axis.coordToPixel(100) - axis.coordToPixel(1), axis.coordToPixel(10000) - axis.coordToPixel(100), 1e-6);
  EXPECT_EQ(axis.range().lower, 1);
  EXPECT_EQ(chart.Chart().graph(0)->dataCount(), 3);
}

TEST(SeriesPlot, ValuesOnALogarithmicAxisAreTheirOwn) {
  SeriesContent content;
  Series conductivity{"Conductivity", "m/s", {}, {1e-5, 1e-7, 0, 1e-9}, false, {1, 10, 100, 1000}};
  conductivity.isLogarithmic = true;
  content.series = {conductivity};
  content.numbers = NumberAxis{"Suction", "m", true};
  ShownChart chart(content);
  const QCPAxis& axis = *chart.Chart().yAxis;
  EXPECT_NEAR(axis.coordToPixel(1e-9) - axis.coordToPixel(1e-7), axis.coordToPixel(1e-7) - axis.coordToPixel(1e-5),
              1e-6);
  EXPECT_LT(axis.range().lower, 1e-9);
  EXPECT_GT(axis.range().lower, 1e-10);
  EXPECT_EQ(axis.label(), "m/s");
  EXPECT_EQ(chart.Plot().TextAt(11), "Suction 10 m   Conductivity 1e-07 m/s");
  // What has no place there is a gap of the curve, and keeps its value in a table.
  EXPECT_EQ(chart.Plot().TextAt(100), "Suction 100 m   Conductivity no value");
  EXPECT_THAT(chart.Plot().ValuesAsText().toStdString(), testing::HasSubstr("100\t0\n"));
  // Up by the same factor at both ends.
  const QCPRange seen = axis.range();
  QTest::keyClick(&chart.Chart(), Qt::Key_Up);
  EXPECT_NEAR(axis.range().upper / seen.upper, axis.range().lower / seen.lower, 1e-9);
  // One curve beside it that is not meant so, and the axis is an ordinary one.
  Series other = conductivity;
  other.isLogarithmic = false;
  content.series.push_back(other);
  chart.Plot().Show(content);
  EXPECT_EQ(axis.scaleType(), QCPAxis::stLinear);
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
}  // namespace tervane::series_plot_test
