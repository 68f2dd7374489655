// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <utility>

namespace tervane {

/// What a page asks of the user on its map or chart, from the button that asks until it is answered or given up. A page
/// holds one for each plot, since one plot can ask one thing at a time.
template <class Request, class Answer>
class PlotQuestion {
 public:
  using Taker = std::function<void(const Answer& answer)>;

  /// `shown` makes the page show its plot anew (`PageContext::syncSoon`); may be empty.
  explicit PlotQuestion(std::function<void()> shown) : state_(std::make_shared<State>()) {
    state_->shown = std::move(shown);
  }

  /// Asks, or gives up what is asked just now with the same words: the button that asks is pressed again.
  void AskOrGiveUp(Request request) {
    const bool isSame = state_->request && state_->request->prompt == request.prompt;
    state_->request.reset();
    if (!isSame) state_->request = std::move(request);
    state_->Show();
  }
  bool IsAsked() const { return state_->request.has_value(); }

 protected:
  /// The request for the plot to show; nothing while nothing is asked.
  std::optional<Request> ShownRequest() const {
    if (!state_->request) return std::nullopt;
    std::optional<Request> shown = state_->request;
    // The plot may outlive the page.
    shown->taken = [weak = std::weak_ptr(state_)](const Answer& answer) {
      const auto state = weak.lock();
      if (!state || !state->request) return;
      const Taker taken = state->request->taken;
      state->request.reset();
      taken(answer);
      state->Show();
    };
    shown->givenUp = [weak = std::weak_ptr(state_)] {
      const auto state = weak.lock();
      if (!state) return;
      state->request.reset();
      state->Show();
    };
    return shown;
  }

 private:
  struct State {
    std::optional<Request> request;
    std::function<void()> shown;

    void Show() const {
      if (shown) shown();
    }
  };

  std::shared_ptr<State> state_;
};

}  // namespace tervane
