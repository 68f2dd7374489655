// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/run_statistics.h"

#include <cmath>
#include <limits>

#include <gmock/gmock.h>

namespace tervane::run_statistics_test {
namespace {

using ::testing::ElementsAre;

constexpr std::int64_t kEarly = -1000, kLate = 1000000;
constexpr float kNaN = std::numeric_limits<float>::quiet_NaN();

struct OwnSeries {
  std::vector<std::int64_t> stamps;
  std::vector<float> values;
  ValueType type = ValueType::Instantaneous;
  std::optional<std::int64_t> begin = {};

  ComparedSeries Series() const { return {stamps, values, type, begin}; }
};

std::vector<ComparedPair> Pairs(const OwnSeries& simulated, const OwnSeries& observed, std::int64_t start = kEarly,
                                std::int64_t end = kLate) {
  return PairsOf(simulated.Series(), observed.Series(), start, end);
}

std::vector<ComparedPair> Side(const std::vector<double>& observed, const std::vector<double>& simulated) {
  std::vector<ComparedPair> pairs;
  for (std::size_t i = 0; i < observed.size(); ++i)
    pairs.push_back({static_cast<std::int64_t>(i), observed[i], simulated[i]});
  return pairs;
}

TEST(RunStatistics, InstantaneousValuesAreLinearBetweenTheirTimes) {
  const OwnSeries simulated{{0, 100, 200, 300}, {10, 20, 40, 0}};
  const OwnSeries observed{{-1, 0, 25, 100, 150, 250, 300, 301}, {1, 2, 3, 4, 5, 6, 7, 8}};
  EXPECT_THAT(Pairs(simulated, observed),
              ElementsAre(ComparedPair{0, 2, 10}, ComparedPair{25, 3, 12.5}, ComparedPair{100, 4, 20},
                          ComparedPair{150, 5, 30}, ComparedPair{250, 6, 20}, ComparedPair{300, 7, 0}));
  EXPECT_THAT(Pairs(simulated, observed, 25, 150),
              ElementsAre(ComparedPair{25, 3, 12.5}, ComparedPair{100, 4, 20}, ComparedPair{150, 5, 30}));
}

TEST(RunStatistics, MeansHoldOverTheIntervalThatEndsWithTheirStamp) {
  OwnSeries simulated{{100, 200, 400}, {10, 20, 40}, ValueType::MeanStep};
  const OwnSeries observed{{-50, 0, 1, 100, 101, 399, 401}, {1, 2, 3, 4, 5, 6, 7}};
  EXPECT_THAT(Pairs(simulated, observed), ElementsAre(ComparedPair{1, 3, 10}, ComparedPair{100, 4, 10},
                                                      ComparedPair{101, 5, 20}, ComparedPair{399, 6, 40}));
  simulated.begin = -60;
  EXPECT_EQ(Pairs(simulated, observed).front(), (ComparedPair{-50, 1, 10}));
}

TEST(RunStatistics, GapsGiveNoPair) {
  const OwnSeries observed{{0, 50, 100, 150, 200, 300}, {1, kDeleteValue, 3, kNaN, 5, 6}};
  const OwnSeries simulated{{0, 100, 200, 300}, {10, kDeleteValue, 30, 40}};
  EXPECT_THAT(Pairs(simulated, observed),
              ElementsAre(ComparedPair{0, 1, 10}, ComparedPair{200, 5, 30}, ComparedPair{300, 6, 40}));
  // Neither side of a gap leads into it.
  const OwnSeries beside{{50, 150, 250}, {1, 2, 3}};
  EXPECT_THAT(Pairs(simulated, beside), ElementsAre(ComparedPair{250, 3, 35}));
  EXPECT_TRUE(Pairs({}, observed).empty());
  EXPECT_TRUE(Pairs(simulated, {}).empty());
  EXPECT_TRUE(Pairs(simulated, OwnSeries{{400, 500}, {1, 2}}).empty());
}

TEST(RunStatistics, ObservedTimesThatFallAreFound) {
  const OwnSeries simulated{{0, 100, 200, 300}, {10, 20, 40, 0}};
  EXPECT_THAT(Pairs(simulated, OwnSeries{{250, 50, 50, 300, 0}, {1, 2, 3, 4, 5}}),
              ElementsAre(ComparedPair{250, 1, 20}, ComparedPair{50, 2, 15}, ComparedPair{50, 3, 15},
                          ComparedPair{300, 4, 0}, ComparedPair{0, 5, 10}));
}

/// The expected numbers come from exact fractions and from the statistics of another language's library.
TEST(RunStatistics, TheFigures) {
  const RunStatistics figures = StatisticsOf(Side({3.5, 4.25, 8, 6.5, 2, 2.75, 5}, {3, 4.5, 6.5, 7, 2.5, 2.5, 4}));
  constexpr double kNear = 1e-14;
  EXPECT_EQ(figures.pairs, 7U);
  EXPECT_NEAR(figures.meanError.value(), 0.2857142857142857, kNear);
  EXPECT_NEAR(figures.meanAbsoluteError.value(), 0.6428571428571429, kNear);
  EXPECT_NEAR(figures.rootMeanSquareError.value(), 0.7676494735787385, kNear);
  EXPECT_NEAR(figures.residualDeviation.value(), 0.7695855408997136, kNear);
  EXPECT_NEAR(figures.correlation.value(), 0.933445390191626, kNear);
  EXPECT_NEAR(figures.nashSutcliffe.value(), 0.846307385229541, kNear);
  EXPECT_NEAR(figures.klingGupta.value(), 0.8431294518778458, kNear);
  EXPECT_NEAR(figures.percentBias.value(), 6.25, kNear);
}

TEST(RunStatistics, WhatDividesByNothingIsLeftOut) {
  for (const std::size_t few : {0U, 1U}) {
    const RunStatistics none = StatisticsOf(Side(std::vector<double>(few, 1), std::vector<double>(few, 2)));
    EXPECT_EQ(none.pairs, few);
    EXPECT_FALSE(none.meanError || none.rootMeanSquareError || none.correlation || none.percentBias) << few;
  }
  // A tenth is no binary fraction: the mean of many differs from each.
  const RunStatistics level = StatisticsOf(Side(std::vector<double>(10, 0.1), {1, 2, 3, 4, 5, 6, 7, 8, 9, 10}));
  EXPECT_TRUE(level.meanError && level.residualDeviation && level.percentBias);
  EXPECT_FALSE(level.correlation || level.nashSutcliffe || level.klingGupta);
  const RunStatistics flat = StatisticsOf(Side({1, 2, 3}, {0.1, 0.1, 0.1}));
  EXPECT_TRUE(flat.nashSutcliffe);
  EXPECT_FALSE(flat.correlation || flat.klingGupta);
  const RunStatistics around = StatisticsOf(Side({-1, 1}, {-1, 1}));
  EXPECT_FALSE(around.percentBias || around.klingGupta);
  EXPECT_EQ(around.nashSutcliffe, 1.0);
}

TEST(RunStatistics, LevelsFarFromZeroKeepTheirVariance) {
  const RunStatistics figures = StatisticsOf(Side({1e6 + 0.25, 1e6 + 0.5, 1e6 + 0.75}, {1e6, 1e6 + 0.5, 1e6 + 1}));
  EXPECT_NEAR(figures.correlation.value(), 1, 1e-12);
  EXPECT_NEAR(figures.nashSutcliffe.value(), 0, 1e-12);
}

TEST(RunStatistics, ADurationCurveFallsOverTheTimeInWhichItIsReached) {
  const DurationCurve curve = DurationCurveOf({2, 8, 4});
  EXPECT_THAT(curve.values, ElementsAre(8, 4, 2));
  EXPECT_THAT(curve.percent, ElementsAre(25, 50, 75));
}

}  // namespace
}  // namespace tervane::run_statistics_test
