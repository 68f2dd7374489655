// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <cmath>

#include <gmock/gmock.h>

#include "forms/map_question.h"
#include "tests/shell/maps/shown_map.h"

namespace tervane::map_gestures_test {
namespace {

using test::ShownMap;
using test::Wheel;
using testing::HasSubstr;

/// A page with one map that asks for points and lines.
class AskingPage {
 public:
  MapContent Content() {
    MapContent map;
    map.grids = {{grid_}};
    map.picked = [this](const MapPick&) { ++picks; };
    question.PutOn(map);
    return map;
  }
  void Sync() {
    if (shown) shown->View().Show(Content(), nullptr);
  }

  MapQuestion question{[this] { Sync(); }};
  std::unique_ptr<ShownMap> shown;
  std::vector<MapPoint> answer;
  int picks = 0;

 private:
  std::shared_ptr<const CTvn2DOrthoRotatedGridData> grid_ = test::Counting({40, 30, 100, 5000, 7000, 0, {}});
};

class MapGestures : public testing::Test {
 protected:
  MapGestures() { page.shown = std::make_unique<ShownMap>(page.Content()); }
  ~MapGestures() override { page.shown.reset(); }
  void AskLine(const std::string& prompt) {
    page.question.AskLine(prompt, [this](const std::vector<MapPoint>& line) { page.answer = line; });
  }
  void DoubleClick(MapPoint place) {
    // As a window system tells it: a click, and then the second one as a double click.
    Map().Click(place);
    QTest::mouseDClick(&Map().Canvas(), Qt::LeftButton, {}, Map().At(place).toPoint());
  }
  void Press(Qt::Key key) { QTest::keyClick(&Map().Canvas(), key); }
  ShownMap& Map() { return *page.shown; }
  double Pixel() { return Map().Canvas().Window().metresPerPixel; }

