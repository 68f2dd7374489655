// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Sets of types that are ticked at once.
#pragma once

#include <span>

#include "results/grid_series.h"

namespace tervane {

struct TickPreset {
  const char* label;
  const char* action;  ///< The name of the step.
  const char* toolTip;
  bool (*ticks)(const ResultDataType& type);
  bool isOnlyThese;  ///< All others lose their tick.
};
std::span<const TickPreset> TickPresets();

/// True when that changed a tick.
bool TakePreset(COutputGridSeriesListKvf& list, const TickPreset& preset);

}  // namespace tervane
