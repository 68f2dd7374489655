// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Flow on a map.
#pragma once

#include <QPainter>
#include <QString>
#include <vector>

#include "forms/plots.h"
#include "platform/units.h"
#include "shell/maps/map_drawing.h"

namespace tervane {

/// An arrow on the screen.
struct DrawnArrow {
  QPointF from, to;
};

/// The arrows of flow that are seen: one for every so many rows and columns, so that they keep apart, and of the same
/// cells while the map is moved. The strongest flow is as long as they stand apart; where there is none, none is drawn.
std::vector<DrawnArrow> ArrowsOn(const ArrowLayer& layer, const DrawnMap& map);
void DrawArrows(QPainter& painter, const std::vector<DrawnArrow>& arrows, const DrawnMap& map);

/// An arrow that tells what lengths mean.
struct KeyArrow {
  double length = 0;  ///< In pixels.
  QString text;       ///< "0.5 m³/s"
};
KeyArrow KeyOf(const ArrowLayer& layer, const DrawnMap& map, const DisplayUnits& units);

}  // namespace tervane
