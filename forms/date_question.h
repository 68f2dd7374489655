// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <utility>

#include "forms/plot_question.h"
#include "forms/plots.h"

namespace tervane {

/// A date that a page asks of the user on its chart.
class DateQuestion : public PlotQuestion<DateRequest, CYbDateTime> {
 public:
  using PlotQuestion::PlotQuestion;

  void AskDate(const std::string& prompt, Taker taken) { AskOrGiveUp({prompt, std::move(taken)}); }

  /// Puts what is asked on the page's chart.
  void PutOn(SeriesContent& chart) const {
    if (auto request = ShownRequest()) chart.request = std::move(request);
  }
};

}  // namespace tervane
