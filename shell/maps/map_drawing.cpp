// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/maps/map_drawing.h"

#include <algorithm>
#include <array>
#include <cmath>

namespace tervane {

const QColor kHighlightColor(0xe0, 0x3c, 0x31);

QColor InkColor(bool isDark) { return isDark ? QColor(0xf4, 0xf5, 0xf7) : QColor(0x26, 0x2b, 0x33); }
// As opaque as what stands out needs it on cells of any colour.
QColor EdgeColor(bool isDark) { return isDark ? QColor(0x14, 0x16, 0x1a, 230) : QColor(0xff, 0xff, 0xff, 230); }
QColor DomainColor(bool isDark) { return isDark ? QColor(0xe3, 0xa6, 0xf5) : QColor(0x7a, 0x1f, 0x8a); }

QColor LineColor(bool isDark) { return isDark ? QColor(0x7c, 0xc4, 0xff) : QColor(0x14, 0x5a, 0xa8); }

// ---- Areas

Envelope AreaOf(const MapWindow& window, const QRectF& part) {
  const MapPoint a = window.ToMap(part.bottomLeft()), b = window.ToMap(part.topRight());
  const double margin = 20 * window.metresPerPixel;
  return {a.x - margin, a.y - margin, b.x + margin, b.y + margin};
}

bool Overlap(const Envelope& a, const Envelope& b) {
  return a.xMin <= b.xMax && b.xMin <= a.xMax && a.yMin <= b.yMax && b.yMin <= a.yMax;
}

std::optional<Envelope> EnvelopeAround(std::span<const MapPoint> points) {
  if (points.empty()) return {};
  Envelope around{points[0].x, points[0].y, points[0].x, points[0].y};
  for (const MapPoint& point : points) {
    around = {std::min(around.xMin, point.x), std::min(around.yMin, point.y), std::max(around.xMax, point.x),
              std::max(around.yMax, point.y)};
  }
  return around;
}

void Extend(std::optional<Envelope>& area, const std::optional<Envelope>& by) {
  if (!by) return;
  area = area ? Envelope{std::min(area->xMin, by->xMin), std::min(area->yMin, by->yMin), std::max(area->xMax, by->xMax),
                         std::max(area->yMax, by->yMax)}
              : *by;
}

double DistanceToSegment(MapPoint p, MapPoint a, MapPoint b) {
  const double dx = b.x - a.x, dy = b.y - a.y, length = dx * dx + dy * dy;
  const double t = length > 0 ? std::clamp(((p.x - a.x) * dx + (p.y - a.y) * dy) / length, 0.0, 1.0) : 0.0;
  return std::hypot(a.x + t * dx - p.x, a.y + t * dy - p.y);
}

// ---- Lines on the screen

namespace {

constexpr double kFinest = 0.75;  ///< In pixels: closer points are one.
constexpr double kBeyond = 10;    ///< Pixels around the part, so that neither pens nor their ends are seen cut.

QRectF Limits(const DrawnMap& map) { return map.part.adjusted(-kBeyond, -kBeyond, kBeyond, kBeyond); }

/// Cuts a segment to a rectangle; false when nothing of it is inside.
bool Cut(QPointF& a, QPointF& b, const QRectF& to) {
  double from = 0, until = 1;
  const QPointF d = b - a;
  const auto edge = [&](double along, double distance) {
    if (along == 0) return distance >= 0;
    const double at = distance / along;
    if (along < 0)
      from = std::max(from, at);
    else
      until = std::min(until, at);
    return from <= until;
  };
  if (!edge(-d.x(), a.x() - to.left()) || !edge(d.x(), to.right() - a.x()) || !edge(-d.y(), a.y() - to.top()) ||
      !edge(d.y(), to.bottom() - a.y()))
    return false;
  const QPointF start = a;
  a = start + d * from;
  b = start + d * until;
  return true;
}

bool IsFine(QPointF by) { return std::abs(by.x()) < kFinest && std::abs(by.y()) < kFinest; }

/// The part of a ring on one side of a line: `inside` gives how far a point is inside.
template <class Inside>
QPolygonF CutRing(const QPolygonF& ring, Inside inside) {
  QPolygonF cut;
  for (qsizetype i = 0; i < ring.size(); ++i) {
    const QPointF a = ring[i == 0 ? ring.size() - 1 : i - 1], b = ring[i];
    const double from = inside(a), to = inside(b);
    if ((from >= 0) != (to >= 0)) cut << a + (b - a) * (from / (from - to));
    if (to >= 0) cut << b;
  }
  return cut;
}

}  // namespace

void AddScreenLine(std::vector<QPolygonF>& lines, std::span<const MapPoint> points, bool isRing, const DrawnMap& map) {
  if (points.empty()) return;
  const QRectF limits = Limits(map);
  QPointF before = map.window.ToScreen(points[0]);
  const QPointF closing = before;
  QPolygonF line;
  const auto finish = [&] {
    if (line.size() > 1) lines.push_back(line);
    line.clear();
  };
  const auto go = [&](QPointF to, bool always) {
    if (!always && IsFine(to - before)) return;
    QPointF a = before, b = to;
    before = to;
    if (!Cut(a, b, limits)) return finish();
    if (line.isEmpty() || line.back() != a) {
      finish();
      line << a;
    }
    line << b;
  };
  for (std::size_t i = 1; i < points.size(); ++i) go(map.window.ToScreen(points[i]), i + 1 == points.size());
  if (isRing) go(closing, true);
  finish();
}

QPolygonF ScreenRing(std::span<const MapPoint> points, const DrawnMap& map) {
  QPolygonF ring;
  for (const MapPoint& point : points)
    if (const QPointF at = map.window.ToScreen(point); ring.isEmpty() || !IsFine(at - ring.back())) ring << at;
  const QRectF limits = Limits(map);
  if (limits.contains(ring.boundingRect())) return ring;
  ring = CutRing(ring, [&](QPointF p) { return p.x() - limits.left(); });
  ring = CutRing(ring, [&](QPointF p) { return limits.right() - p.x(); });
  ring = CutRing(ring, [&](QPointF p) { return p.y() - limits.top(); });
  return CutRing(ring, [&](QPointF p) { return limits.bottom() - p.y(); });
}

void DrawEdgedLines(QPainter& painter, const std::vector<QPolygonF>& lines, const QColor& color, double width,
                    const DrawnMap& map) {
  painter.setBrush(Qt::NoBrush);
  for (const QPen& pen :
       {QPen(EdgeColor(map.isDark), (width + 2.2) * map.zoom, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin),
        QPen(color, width * map.zoom, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin)}) {
    painter.setPen(pen);
    for (const QPolygonF& line : lines) painter.drawPolyline(line);
  }
}

void DrawPlainLines(QPainter& painter, const std::vector<QPolygonF>& lines, const QColor& color, double width) {
  // Single segments with square ends are what the painter draws fast.
  painter.setPen(QPen(color, width, Qt::SolidLine, Qt::SquareCap));
  QVector<QLineF> segments;
  for (const QPolygonF& line : lines)
    for (qsizetype i = 1; i < line.size(); ++i) segments.emplace_back(line[i - 1], line[i]);
  painter.drawLines(segments);
}

void DrawFineLines(QPainter& painter, const std::vector<QPolygonF>& lines, const QColor& color) {
  painter.setRenderHint(QPainter::Antialiasing, false);
  painter.setPen(QPen(color, 0));
  for (const QPolygonF& line : lines) painter.drawPolyline(line);
  painter.setRenderHint(QPainter::Antialiasing);
}

void DrawMarker(QPainter& painter, QPointF at, bool isHighlighted, double zoom) {
  const double radius = (isHighlighted ? 5.0 : 3.6) * zoom;
  painter.setPen(QPen(QColor(0x1d, 0x22, 0x2a), 1.3 * zoom));
  painter.setBrush(isHighlighted ? kHighlightColor : QColor(0xff, 0xff, 0xff));
  painter.drawEllipse(at, radius, radius);
}

}  // namespace tervane
