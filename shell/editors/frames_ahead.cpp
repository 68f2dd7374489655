// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/editors/frames_ahead.h"

#include <QFutureWatcher>
#include <QPromise>
#include <QThread>
#include <QThreadPool>
#include <algorithm>
#include <atomic>

namespace tervane {

namespace {

using ReadyResult = std::shared_ptr<const ReadyFrame>;

/// Apart from those in which pages wait for their maps.
QThreadPool& Readers() {
  static QThreadPool pool;
  pool.setMaxThreadCount(std::max(2, QThread::idealThreadCount()));
  return pool;
}

}  // namespace

struct FramesAhead::Making {
  /// What the thread shares; it holds all that it works on.
  struct Shared {
    std::shared_ptr<ComputedFrame> computed;
    Progress progress;
    std::atomic<bool> isGivenUp{false};
  };

  std::size_t step = 0;
  int every = 1;
  std::shared_ptr<Shared> shared = std::make_shared<Shared>();
  QFutureWatcher<ReadyResult> watcher;

  void GiveUp() const {
    shared->progress.Cancel();
    shared->isGivenUp = true;
  }
  ~Making() { GiveUp(); }
};

FramesAhead::FramesAhead(ResultView& view, const DisplayUnits& units) : view_(view), units_(units) {}
FramesAhead::~FramesAhead() = default;

void FramesAhead::Forget() {
  wanted_.clear();
  ready_.clear();
  making_.clear();
}

std::shared_ptr<const ReadyFrame> FramesAhead::At(std::size_t step, int every) const {
  const auto found =
      std::ranges::find_if(ready_, [&](const auto& ready) { return ready->step == step && ready->every == every; });
  return found == ready_.end() ? nullptr : *found;
}

bool FramesAhead::IsThereOrMaking(std::size_t step) const {
  return At(step, every_) || std::ranges::any_of(making_, [&](const auto& making) {
           return making->step == step && making->every == every_;
         });
}

void FramesAhead::Want(std::size_t step, int every, int direction, std::size_t steps) {
  if (!view_.Colors()) return;
  every_ = every;
  // The coarser, the more of them fit.
  const std::size_t most = std::min<std::size_t>(view_.KeptFrames() * static_cast<std::size_t>(every), 40);
  wanted_.clear();
  for (std::size_t ahead = 0; ahead < std::min(most, steps); ++ahead) {
    // At an end it goes on at the other one.
    const std::size_t away = ahead % steps;
    wanted_.push_back(direction < 0 ? (step + steps - away) % steps : (step + away) % steps);
  }
  const auto isWanted = [this](const auto& frame) {
    return frame->every == every_ && std::ranges::find(wanted_, frame->step) != wanted_.end();
  };
  std::erase_if(ready_, [&](const auto& ready) { return !isWanted(ready); });
  std::erase_if(making_, [&](const auto& making) { return !isWanted(making); });
  StartNext();
}

void FramesAhead::StartNext() {
  const auto most = static_cast<std::size_t>(Readers().maxThreadCount());
  for (const std::size_t step : wanted_) {
    if (making_.size() >= most) return;
    if (IsThereOrMaking(step)) continue;
    const std::optional<GridLayer> colors = view_.Colors();
    if (!colors) return;
    Making& making = *making_.emplace_back(std::make_unique<Making>());
    making.step = step;
    making.every = every_;
    making.shared->computed = view_.Frame(step, every_);
    auto promise = std::make_shared<QPromise<ReadyResult>>();
    connect(&making.watcher, &QFutureWatcher<ReadyResult>::finished, this, [this, made = &making] {
      const ReadyResult ready = made->watcher.result();
      std::erase_if(making_, [made](const auto& one) { return one.get() == made; });
      if (!ready) return StartNext();
      ready_.push_back(ready);
      StartNext();
      emit Came(ready->step);
    });
    making.watcher.setFuture(promise->future());
    promise->start();
    Readers().start([promise, shared = making.shared, layer = *colors, units = units_, step, every = every_] {
      auto ready = std::make_shared<ReadyFrame>(ReadyFrame{step, every, nullptr, {}, layer, nullptr});
      if (shared->computed->Run(shared->progress)) {
        ready->frame = shared->computed->Result();
        ready->problem = shared->computed->Problem();
        if (ready->frame) {
          ready->layer.grid = ready->frame->grid;
          ready->picture = GridPicture::Make(ready->layer, units, shared->isGivenUp);
        }
        if (ready->frame && !ready->picture) ready = nullptr;
      } else {
        ready = nullptr;
      }
      promise->addResult(std::move(ready));
      promise->finish();
    });
  }
}

}  // namespace tervane
