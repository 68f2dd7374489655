// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/maps/map_styles.h"

#include <QFontMetricsF>
#include <QPainterPath>
#include <algorithm>
#include <cmath>

#include "shell/widgets/qt_text.h"

namespace tervane {

namespace {

constexpr double kPixelsOfMillimetre = 96 / 25.4;  // at zoom 1

Qt::PenStyle PenOf(int dash) {
  switch (dash) {
    case kDashedLine:
      return Qt::DashLine;
    case kDottedLine:
      return Qt::DotLine;
    case kDashDotLine:
      return Qt::DashDotLine;
    case kDashDotDotLine:
      return Qt::DashDotDotLine;
    default:
      return Qt::SolidLine;
  }
}

/// The outline of a marker of radius 1; of those that are lines, the lines.
QPainterPath MarkerPath(int marker) {
  QPainterPath path;
  const auto ring = [&path](std::initializer_list<QPointF> points) { path.addPolygon(QPolygonF(points)); };
  const auto line = [&path](QPointF to) {
    path.moveTo(-to);
    path.lineTo(to);
  };
  constexpr double kSlant = 0.7071;
  switch (marker) {
    case kPlusMarker:
    case kStarMarker:
      line({1, 0});
      line({0, 1});
      if (marker == kPlusMarker) break;
      [[fallthrough]];
    case kCrossMarker:
      line({kSlant, kSlant});
      line({kSlant, -kSlant});
      break;
    case kTriangleMarker:
    case kFilledTriangleMarker:
      ring({{0, -1}, {0.87, 0.5}, {-0.87, 0.5}, {0, -1}});
      break;
    case kSquareMarker:
    case kFilledSquareMarker:
      path.addRect(-0.8, -0.8, 1.6, 1.6);
      break;
    case kDiamondMarker:
    case kFilledDiamondMarker:
      ring({{0, -1}, {1, 0}, {0, 1}, {-1, 0}, {0, -1}});
      break;
    default:
      path.addEllipse(QPointF(), 1, 1);
  }
  return path;
}

bool IsFilledMarker(int marker) { return marker < kPlusMarker || marker >= kFilledCircleMarker; }

/// The middle of a shape, where its text stands: of a line its middle point.
std::optional<MapPoint> PlaceOfText(const Shape& shape, ShapeKind kind, const std::optional<Envelope>& around) {
  if (!around || shape.points.empty()) return {};
  if (kind == ShapeKind::Polygon) return MapPoint{(around->xMin + around->xMax) / 2, (around->yMin + around->yMax) / 2};
  return shape.points[shape.points.size() / 2];
}

}  // namespace

bool StyledShapes::ArePoints() const { return data.Kind() == ShapeKind::Point || data.Kind() == ShapeKind::MultiPoint; }

void StyledShapes::Draw(QPainter& painter, const DrawnMap& map) const {
  ArePoints() ? DrawPoints(painter, map) : DrawLines(painter, map);
}

void StyledShapes::DrawPoints(QPainter& painter, const DrawnMap& map) const {
  const double radius = std::max(style.pointSize * kPixelsOfMillimetre * map.zoom / 2, 0.5);
  const QRectF limits = map.part.adjusted(-radius - 2, -radius - 2, radius + 2, radius + 2);
  const QColor color = QColor::fromRgb(style.pointColor);
  const bool isFilled = IsFilledMarker(style.marker);
  const double line = std::max(radius / 4, 1.0);
  // Drawn once, and then stamped.
  const double ratio = painter.device()->devicePixelRatioF(), room = radius + line + 2;
  QPixmap stamp(QSizeF(2 * room * ratio, 2 * room * ratio).toSize() + QSize(1, 1));
  stamp.setDevicePixelRatio(ratio);
  stamp.fill(Qt::transparent);
  QPainter inner(&stamp);
  inner.setRenderHint(QPainter::Antialiasing);
  inner.translate(room, room);
  const QPainterPath outline = QTransform::fromScale(radius, radius).map(MarkerPath(style.marker));
  if (style.hasEdge) inner.strokePath(outline, QPen(Qt::white, line + 2));
  if (isFilled)
    inner.fillPath(outline, color);
  else
    inner.strokePath(outline, QPen(color, line));
  inner.end();
  for (const Shape& shape : data.GetData())
    for (const MapPoint& point : shape.points)
      if (const QPointF at = map.window.ToScreen(point); limits.contains(at))
        painter.drawPixmap(at - QPointF(room, room), stamp);
}

void StyledShapes::DrawLines(QPainter& painter, const DrawnMap& map) const {
  const bool isRing = data.Kind() == ShapeKind::Polygon;
  const Envelope seen = AreaOf(map.window, map.part);
  std::vector<QPolygonF> lines;
  QPainterPath rings;
  qsizetype points = 0;
  for (std::size_t i = 0; i < around.size(); ++i) {
    if (!around[i] || !Overlap(*around[i], seen)) continue;
    const Shape& shape = data.GetData()[i];
    for (std::size_t part = 0; part < shape.parts.size(); ++part) {
      const std::size_t first = shape.parts[part], end = std::max(first, shape.PartEnd(part));
      const auto run = std::span(shape.points).subspan(first, end - first);
      AddScreenLine(lines, run, isRing, map);
      if (isRing && style.fill != kOutlineOnly) rings.addPolygon(ScreenRing(run, map));
    }
  }
  QColor color = QColor::fromRgb(style.lineColor);
  if (!rings.isEmpty()) {
    QColor fill = color;
    if (style.fill == kVeiledPolygon) fill.setAlpha(80);
    painter.fillPath(rings, QBrush(fill, style.fill == kHatchedPolygon ? Qt::BDiagPattern : Qt::SolidPattern));
  }
  double length = 0;
  for (const QPolygonF& line : lines) {
    points += line.size();
    for (qsizetype i = 1; i < line.size(); ++i) length += (line[i] - line[i - 1]).manhattanLength();
  }
  // Many layers may be such, and of segments of a pixel or two nobody sees how their edges are drawn.
  constexpr qsizetype kMany = 5'000, kVeryMany = 60'000;
  constexpr double kShort = 3, kNarrow = 1.5;
  const double width = style.lineWidth * kPixelsOfMillimetre * map.zoom;
  const bool isDense = points > kMany && width < kNarrow && length < kShort * static_cast<double>(points);
  if (isDense || points > kVeryMany) return DrawFineLines(painter, lines, color);
  if (style.dash == kSolidLine) return DrawPlainLines(painter, lines, color, width);
  painter.setPen(QPen(color, width, PenOf(style.dash), Qt::FlatCap));
  painter.setBrush(Qt::NoBrush);
  for (const QPolygonF& line : lines) painter.drawPolyline(line);
}

void StyledShapes::DrawTexts(QPainter& painter, const DrawnMap& map, LabelPlaces& places) const {
  const bool arePoints = ArePoints();
  const TextStyle& text = arePoints ? style.pointText : style.lineText;
  if (!text.isShown) return;
  const Envelope seen = AreaOf(map.window, map.part);
  const double radius = arePoints ? style.pointSize * kPixelsOfMillimetre * map.zoom / 2 : 0;
  const LabelLook look{QColor::fromRgb(text.color), text.isOpaque};
  for (std::size_t i = 0; i < around.size() && !places.IsFull(); ++i) {
    const Shape& shape = data.GetData()[i];
    if (!around[i] || !Overlap(*around[i], seen) || !shape.HasValue()) continue;
    const auto place = PlaceOfText(shape, data.Kind(), around[i]);
    const QString label = ToQt(TextOf(shape.Value()));
    if (!place || label.isEmpty()) continue;
    const QPointF at = map.window.ToScreen(*place);
    if (!map.part.contains(at)) continue;
    if (arePoints)
      places.DrawAround(painter, at, radius, label, map, look);
    else
      places.DrawAt(painter, at, label, map, look);
  }
}

}  // namespace tervane
