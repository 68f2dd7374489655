// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/maps/map_lines.h"

#include <algorithm>
#include <cmath>
#include <unordered_set>

#include "geometry/grid_section.h"
#include "shell/widgets/qt_text.h"

namespace tervane {

namespace {

constexpr std::size_t kPointsOfPiece = 64;
constexpr double kWidth = 1.8, kPaintedWidth = 3.4, kHighlightedWidth = 3.2;  ///< In pixels at zoom 1.
/// Beyond, edges would hide what they keep apart, and take long; beyond still more, lines are as fine as can be.
constexpr double kManySegments = 1000, kVeryManySegments = 8000;
constexpr double kRoomOfPoint = 12, kRoomOfChainage = 45;

}  // namespace

LinePicture::LinePicture(LineLayer layer, const DisplayUnits& units) : layer_(std::move(layer)) {
  std::vector<double> values;
  std::size_t points = 0;
  for (std::size_t number = 0; number < layer_.lines->size(); ++number) {
    const MapLine& line = Line(number);
    if (line.value) values.push_back(*line.value);
    length_ += LengthOf(line.points);
    points += line.points.size();
    // Pieces share the point between them.
    for (std::size_t first = 0; first < line.points.size(); first += kPointsOfPiece) {
      const std::size_t count = std::min(kPointsOfPiece + 1, line.points.size() - first);
      if (first > 0 && count < 2) break;
      const auto around = EnvelopeAround(std::span(line.points).subspan(first, count));
      pieces_.push_back({number, first, count, *around});
      Extend(area_, around);
    }
  }
  if (points > 0) spacing_ = length_ / static_cast<double>(points);
  if (layer_.painted) colors_ = ValueColors(*layer_.painted, values, &units);
}

bool LinePicture::HasRoomForPoints(const DrawnMap& map, double pixels) const {
  return layer_.withPoints && spacing_ > pixels * map.zoom * map.window.metresPerPixel;
}

/// What a window anywhere on the layer shows, on an average: lines must look alike in all strips that a moved map adds.
double LinePicture::EstimatedSegments(const DrawnMap& map) const {
  if (!area_) return 0;
  const double metres = map.window.metresPerPixel, width = area_->xMax - area_->xMin,
               height = area_->yMax - area_->yMin;
  const double seen = std::min(1.0, map.window.rect.width() * metres / std::max(width, metres)) *
                      std::min(1.0, map.window.rect.height() * metres / std::max(height, metres));
  return seen * length_ / std::max(spacing_, metres);
}

void LinePicture::Draw(QPainter& painter, const DrawnMap& map) const {
  const Envelope seenArea = AreaOf(map.window, map.part);
  std::vector<Piece> seen;
  std::ranges::copy_if(pieces_, std::back_inserter(seen),
                       [&](const Piece& piece) { return Overlap(piece.around, seenArea); });
  std::vector<std::vector<QPolygonF>> lines(std::max<std::size_t>(colors_.Colors().size(), 1));
  std::vector<QPolygonF> highlighted;
  for (const Piece& piece : seen) {
    const MapLine& line = Line(piece.line);
    std::vector<QPolygonF>& kind = StandsOut(piece.line) ? highlighted
                                   : layer_.painted
                                       ? lines[line.value ? colors_.Number(*line.value) : colors_.Colors().size() - 1]
                                       : lines.front();
    AddScreenLine(kind, std::span(line.points).subspan(piece.first, piece.count), false, map);
  }
  const double segments = EstimatedSegments(map);
  const auto draw = [&](const std::vector<QPolygonF>& drawn, const QColor& color, double width) {
    if (segments > kVeryManySegments) return DrawFineLines(painter, drawn, color);
    segments > kManySegments ? DrawPlainLines(painter, drawn, color, width * map.zoom)
                             : DrawEdgedLines(painter, drawn, color, width, map);
  };
  const QColor plain = layer_.lineColor ? QColor::fromRgb(*layer_.lineColor) : LineColor(map.isDark);
  const double width = layer_.lineWidth.value_or(layer_.painted ? kPaintedWidth : kWidth);
  for (std::size_t kind = 0; kind < lines.size(); ++kind)
    draw(lines[kind], layer_.painted ? colors_.Colors()[kind] : plain, width);
  DrawEdgedLines(painter, highlighted, kHighlightColor, std::max(width, kHighlightedWidth), map);
  if (HasRoomForPoints(map, kRoomOfPoint)) DrawPoints(painter, map, seen);
}

void LinePicture::DrawPoints(QPainter& painter, const DrawnMap& map, const std::vector<Piece>& seen) const {
  const double radius = 2.4 * map.zoom;
  const QRectF limits = map.part.adjusted(-10, -10, 10, 10);
  painter.setPen(QPen(InkColor(map.isDark), map.zoom));
  painter.setBrush(QColor(0xff, 0xff, 0xff));
  for (const Piece& piece : seen)
    for (std::size_t i = piece.first; i < piece.first + piece.count; ++i)
      if (const QPointF at = map.window.ToScreen(Line(piece.line).points[i]); limits.contains(at))
        painter.drawEllipse(at, radius, radius);
}

void LinePicture::DrawLabels(QPainter& painter, const DrawnMap& map, LabelPlaces& places) const {
  const Envelope seenArea = AreaOf(map.window, map.part);
  std::unordered_set<std::size_t> named;
  const double reach = 3 * map.zoom;
  // What stands out is told first, then each line where the middle of a piece is seen.
  for (const bool first : {true, false}) {
    for (const Piece& piece : pieces_) {
      if (!layer_.withNames || places.IsFull()) break;
      const MapLine& line = Line(piece.line);
      if (line.name.empty() || StandsOut(piece.line) != first || named.contains(piece.line)) continue;
      if (!Overlap(piece.around, seenArea)) continue;
      const QPointF at = map.window.ToScreen(line.points[piece.first + piece.count / 2]);
      if (map.part.contains(at) && places.DrawAround(painter, at, reach, ToQt(line.name), map))
        named.insert(piece.line);
    }
  }
  if (!HasRoomForPoints(map, kRoomOfChainage)) return;
  for (const Piece& piece : pieces_) {
    if (places.IsFull()) return;
    const MapLine& line = Line(piece.line);
    if (line.chainages.size() != line.points.size() || !Overlap(piece.around, seenArea)) continue;
    for (std::size_t i = piece.first; i < piece.first + piece.count; ++i)
      if (const QPointF at = map.window.ToScreen(line.points[i]); map.part.contains(at))
        places.DrawAround(painter, at, reach, ToQt(FormatNumber(line.chainages[i], "%.6g")), map);
  }
}

double LinePicture::ChainageAt(const MapLine& line, std::size_t segment, MapPoint place) const {
  const MapPoint a = line.points[segment], b = line.points[segment + 1];
  const double dx = b.x - a.x, dy = b.y - a.y, length = std::hypot(dx, dy);
  const double part =
      length > 0 ? std::clamp(((place.x - a.x) * dx + (place.y - a.y) * dy) / (length * length), 0.0, 1.0) : 0.0;
  if (line.chainages.size() == line.points.size())
    return line.chainages[segment] + part * (line.chainages[segment + 1] - line.chainages[segment]);
  return LengthOf({line.points.begin(), line.points.begin() + static_cast<std::ptrdiff_t>(segment) + 1}) +
         part * length;
}

std::optional<LinePicture::Place> LinePicture::At(MapPoint place, double reach) const {
  const Envelope near{place.x - reach, place.y - reach, place.x + reach, place.y + reach};
  std::optional<Place> found;
  std::size_t segment = 0;
  double nearest = reach;
  for (const Piece& piece : pieces_) {
    if (!Overlap(piece.around, near)) continue;
    const std::vector<MapPoint>& points = Line(piece.line).points;
    for (std::size_t i = piece.first; i + 1 < piece.first + piece.count; ++i) {
      if (const double distance = DistanceToSegment(place, points[i], points[i + 1]); distance < nearest) {
        nearest = distance;
        found = Place{piece.line, 0};
        segment = i;
      }
    }
  }
  if (found) found->chainage = ChainageAt(Line(found->line), segment, place);
  return found;
}

}  // namespace tervane