  AskingPage page;
};

TEST_F(MapGestures, AClickGivesThePointThatIsAskedForAndNothingElse) {
  Map().Click({6000, 8000});
  EXPECT_EQ(page.picks, 1);
  const double whole = Pixel();
  MapPoint taken;
  page.question.AskPoint("Click the well.", [&](MapPoint point) { taken = point; });
  EXPECT_TRUE(Map().Canvas().IsAsking());
  EXPECT_NE(Map().Canvas().cursor().shape(), Qt::CrossCursor);
  // Moving the map answers nothing.
  QTest::mousePress(&Map().Canvas(), Qt::LeftButton, {}, {300, 200});
  QTest::mouseMove(&Map().Canvas(), {340, 230});
  QTest::mouseRelease(&Map().Canvas(), Qt::LeftButton, {}, {340, 230});
  EXPECT_TRUE(page.question.IsAsked());
  DoubleClick({6500, 8200});
  EXPECT_NEAR(taken.x, 6500, Pixel());
  EXPECT_NEAR(taken.y, 8200, Pixel());
  EXPECT_FALSE(page.question.IsAsked());
  EXPECT_EQ(Map().Canvas().cursor().shape(), Qt::CrossCursor);
  EXPECT_EQ(page.picks, 1);
  EXPECT_EQ(Pixel(), whole);
}

TEST_F(MapGestures, EscAndTheButtonThatAskedGiveUp) {
  for (const bool byKey : {true, false}) {
    SCOPED_TRACE(byKey);
    AskLine("Draw the section.");
    Map().Click({6000, 8000});
    byKey ? Press(Qt::Key_Escape) : AskLine("Draw the section.");
    EXPECT_FALSE(page.question.IsAsked());
    EXPECT_FALSE(Map().Canvas().IsAsking());
    EXPECT_TRUE(page.answer.empty());
  }
}

TEST_F(MapGestures, ALineGrowsByClicksAndEndsWithADoubleClick) {
  AskLine("Draw the section.");
  DoubleClick({6000, 8000});  // one point is no line
  EXPECT_TRUE(page.question.IsAsked());
  EXPECT_THAT(Map().TextAt({7000, 8000}), HasSubstr("length 1"));
  Map().Click({7000, 9000});
  Press(Qt::Key_Backspace);
  Wheel(Map().Canvas(), Map().At({7000, 8500}), 1);
  Map().Click({7000, 8500});
  // The page is shown anew meanwhile, as after every change.
  page.Sync();
  DoubleClick({7200, 8200});
  ASSERT_EQ(page.answer.size(), 3U);
  const MapPoint expected[] = {{6000, 8000}, {7000, 8500}, {7200, 8200}};
  for (std::size_t i = 0; i < 3; ++i) {
    EXPECT_NEAR(page.answer[i].x, expected[i].x, 10);
    EXPECT_NEAR(page.answer[i].y, expected[i].y, 10);
  }
  EXPECT_EQ(page.picks, 0);
  // Another question begins anew, and Enter ends a line too.
  AskLine("Draw another one.");
  Map().Click({6000, 8000});
  AskLine("Draw a third one.");
  Map().Click({6100, 8000});
  Map().Click({6100, 8600});
  Press(Qt::Key_Return);
  ASSERT_EQ(page.answer.size(), 2U);
  EXPECT_NEAR(page.answer[0].x, 6100, 10);
}

// ---- Without a mouse

TEST_F(MapGestures, KeysMoveAMarkThatTellsItsPlaceAndStaysOnTheMap) {
  const auto move = [this](Qt::Key key, Qt::KeyboardModifiers more = {}) {
    QTest::keyClick(&Map().Canvas(), key, Qt::ControlModifier | more);
    return *Map().Canvas().ReadingMark();
  };
  EXPECT_FALSE(Map().Canvas().ReadingMark());
  const MapPoint first = move(Qt::Key_Right), middle = Map().Canvas().Window().centre;
  EXPECT_NEAR(first.x, middle.x, Pixel());
  EXPECT_NEAR(first.y, middle.y, Pixel());
  const struct {
    Qt::Key key;
    Qt::KeyboardModifiers more;
    double x, y;
  } steps[] = {{Qt::Key_Right, {}, 10, 0},
               {Qt::Key_Up, {}, 0, 10},
               {Qt::Key_Left, Qt::ShiftModifier, -1, 0},
               {Qt::Key_Down, Qt::ShiftModifier, 0, -1}};
  for (const auto& step : steps) {
    const MapPoint before = *Map().Canvas().ReadingMark(), after = move(step.key, step.more);
    EXPECT_NEAR(after.x - before.x, step.x * Pixel(), 1e-6);
    EXPECT_NEAR(after.y - before.y, step.y * Pixel(), 1e-6);
  }
  const MapPoint at = *Map().Canvas().ReadingMark();
  EXPECT_EQ(Map().View().Status(), Map().Canvas().TextAt(at));
  EXPECT_THAT(FromQt(Map().View().Status()), HasSubstr("cell "));
  // The map goes along with a mark that would leave it, and keeps it otherwise.
  for (int i = 0; i < 60; ++i) move(Qt::Key_Right);
  EXPECT_GT(Map().Canvas().Window().centre.x, middle.x);
  EXPECT_TRUE(Map().Canvas().Window().rect.contains(Map().At(*Map().Canvas().ReadingMark())));
  const MapPoint kept = *Map().Canvas().ReadingMark();
  Press(Qt::Key_Plus);
  EXPECT_EQ(*Map().Canvas().ReadingMark(), kept);
  Press(Qt::Key_Escape);
  EXPECT_FALSE(Map().Canvas().ReadingMark());
  EXPECT_EQ(Map().View().Status(), Map().Canvas().Summary());
}

TEST_F(MapGestures, EnterClicksAtTheMark) {
  const auto move = [this](Qt::Key key) {
    for (int i = 0; i < 4; ++i) QTest::keyClick(&Map().Canvas(), key, Qt::ControlModifier);
    return *Map().Canvas().ReadingMark();
  };
  Press(Qt::Key_Return);
  EXPECT_EQ(page.picks, 0) << "nothing is pointed at";
  move(Qt::Key_Up);
  Press(Qt::Key_Return);
  EXPECT_EQ(page.picks, 1);
  MapPoint taken;
  page.question.AskPoint("Click the well.", [&](MapPoint point) { taken = point; });
  MapPoint at = move(Qt::Key_Left);
  Press(Qt::Key_Return);
  EXPECT_NEAR(taken.x, at.x, Pixel());
  EXPECT_NEAR(taken.y, at.y, Pixel());
  EXPECT_FALSE(page.question.IsAsked());
  // The second Enter at one place ends a line, which one point is not.
  AskLine("Draw the section.");
  Press(Qt::Key_Return);
  Press(Qt::Key_Return);
  EXPECT_TRUE(page.question.IsAsked());
  at = move(Qt::Key_Down);
  Press(Qt::Key_Return);
  EXPECT_THAT(FromQt(Map().View().Status()), HasSubstr("length "));
  Press(Qt::Key_Return);
  EXPECT_FALSE(page.question.IsAsked());
  ASSERT_EQ(page.answer.size(), 2U);
  EXPECT_NEAR(page.answer[1].y, at.y, Pixel());
  EXPECT_EQ(page.picks, 1);
}

TEST_F(MapGestures, EnterPaintsWhereADragWould) {
  std::vector<MapPoint> painted;
  int ends = 0;
  Map().Canvas().SetDrag(MapDrag{[&](MapPoint /*from*/, MapPoint to) { painted.push_back(to); },
                                 [&](std::optional<MapPoint> place) { ends += place.has_value(); },
                                 {}});
  QTest::keyClick(&Map().Canvas(), Qt::Key_Up, Qt::ControlModifier);
  Press(Qt::Key_Return);
  ASSERT_EQ(painted.size(), 1U);
  EXPECT_EQ(painted[0], *Map().Canvas().ReadingMark());
  EXPECT_EQ(ends, 1);
  EXPECT_EQ(page.picks, 0);
}

}  // namespace
}  // namespace tervane::map_gestures_test
