// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <string>
#include <utility>
#include <vector>

#include "forms/plot_question.h"
#include "forms/plots.h"

namespace tervane {

/// A point or line that a page asks of the user on its map.
class MapQuestion : public PlotQuestion<MapRequest, std::vector<MapPoint>> {
 public:
  using PlotQuestion::PlotQuestion;

  void AskPoint(const std::string& prompt, std::function<void(MapPoint)> taken) {
    AskOrGiveUp({MapRequest::Kind::Point, prompt,
                 [taken = std::move(taken)](const std::vector<MapPoint>& points) { taken(points.front()); }});
  }
  void AskLine(const std::string& prompt, Taker taken) {
    AskOrGiveUp({MapRequest::Kind::Line, prompt, std::move(taken)});
  }

  /// Puts what is asked on the page's map.
  void PutOn(MapContent& map) const {
    if (auto request = ShownRequest()) map.request = std::move(request);
  }
};

}  // namespace tervane
