// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/charts/section_view.h"

#include <QTest>

#include <gmock/gmock.h>
#include <qcustomplot.h>

#include "tests/shell/plot_events.h"

namespace tervane::section_view_test {
namespace {

constexpr float kEmpty = -99;

/// 100 cells of 50 m from west to east.
std::shared_ptr<const CTvn2DOrthoRotatedGridData> Flat(double value, int emptyFrom = 100) {
  std::vector<float> values(100, static_cast<float>(value));
  for (std::size_t i = static_cast<std::size_t>(emptyFrom); i < values.size(); ++i) values[i] = kEmpty;
  auto grid = std::make_shared<CTvn2DOrthoRotatedGridData>();
  EXPECT_EQ(grid->TakeValues({100, 1, 50, 0, 0, 0, {}}, std::move(values), kEmpty, 1000, 100180), "");
  return grid;
}

SectionContent Ground() {
  SectionContent content;
  content.line = {{0, 25}, {4900, 25}};
  content.ground = Level{Flat(40)};
  content.surfaces = {{"Clay", {Flat(30, 50)}}, {"Sand", {Flat(10)}, 0x336699U}};
  return content;
}

class ShownSection {
 public:
  explicit ShownSection(SectionContent content) : view_(host_) {
    view_.resize(800, 400);
    view_.Show(std::move(content), nullptr);
    view_.show();
    Settle();
  }
  void Settle() {
    for (int i = 0; i < 3; ++i) QApplication::processEvents();
  }
  SectionView& View() { return view_; }
  QColor ColorAt(double distance, double height) {
    const QPointF at(view_.Chart().xAxis->coordToPixel(distance), view_.Chart().yAxis->coordToPixel(height));
    return view_.Chart().grab().toImage().pixelColor(at.toPoint());
  }

 private:
  NobodyToAsk host_;
  SectionView view_;
};

TEST(SectionView, LayersAreBandsDownToTheirBottoms) {
  ShownSection section(Ground());
  EXPECT_EQ(section.ColorAt(1100, 20), QColor(0x33, 0x66, 0x99));
  EXPECT_NE(section.ColorAt(1100, 35), QColor(0x33, 0x66, 0x99));
  // Where the layer above is missing, the next one reaches up to the ground.
  EXPECT_EQ(section.ColorAt(4100, 35), QColor(0x33, 0x66, 0x99));
  EXPECT_EQ(section.View().TextAt(1000, 20).toStdString(), "at 1000 m   ground 40 m   Sand from 30 m to 10 m");
  EXPECT_EQ(section.View().TextAt(1000, 50).toStdString(), "at 1000 m   ground 40 m");
  EXPECT_EQ(section.View().LayersAt(4000).toStdString(), "ground 40 m\nClay down to no value\nSand down to 10 m");
  EXPECT_TRUE(section.View().TextAt(6000, 20).isEmpty());
}

TEST(SectionView, KeysMoveAMarkThatTellsAllLayers) {
  ShownSection section(Ground());
  const auto move = [&](Qt::Key key) {
    QTest::keyClick(&section.View().Chart(), key, Qt::ControlModifier);
    return section.View().Status().toStdString();
  };
  EXPECT_THAT(move(Qt::Key_Right), testing::HasSubstr("at 2450 m   ground 40 m   Clay down to"));
  const std::string right = move(Qt::Key_Right);
  EXPECT_THAT(right, testing::HasSubstr("ground 40 m"));
  EXPECT_NE(right, move(Qt::Key_Left));
  for (int i = 0; i < 2000; ++i) move(Qt::Key_Left);
  EXPECT_THAT(move(Qt::Key_Left), testing::StartsWith("at 0 m"));
}

TEST(SectionView, AChosenExaggerationStaysAtEveryZoom) {
  ShownSection section(Ground());
  EXPECT_GT(section.View().Exaggeration(), 20);
  section.View().SetExaggeration(10);
  for (const double zoom : {1.0, 4.0, 0.5}) {
    section.View().Zoom(zoom);
    section.Settle();
    EXPECT_NEAR(section.View().Exaggeration(), 10, 1e-6);
  }
  section.View().SetExaggeration(std::nullopt);
  section.Settle();
  EXPECT_GT(section.View().Exaggeration(), 20);
}

TEST(SectionView, WithoutALineTheMessageIsShown) {
  SectionContent content = Ground();
  content.line.clear();
  content.message = "Draw a section on the map.";
  ShownSection section(std::move(content));
  const auto* message = section.View().Chart().findChild<QLabel*>();
  EXPECT_TRUE(message->isVisible());
  EXPECT_EQ(message->text(), "Draw a section on the map.");
}

}  // namespace
}  // namespace tervane::section_view_test
