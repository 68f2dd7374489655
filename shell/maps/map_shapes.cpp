// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/maps/map_shapes.h"

#include <QCoreApplication>
#include <QFontMetricsF>
#include <QPainterPath>
#include <algorithm>
#include <cmath>
#include <limits>
#include <map>

#include "shell/maps/map_styles.h"
#include "shell/widgets/qt_text.h"

namespace tervane {

namespace {

std::span<const MapPoint> PartOf(const Shape& shape, std::size_t part) {
  const std::size_t first = shape.parts[part], end = std::max(first, shape.PartEnd(part));
  return std::span(shape.points).subspan(first, end - first);
}

/// Even-odd over all rings, so that holes are outside.
bool IsInside(const Shape& shape, MapPoint place) {
  bool inside = false;
  for (std::size_t part = 0; part < shape.parts.size(); ++part) {
    const std::span<const MapPoint> ring = PartOf(shape, part);
    for (std::size_t i = 0, j = ring.size() - 1; i < ring.size(); j = i++) {
      const MapPoint &a = ring[i], &b = ring[j];
      if ((a.y > place.y) != (b.y > place.y) && place.x < (b.x - a.x) * (place.y - a.y) / (b.y - a.y) + a.x)
        inside = !inside;
    }
  }
  return inside;
}

double DistanceTo(const Shape& shape, ShapeKind kind, MapPoint place) {
  double distance = std::numeric_limits<double>::infinity();
  if (kind != ShapeKind::Line) {
    for (const MapPoint& point : shape.points)
      distance = std::min(distance, std::hypot(point.x - place.x, point.y - place.y));
    return distance;
  }
  for (std::size_t part = 0; part < shape.parts.size(); ++part) {
    const std::span<const MapPoint> line = PartOf(shape, part);
    for (std::size_t i = 1; i < line.size(); ++i)
      distance = std::min(distance, DistanceToSegment(place, line[i - 1], line[i]));
  }
  return distance;
}

/// What a value is called on this layer.
QString NameOf(const ShapeLayer& layer, const ShapeValue& value) {
  const std::string text = TextOf(value);
  const auto found = std::ranges::find(layer.names, text, &std::pair<std::string, std::string>::first);
  return ToQt(found == layer.names.end() || found->second.empty() ? text : found->second);
}

}  // namespace

ShapePicture::ShapePicture(ShapeLayer layer) : layer_(std::move(layer)) {
  const std::vector<Shape>& shapes = layer_.shapes->GetData();
  for (std::size_t i = 0; i < shapes.size(); ++i) {
    around_.push_back(EnvelopeAround(shapes[i].points));
    Extend(area_, around_.back());
    standsOut_.push_back(layer_.highlighted.IsOfShape(i, shapes[i]));
  }
  if (layer_.shapes->Kind() != ShapeKind::Polygon) return;
  if (layer_.isFilled) MakeColors();
  if (!layer_.withLabels) return;
  for (std::size_t i = 0; i < shapes.size(); ++i) rooms_.push_back(RoomIn(i));
}

bool ShapePicture::ArePoints() const {
  return layer_.shapes->Kind() == ShapeKind::Point || layer_.shapes->Kind() == ShapeKind::MultiPoint;
}

/// Each value has a colour, in the order of the values.
void ShapePicture::MakeColors() {
  const auto& columns = layer_.shapes->Columns();
  if (!columns.empty()) legend_.title = ToQt(columns.front().name);
  std::map<ShapeValue, std::size_t> places;
  const ShapeValue none;
  const auto valueOf = [&](const Shape& shape) -> const ShapeValue& { return shape.HasValue() ? shape.Value() : none; };
  for (const Shape& shape : layer_.shapes->GetData()) places.emplace(valueOf(shape), 0);
  for (auto& [value, place] : places) {
    place = colors_.size();
    QColor color = QColor(CodeColor(place));
    color.setAlpha(115);
    colors_.push_back(color);
    const QString text = NameOf(layer_, value);
    legend_.Add(color, text.isEmpty() ? QCoreApplication::translate("ShapePicture", "no value") : text);
  }
  for (const Shape& shape : layer_.shapes->GetData()) colorOf_.push_back(places.at(valueOf(shape)));
}

/// The widest stretch inside of some horizontal lines: what bends or has holes is met too.
ShapePicture::Room ShapePicture::RoomIn(std::size_t place) const {
  Room best;
  if (!around_[place]) return best;
  const Shape& shape = layer_.shapes->GetData()[place];
  constexpr int kLines = 9;
  for (const int number : {4, 3, 5, 2, 6, 1, 7, 0, 8}) {
    const double y = around_[place]->yMin + (around_[place]->yMax - around_[place]->yMin) * (number + 0.5) / kLines;
    std::vector<double> crossings;
    for (std::size_t part = 0; part < shape.parts.size(); ++part) {
      const std::span<const MapPoint> ring = PartOf(shape, part);
      for (std::size_t i = 0, j = ring.size() - 1; i < ring.size(); j = i++)
        if ((ring[i].y > y) != (ring[j].y > y))
          crossings.push_back((ring[j].x - ring[i].x) * (y - ring[i].y) / (ring[j].y - ring[i].y) + ring[i].x);
    }
    std::ranges::sort(crossings);
    for (std::size_t i = 1; i < crossings.size(); i += 2) {
      // The middle is taken where it does about as well.
      if (const double width = crossings[i] - crossings[i - 1]; width > 1.15 * best.width)
        best = {{(crossings[i] + crossings[i - 1]) / 2, y}, width};
    }
  }
  return best;
}

void ShapePicture::Draw(QPainter& painter, const DrawnMap& map) const {
  if (layer_.style) return StyledShapes{*layer_.shapes, around_, *layer_.style}.Draw(painter, map);
  if (ArePoints()) return DrawPoints(painter, map);
  if (!colors_.empty()) DrawFills(painter, map);
  DrawOutlines(painter, map);
}

void ShapePicture::DrawFills(QPainter& painter, const DrawnMap& map) const {
  std::vector<QPainterPath> fills(colors_.size());
  const Envelope seen = AreaOf(map.window, map.part);
  for (std::size_t i = 0; i < around_.size(); ++i) {
    if (!around_[i] || !Overlap(*around_[i], seen)) continue;
    const Shape& shape = layer_.shapes->GetData()[i];
    for (std::size_t part = 0; part < shape.parts.size(); ++part)
      fills[colorOf_[i]].addPolygon(ScreenRing(PartOf(shape, part), map));
  }
  for (std::size_t i = 0; i < fills.size(); ++i) painter.fillPath(fills[i], colors_[i]);
}

void ShapePicture::DrawOutlines(QPainter& painter, const DrawnMap& map) const {
  const CYbShapeData& data = *layer_.shapes;
  const bool isRing = data.Kind() == ShapeKind::Polygon;
  const Envelope seen = AreaOf(map.window, map.part);
  std::vector<QPolygonF> lines, highlighted;
  QPainterPath filled;
  for (std::size_t i = 0; i < around_.size(); ++i) {
    if (!around_[i] || !Overlap(*around_[i], seen)) continue;
    const Shape& shape = data.GetData()[i];
    for (std::size_t part = 0; part < shape.parts.size(); ++part) {
      AddScreenLine(standsOut_[i] ? highlighted : lines, PartOf(shape, part), isRing, map);
      if (standsOut_[i] && isRing) filled.addPolygon(ScreenRing(PartOf(shape, part), map));
    }
  }
  const QColor ink = layer_.lineColor  ? QColor::fromRgb(*layer_.lineColor)
                     : layer_.isDomain ? DomainColor(map.isDark)
                     : isRing          ? InkColor(map.isDark)
                                       : LineColor(map.isDark);
  DrawEdgedLines(painter, lines, ink, layer_.lineWidth.value_or(layer_.isDomain ? 1.4 : isRing ? 1.1 : 1.6), map);
  if (highlighted.empty()) return;
  QColor veil = kHighlightColor;
  veil.setAlpha(colors_.empty() ? 50 : 90);
  painter.fillPath(filled, veil);
  DrawEdgedLines(painter, highlighted, kHighlightColor, 2.2, map);
}

void ShapePicture::DrawPoints(QPainter& painter, const DrawnMap& map) const {
  const QRectF limits = map.part.adjusted(-10, -10, 10, 10);
  // Many points in little room are dots, so that the ground between them is seen.
  std::size_t visible = 0;
  for (const Shape& shape : layer_.shapes->GetData())
    for (const MapPoint& point : shape.points) visible += limits.contains(map.window.ToScreen(point)) ? 1 : 0;
  constexpr double kRoomOfMarker = 200;  // square pixels at zoom 1
  const bool areDots =
      static_cast<double>(visible) * kRoomOfMarker * map.zoom * map.zoom > map.part.width() * map.part.height();
  // Those that stand out lie above the others.
  for (const bool standsOut : {false, true}) {
    painter.setPen(QPen(InkColor(false), std::max(1.0, map.zoom)));
    for (std::size_t i = 0; i < around_.size(); ++i) {
      if (standsOut_[i] != standsOut) continue;
      for (const MapPoint& point : layer_.shapes->GetData()[i].points)
        if (const QPointF at = map.window.ToScreen(point); limits.contains(at))
          areDots && !standsOut ? painter.drawPoint(at) : DrawMarker(painter, at, standsOut, map.zoom);
    }
  }
}

void ShapePicture::DrawLabels(QPainter& painter, const DrawnMap& map, LabelPlaces& places) const {
  if (layer_.style) return StyledShapes{*layer_.shapes, around_, *layer_.style}.DrawTexts(painter, map, places);
  const QFontMetricsF metrics(painter.font());
  const double metres = map.window.metresPerPixel;
  for (std::size_t i = 0; i < rooms_.size() && !places.IsFull(); ++i) {
    if (rooms_[i].width <= 0) continue;
    const QPointF middle = map.window.ToScreen(rooms_[i].middle);
    if (!map.part.contains(middle)) continue;
    const Shape& shape = layer_.shapes->GetData()[i];
    const QString text = shape.HasValue() ? NameOf(layer_, shape.Value()) : QString();
    const QSizeF size = LabelSize(metrics, text);
    const double height = (around_[i]->yMax - around_[i]->yMin) / metres;
    if (!text.isEmpty() && size.width() < 0.9 * rooms_[i].width / metres && 1.5 * size.height() < height)
      places.DrawAt(painter, middle, text, map);
  }
}

std::optional<std::size_t> ShapePicture::At(MapPoint place, double reach) const {
  const CYbShapeData& data = *layer_.shapes;
  std::optional<std::size_t> found;
  double nearest = reach;
  const Envelope near{place.x - reach, place.y - reach, place.x + reach, place.y + reach};
  for (std::size_t i = around_.size(); i-- > 0;) {
    if (!around_[i] || !Overlap(*around_[i], near)) continue;
    const Shape& shape = data.GetData()[i];
    if (data.Kind() == ShapeKind::Polygon) {
      if (IsInside(shape, place)) return i;
    } else if (const double distance = DistanceTo(shape, data.Kind(), place); distance < nearest) {
      nearest = distance;
      found = i;
    }
  }
  return found;
}

}  // namespace tervane
