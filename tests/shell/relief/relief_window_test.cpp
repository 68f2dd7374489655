// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/relief/relief_window.h"

#include <QComboBox>
#include <QListWidget>
#include <QSlider>
#include <QTest>

#include <gmock/gmock.h>

#include "shell/relief/relief_canvas.h"

namespace tervane::relief_window_test {
namespace {

using testing::HasSubstr;

/// 20 x 20 cells of 50 m: 40 m high in the west, 60 m in the east.
std::shared_ptr<const CTvn2DOrthoRotatedGridData> Hill() {
  std::vector<float> values(400);
  for (std::size_t i = 0; i < values.size(); ++i) values[i] = i % 20 < 10 ? 40.0F : 60.0F;
  auto grid = std::make_shared<CTvn2DOrthoRotatedGridData>();
  EXPECT_EQ(grid->TakeValues({20, 20, 50, 0, 0, 0, {}}, std::move(values), -99, 1000, 100180), "");
  return grid;
}

SectionContent Ground() {
  SectionContent content;
  content.ground = Level{Hill()};
  content.surfaces = {{"Clay", {nullptr, 30.0}}, {"Sand", {nullptr, 0.0}, 0x336699U}};
  return content;
}

class OpenedRelief {
 public:
  explicit OpenedRelief(const SectionContent& content) : window_(nullptr, host_, "3D View") {
    window_.setAttribute(Qt::WA_DeleteOnClose, false);
    window_.resize(900, 600);
    window_.show();
    window_.Show(ReliefOf([content] { return content; }), PaintGround, {});
    EXPECT_TRUE(QTest::qWaitFor([this] { return !window_.View().IsBusy(); }));
    QApplication::processEvents();
    Canvas().WaitUntilFine();
  }
  ReliefCanvas& Canvas() { return window_.View().Canvas(); }
  ReliefWindow& Window() { return window_; }
  std::string TextAt(double x, double y, double height) {
    Canvas().WaitUntilFine();
    const auto seen = Canvas().Camera().See({x, y}, height);
    return Canvas().TextAt({seen.x, seen.y}).toStdString();
  }

 private:
  NobodyToAsk host_;
  ReliefWindow window_;
};

TEST(ReliefWindow, PointingTellsTheLayerAndItsHeights) {
  OpenedRelief relief(Ground());
  EXPECT_THAT(relief.TextAt(800, 500, 60), testing::AllOf(HasSubstr("Clay"), HasSubstr("60 m to 30 m, 30 m thick")));
  EXPECT_EQ(relief.TextAt(5000, 5000, 60), "");
}

TEST(ReliefWindow, WhatIsUncheckedLetsSeeWhatLiesBelow) {
  OpenedRelief relief(Ground());
  auto* list = relief.Window().findChild<QListWidget*>();
  ASSERT_EQ(list->count(), 3);
  EXPECT_EQ(list->item(0)->checkState(), Qt::Unchecked) << "the ground itself";
  list->item(1)->setCheckState(Qt::Unchecked);
  EXPECT_THAT(relief.TextAt(800, 500, 30), HasSubstr("Sand"));
}

TEST(ReliefWindow, ASliceShowsTheLayersOnItsWall) {
  OpenedRelief relief(Ground());
  while (relief.Canvas().Camera().heading > 0.5) relief.Canvas().Turn(-relief.Canvas().Camera().heading, -20);
  relief.Window().Slice(1, 0.5);
  // Heights stand in the middles of the cells: the wall is the row nearest to the middle.
  const double wall = 10 * 50 + 25;
  EXPECT_THAT(relief.TextAt(400, wall, 15), HasSubstr("Sand"));
  EXPECT_THAT(relief.TextAt(400, wall, 36), HasSubstr("Clay"));
}

TEST(ReliefWindow, KeysTurnAndHomeShowsEverythingAgain) {
  OpenedRelief relief(Ground());
  const ReliefCamera first = relief.Canvas().Camera();
  QTest::keyClick(&relief.Canvas(), Qt::Key_Left);
  EXPECT_GT(relief.Canvas().Camera().heading, first.heading);
  const ReliefCamera turned = relief.Canvas().Camera();
  QTest::keyClick(&relief.Canvas(), Qt::Key_Left, Qt::ShiftModifier);
  EXPECT_EQ(relief.Canvas().Camera().heading, turned.heading);
  EXPECT_FALSE(relief.Canvas().Camera().centre == turned.centre);
  QTest::keyClick(&relief.Canvas(), Qt::Key_Plus);
  EXPECT_LT(relief.Canvas().Camera().metresPerPixel, first.metresPerPixel);
  QTest::keyClick(&relief.Canvas(), Qt::Key_Home);
  EXPECT_NEAR(relief.Canvas().Camera().metresPerPixel, first.metresPerPixel, 0.2 * first.metresPerPixel);
}

TEST(ReliefWindow, WithoutGroundItSaysWhy) {
  OpenedRelief relief(SectionContent{});
  EXPECT_EQ(relief.Canvas().Shown(), nullptr);
  EXPECT_EQ(relief.Canvas().TextAt({10, 10}), "");
}

TEST(ReliefWindow, WhatIsThereBeforeTheWindowIsShownIsDrawnWithIt) {
  NobodyToAsk host;
  ReliefWindow window(nullptr, host, "3D View");
  window.setAttribute(Qt::WA_DeleteOnClose, false);
  window.resize(900, 600);
  const SectionContent ground = Ground();
  window.Show(ReliefOf([&ground] { return ground; }), PaintGround, {});
  EXPECT_TRUE(QTest::qWaitFor([&window] { return window.View().Canvas().Shown() != nullptr; }));
  window.show();
  QApplication::processEvents();
  const ReliefCanvas& canvas = window.View().Canvas();
  EXPECT_NE(canvas.TextAt(QPointF(canvas.width() / 2.0, canvas.height() / 2.0)), "");
}

}  // namespace
}  // namespace tervane::relief_window_test
