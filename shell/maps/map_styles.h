// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Shapes in styles that a user has chosen for the backdrop.
#pragma once

#include <QPainter>
#include <optional>
#include <span>

#include "geometry/shapes.h"
#include "overlays/overlay_styles.h"
#include "shell/maps/map_drawing.h"
#include "shell/maps/map_labels.h"

namespace tervane {

/// Shapes with the rectangles around them.
struct StyledShapes {
  const CYbShapeData& data;
  std::span<const std::optional<Envelope>> around;
  const ShapeStyle& style;

  void Draw(QPainter& painter, const DrawnMap& map) const;
  /// The values of shapes, where these are to be shown and have room.
  void DrawTexts(QPainter& painter, const DrawnMap& map, LabelPlaces& places) const;

 private:
  bool ArePoints() const;
  void DrawPoints(QPainter& painter, const DrawnMap& map) const;
  void DrawLines(QPainter& painter, const DrawnMap& map) const;
};

}  // namespace tervane
