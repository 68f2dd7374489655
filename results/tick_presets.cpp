// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/tick_presets.h"

#include <algorithm>

namespace tervane {

namespace {

constexpr int kHeadElevation = 101;

constexpr TickPreset kTickPresets[] = {
    {"For the Water Balance", "Tick Types for the Water Balance",
     "Ticks all types that the water balance reads, so that they stay when it is no longer asked for",
     [](const ResultDataType& type) { return type.isWaterBalance; }, false},
    {"For a Later Water Quality Run", "Tick Types for Water Quality",
     "Ticks all types that a later run of water quality or particle tracking reads",
     [](const ResultDataType& type) { return type.isWaterQualityInput; }, false},
    {"Heads Only", "Tick Heads Only", "Ticks the head elevation in the saturated zone and nothing else",
     [](const ResultDataType& type) { return type.newDataType == kHeadElevation; }, true},
    {"None", "Tick No Types", "Takes all ticks away; required types are stored all the same",
     [](const ResultDataType&) { return false; }, true},
};

}  // namespace

std::span<const TickPreset> TickPresets() { return kTickPresets; }

bool TakePreset(COutputGridSeriesListKvf& list, const TickPreset& preset) {
  bool changed = false;
  for (const GridSeriesRow& row : list.Rows()) {
    const bool isTicked = preset.ticks(*row.type) || (row.isTicked && !preset.isOnlyThese);
    if (isTicked == row.isTicked) continue;
    list.SetTicked(row.type->newDataType, isTicked);
    changed = true;
  }
  return changed;
}

}  // namespace tervane
