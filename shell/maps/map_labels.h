// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Names on a map, which keep off each other.
#pragma once

#include <QPainter>
#include <QRectF>
#include <QString>
#include <array>
#include <optional>
#include <unordered_map>
#include <vector>

#include "forms/plots.h"
#include "shell/maps/map_drawing.h"

namespace tervane {

/// How a name is drawn, where that is not told by the theme.
struct LabelLook {
  QColor color;
  bool isOpaque = false;  ///< It stands on paper of its own.
};

/// Where names may stand.
class LabelPlaces {
 public:
  /// Names stay within these limits.
  explicit LabelPlaces(QRectF limits) : limits_(limits) {}

  void Take(const QRectF& place);
  bool IsTaken(const QRectF& place) const;
  /// The map is so full of names that no further one is of use.
  bool IsFull() const { return names_ >= kMostNames; }

  /// Draws a text at the first free of the places around a marker: beside, above, below, then the corners. False when
  /// there is none.
  bool DrawAround(QPainter& painter, QPointF marker, double radius, const QString& text, const DrawnMap& map,
                  const std::optional<LabelLook>& look = {});
  /// Draws a text in the middle of a place, if that is free.
  bool DrawAt(QPainter& painter, QPointF middle, const QString& text, const DrawnMap& map,
              const std::optional<LabelLook>& look = {});

 private:
  static constexpr std::size_t kMostNames = 400;
  static constexpr double kBucket = 64;  ///< Pixels of a side.

  template <class Visit>
  static bool AnyBucket(const QRectF& place, Visit visit);
  bool Draw(QPainter& painter, const QRectF& place, const QString& text, const DrawnMap& map,
            const std::optional<LabelLook>& look);

  QRectF limits_;
  std::unordered_map<long long, std::vector<QRectF>> taken_;
  std::size_t names_ = 0;
};

/// The room that a name takes.
QSizeF LabelSize(const QFontMetricsF& metrics, const QString& text);

/// A text that is read on any ground.
void DrawOutlinedText(QPainter& painter, QPointF baseline, const QString& text, const QColor& color,
                      const QColor& around);

/// Points with their numbers and names; a name for which there is no room is left out.
void DrawLabelledPoints(QPainter& painter, const PointLayer& layer, const DrawnMap& map, LabelPlaces& places);

/// How far around a point of such a layer its marker reaches, in pixels.
double MarkerReach(const PointLayer& layer, double zoom);

}  // namespace tervane
