// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What all layers of a map are drawn with.
#pragma once

#include <QColor>
#include <QPainter>
#include <QPointF>
#include <QPolygonF>
#include <QRectF>
#include <optional>
#include <span>
#include <vector>

#include "geometry/grid.h"

namespace tervane {

/// The part of the map that is seen: a rectangle of the screen, north up.
struct MapWindow {
  QRectF rect;
  MapPoint centre;
  double metresPerPixel = 1;

  QPointF ToScreen(MapPoint place) const {
    return {rect.center().x() + (place.x - centre.x) / metresPerPixel,
            rect.center().y() - (place.y - centre.y) / metresPerPixel};
  }
  MapPoint ToMap(QPointF screen) const {
    return {centre.x + (screen.x() - rect.center().x()) * metresPerPixel,
            centre.y - (screen.y() - rect.center().y()) * metresPerPixel};
  }
};

/// How a layer is drawn: where, which part of it, and on which paper.
struct DrawnMap {
  MapWindow window;
  QRectF part;  ///< Of the screen: nothing needs to be drawn elsewhere.
  bool isDark = false;
  double zoom = 1;  ///< Of pens and markers.
};

/// The area of the map below a part of the screen, with a margin for pens and markers.
Envelope AreaOf(const MapWindow& window, const QRectF& part);
bool Overlap(const Envelope& a, const Envelope& b);
/// The smallest rectangle around points; nothing when there are none.
std::optional<Envelope> EnvelopeAround(std::span<const MapPoint> points);
void Extend(std::optional<Envelope>& area, const std::optional<Envelope>& by);

double DistanceToSegment(MapPoint p, MapPoint a, MapPoint b);

/// Adds a line as it is drawn: points within a pixel of each other are one, and what is far outside the part is cut
/// away, so that no coordinate grows beyond what the painter can draw.
void AddScreenLine(std::vector<QPolygonF>& lines, std::span<const MapPoint> points, bool isRing, const DrawnMap& map);
/// The same for a ring that is filled.
QPolygonF ScreenRing(std::span<const MapPoint> points, const DrawnMap& map);

extern const QColor kHighlightColor;
/// The colour of outlines on the paper of the theme, and that of the edge that keeps them apart from any ground.
QColor InkColor(bool isDark);
QColor EdgeColor(bool isDark);
/// Of lines for which no colour is told.
QColor LineColor(bool isDark);
/// Of the outline of the model's domain.
QColor DomainColor(bool isDark);

/// Lines with an edge around them; those of one call share it, so that none lies over another's line.
void DrawEdgedLines(QPainter& painter, const std::vector<QPolygonF>& lines, const QColor& color, double width,
                    const DrawnMap& map);
/// Many lines, without an edge.
void DrawPlainLines(QPainter& painter, const std::vector<QPolygonF>& lines, const QColor& color, double width);
/// Very many lines, as fine as the screen draws them.
void DrawFineLines(QPainter& painter, const std::vector<QPolygonF>& lines, const QColor& color);
void DrawMarker(QPainter& painter, QPointF at, bool isHighlighted, double zoom);

}  // namespace tervane
