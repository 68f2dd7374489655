// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "forms/plots.h"

namespace tervane {

/// A point or line that a page asks of the user on its map, from the button that asks until it is answered or given
/// up. A page holds one, since one map can ask one thing at a time.
class MapQuestion {
 public:
  using Taker = std::function<void(const std::vector<MapPoint>& points)>;

  /// `shown` makes the page show its map anew (`PageContext::syncSoon`); may be empty.
  explicit MapQuestion(std::function<void()> shown) : state_(std::make_shared<State>()) {
    state_->shown = std::move(shown);
  }

  /// Asks, or gives up what is asked just now with the same words: the button that asks is pressed again.
  void AskOrGiveUp(MapRequest::Kind kind, const std::string& prompt, Taker taken) {
    const bool isSame = state_->request && state_->request->prompt == prompt;
    state_->request.reset();
    if (!isSame) state_->request = MapRequest{kind, prompt, std::move(taken), {}};
    state_->Show();
  }
  void AskPoint(const std::string& prompt, std::function<void(MapPoint)> taken) {
    AskOrGiveUp(MapRequest::Kind::Point, prompt,
                [taken = std::move(taken)](const std::vector<MapPoint>& points) { taken(points.front()); });
  }
  void AskLine(const std::string& prompt, Taker taken) {
    AskOrGiveUp(MapRequest::Kind::Line, prompt, std::move(taken));
  }
  bool IsAsked() const { return state_->request.has_value(); }

  /// Puts what is asked on the page's map.
  void PutOn(MapContent& map) const {
    if (!state_->request) return;
    map.request = state_->request;
    // The map may outlive the page.
    map.request->taken = [weak = std::weak_ptr(state_)](const std::vector<MapPoint>& points) {
      const auto state = weak.lock();
      if (!state || !state->request) return;
      const Taker taken = state->request->taken;
      state->request.reset();
      taken(points);
      state->Show();
    };
    map.request->givenUp = [weak = std::weak_ptr(state_)] {
      const auto state = weak.lock();
      if (!state) return;
      state->request.reset();
      state->Show();
    };
  }

 private:
  struct State {
    std::optional<MapRequest> request;
    std::function<void()> shown;

    void Show() const {
      if (shown) shown();
    }
  };

  std::shared_ptr<State> state_;
};

}  // namespace tervane
