// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The looks that all charts have in common.
#pragma once

class QCustomPlot;

namespace tervane {

/// By how much a step of zooming enlarges.
inline constexpr double kZoomStep = 1.5;
/// What follows the pointer, drawn without the curves below it.
inline constexpr const char* kPointerLayer = "pointer";

/// Colours, fonts and sizes of the theme for the chart's axes, its legend and the box of a zoom.
void StyleChart(QCustomPlot& chart);
/// The legend stands above the chart, where it hides nothing.
void PutLegendAbove(QCustomPlot& chart);
/// As many columns of names as there is room for, each `widest` pixels beside its swatch.
void ArrangeLegend(QCustomPlot& chart, int widest);

}  // namespace tervane
