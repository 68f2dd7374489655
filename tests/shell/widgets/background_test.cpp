// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/widgets/background.h"

#include <QApplication>
#include <QProgressDialog>
#include <QPushButton>
#include <QTest>
#include <QTimer>
#include <algorithm>
#include <atomic>
#include <memory>
#include <thread>
#include <utility>

#include <gmock/gmock.h>

#include "data/grid_files.h"
#include "shell/maps/map_canvas.h"
#include "shell/maps/map_view.h"
#include "shell/qt_host.h"
#include "spatial/data2d.h"
#include "tests/shell/opened_setup.h"

namespace tervane::background_test {
namespace {

using test::OpenedSetup;

/// A grid that takes as long as the test wants.
struct SlowGrid {
  struct State {
    std::atomic<int> begun{0}, ended{0};
    std::atomic<bool> mayEnd{false};
  };
  std::shared_ptr<State> state = std::make_shared<State>();
  std::shared_ptr<ComputedGrid> computation = std::make_shared<ComputedGrid>(
      "Interpolating dem.txt", [state = state](CTvn2DOrthoRotatedGridData& grid, ProgressPart progress) -> FileResult {
        ++state->begun;
        while (!state->mayEnd && !progress.IsCancelled()) std::this_thread::sleep_for(std::chrono::milliseconds(1));
        ++state->ended;
        if (progress.IsCancelled()) return {kCancelled, {}};
        return {grid.SetGridData({3, 2, 100, 0, 0, 0, {}}, 7, -9999, 1000, 100180), {}};
      });

  MapContent Content() const {
    MapContent map;
    if (auto grid = NowOrAwaited(computation, map.awaited)) map.grids.push_back({std::move(grid)});
    return map;
  }
};

bool Comes(const std::function<bool()>& state) { return QTest::qWaitFor(state, 10'000); }

class ShownMap {
 public:
  ShownMap() : view_(std::make_unique<MapView>(host_)) {
    view_->resize(700, 500);
    view_->show();
  }
  void Show(const SlowGrid& grid) {
    view_->ShowWhenThere([grid] { return grid.Content(); }, nullptr);
  }
  /// Null while there is none; its text is that of its button.
  QPushButton* Button() {
    auto* button = view_->findChild<QPushButton*>();
    return button && button->isVisible() ? button : nullptr;
  }
  std::size_t Grids() const { return view_->Canvas().Content().grids.size(); }
  MapView& View() { return *view_; }
  void Close() { view_.reset(); }

 private:
  NobodyToAsk host_;
  std::unique_ptr<MapView> view_;
};

TEST(Background, TheMapAppearsWhenItIsComputedAndTheUserSeesThatItIs) {
  SlowGrid grid;
  ShownMap map;
  map.Show(grid);
  EXPECT_EQ(map.Grids(), 0U);
  ASSERT_TRUE(Comes([&] { return map.Button() != nullptr; }));
  EXPECT_EQ(map.Button()->text(), "Cancel");
  grid.state->mayEnd = true;
  ASSERT_TRUE(Comes([&] { return map.Grids() == 1; }));
  EXPECT_EQ(map.Button(), nullptr);
  EXPECT_EQ(grid.state->begun, 1);
}

TEST(Background, AnotherContentAndTheEndOfThePageCancelWhatNobodyWaitsFor) {
  SlowGrid first, second;
  ShownMap map, other;
  map.Show(first);
  other.Show(first);
  map.Show(second);
  ASSERT_TRUE(Comes([&] { return second.state->begun == 1; }));
  EXPECT_EQ(first.state->ended, 0);  // the other map still waits for it
  other.Close();
  ASSERT_TRUE(Comes([&] { return first.state->ended == 1; }));
  EXPECT_FALSE(first.computation->IsDone());
  map.Close();
  ASSERT_TRUE(Comes([&] { return second.state->ended == 1; }));
  EXPECT_FALSE(second.computation->IsDone());
}

TEST(Background, WhatTheUserCancelsStaysSoUntilItIsStartedAgain) {
  SlowGrid grid;
  ShownMap map;
  map.Show(grid);
  ASSERT_TRUE(Comes([&] { return map.Button() != nullptr; }));
  map.Button()->click();
  ASSERT_TRUE(Comes([&] { return grid.state->ended == 1; }));
  EXPECT_FALSE(grid.computation->IsDone());
  map.Show(grid);  // as any change on the page does
  ASSERT_TRUE(map.Button());
  EXPECT_EQ(map.Button()->text().remove('&'), "Start Again");
  EXPECT_EQ(grid.state->begun, 1);
  grid.state->mayEnd = true;
  map.Button()->click();
  ASSERT_TRUE(Comes([&] { return map.Grids() == 1; }));
}

TEST(Background, ADialogWaitsForWhatTheUserHasAskedFor) {
  OpenedSetup setup;
  QtHost host(&setup.Window(), setup.Program().Settings());
  for (const bool isCancelled : {true, false}) {
    SCOPED_TRACE(isCancelled);
    SlowGrid grid;
    bool wasShown = false;
    QTimer timer;
    QObject::connect(&timer, &QTimer::timeout, [&] {
      auto* dialog = qobject_cast<QProgressDialog*>(QApplication::activeModalWidget());
      if (!dialog || std::exchange(wasShown, true)) return;
      EXPECT_EQ(dialog->labelText(), "Interpolating dem.txt");
      isCancelled ? dialog->findChild<QPushButton*>()->click() : void(grid.state->mayEnd = true);
    });
    timer.start(5);
    EXPECT_EQ(host.Compute(grid.computation), !isCancelled);
    EXPECT_TRUE(wasShown);
    EXPECT_EQ(grid.state->ended, grid.state->begun);
    EXPECT_EQ(grid.computation->IsDone(), !isCancelled);
  }
}

TEST(Background, APageShowsTheGridThatIsComputedInTheForeground) {
  OpenedSetup setup;
  setup.Folder().Write("points.txt", "100 100 10\n900 200 20\n500 800 35\n");
  auto* topography = setup.Session().Document().Root().Important(kTopography);
  ASSERT_TRUE(topography);
  topography->Type = CData2DKvf::kXyzFile;
  topography->XyzFile().File = FileName(setup.Folder().File("points.txt"), {});
  topography->SearchRadius = 100'000;
  setup.GoTo("Topography");
  // The page that was left may not be deleted yet.
  const auto maps = setup.Frame().findChildren<MapView*>();
  const auto found = std::ranges::find_if(maps, &MapView::isVisible);
  ASSERT_NE(found, maps.end());
  const MapView* map = *found;
  ASSERT_TRUE(Comes([&] { return !map->Canvas().Content().grids.empty(); }));
  EXPECT_EQ(map->Canvas().Content().grids.front().grid->Values(), topography->CreateGridData()->Values());
}

}  // namespace
}  // namespace tervane::background_test
