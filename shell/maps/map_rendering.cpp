// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/maps/map_rendering.h"

#include <QFontMetricsF>
#include <QPainterPath>
#include <QPolygonF>
#include <algorithm>
#include <array>
#include <cmath>
#include <limits>

#include "shell/widgets/qt_text.h"

namespace tervane {

namespace {

/// The whole numbers x of [0, count) for which 0 <= start + x * step < limit, perhaps with one more at either end.
void Narrow(double start, double step, double limit, int& first, int& last) {
  if (step == 0) {
    if (start < 0 || start >= limit) last = first;
    return;
  }
  double from = -start / step, to = (limit - start) / step;
  if (from > to) std::swap(from, to);
  if (to < first || from > last) {
    last = first;
    return;
  }
  first = std::max(first, static_cast<int>(std::max(from - 1, static_cast<double>(first))));
  last = std::min(last, static_cast<int>(std::min(to + 2, static_cast<double>(last))));
}

bool Overlap(const Envelope& a, const Envelope& b) {
  return a.xMin <= b.xMax && b.xMin <= a.xMax && a.yMin <= b.yMax && b.yMin <= a.yMax;
}

Envelope SeenArea(const MapWindow& window) {
  const MapPoint a = window.ToMap(window.rect.bottomLeft()), b = window.ToMap(window.rect.topRight());
  const double margin = 20 * window.metresPerPixel;
  return {a.x - margin, a.y - margin, b.x + margin, b.y + margin};
}

}  // namespace

// ---- Grids

std::shared_ptr<const GridPicture> GridPicture::Make(const GridLayer& layer, const DisplayUnits& units,
                                                     const std::atomic<bool>& isGivenUp) {
  auto picture = std::make_shared<GridPicture>();
  picture->geometry_ = layer.grid->Geometry();
  picture->palette_ = MapPalette::Of(layer, &units);
  const auto rowLength = static_cast<std::size_t>(picture->geometry_.nx);
  Level finest{picture->geometry_.nx, picture->geometry_.ny, {}};
  finest.colors.resize(picture->geometry_.CellCount());
  std::vector<std::size_t> cellsOfColor(MapPalette::kMostColors + 1);
  const std::vector<float>& values = layer.grid->Values();
  for (std::size_t row = 0; row < static_cast<std::size_t>(finest.ny); ++row) {
    if (isGivenUp) return nullptr;
    for (std::size_t cell = row * rowLength; cell < (row + 1) * rowLength; ++cell)
      ++cellsOfColor[finest.colors[cell] = picture->palette_.ColorNumber(values[cell])];
  }
  picture->levels_.push_back(std::move(finest));
  constexpr int kCoarsest = 64;
  while (std::max(picture->levels_.back().nx, picture->levels_.back().ny) > kCoarsest) {
    if (isGivenUp) return nullptr;
    picture->levels_.push_back(picture->Halved(picture->levels_.back(), cellsOfColor));
  }
  return picture;
}

GridPicture::Level GridPicture::Halved(const Level& finer, const std::vector<std::size_t>& cellsOfColor) const {
  Level level{(finer.nx + 1) / 2, (finer.ny + 1) / 2, {}};
  level.colors.resize(static_cast<std::size_t>(level.nx) * static_cast<std::size_t>(level.ny));
  // An empty cell never stands for others. Of codes the rarest one does, so that a single cell of it stays visible.
  std::array<std::size_t, MapPalette::kMostColors + 1> rank{};
  for (std::size_t color = 0; color < rank.size(); ++color)
    rank[color] = palette_.KeepsSingleCells() ? cellsOfColor[color] : 1;
  rank[0] = std::numeric_limits<std::size_t>::max();
  std::size_t out = 0;
  for (int j = 0; j < level.ny; ++j) {
    const std::uint8_t* lower = &finer.colors[static_cast<std::size_t>(2 * j) * static_cast<std::size_t>(finer.nx)];
    const std::uint8_t* upper = 2 * j + 1 < finer.ny ? lower + finer.nx : lower;
    for (int i = 0; i < level.nx; ++i) {
      const int left = 2 * i, right = std::min(left + 1, finer.nx - 1);
      std::uint8_t best = lower[left];
      for (const std::uint8_t other : {lower[right], upper[left], upper[right]})
        if (rank[other] < rank[best]) best = other;
      level.colors[out++] = best;
    }
  }
  return level;
}

const GridPicture::Level& GridPicture::LevelFor(double cellsPerPixel, int& number) const {
  const double halvings = std::log2(std::max(cellsPerPixel, 1e-9));
  // A cell of a level is at least a pixel where each cell counts, and at most one where pictures are to be sharp.
  const double wanted = palette_.KeepsSingleCells() ? std::ceil(halvings - 1e-6) : std::floor(halvings);
  number = static_cast<int>(std::clamp(wanted, 0.0, static_cast<double>(levels_.size() - 1)));
  return levels_[static_cast<std::size_t>(number)];
}

void GridPicture::Draw(QPainter& painter, const MapWindow& window, double pixelRatio, double opacity) const {
  const QSize pixels = (window.rect.size() * pixelRatio).toSize();
  if (pixels.isEmpty() || levels_.front().colors.empty()) return;
  const double metres = window.metresPerPixel / pixelRatio;
  const GridTransform transform(geometry_);
  int number = 0;
  const bool isTurned = std::abs(std::remainder(geometry_.rotation, 90.0)) > 1e-6;
  // A turned cell of one pixel may slip between the centres of pixels.
  const double slack = isTurned && palette_.KeepsSingleCells() ? std::sqrt(2.0) : 1.0;
  const Level& level = LevelFor(slack * metres / geometry_.cellSize, number);
  const std::vector<QRgb>& colors = palette_.Colors();

  QImage image(pixels, QImage::Format_ARGB32_Premultiplied);
  image.fill(Qt::transparent);
  const QPointF corner = window.rect.topLeft();
  const auto cellsAt = [&](double x, double y) {
    return transform.ToCells(window.ToMap({corner.x() + x / pixelRatio, corner.y() + y / pixelRatio}));
  };
  const MapPoint origin = cellsAt(0.5, 0.5), right = cellsAt(1.5, 0.5);
  // What a turn leaves of a zero is one.
  const auto step = [&](double difference) {
    return std::abs(difference) < 1e-9 * metres / geometry_.cellSize ? 0.0 : difference;
  };
  const double du = step(right.x - origin.x), dv = step(right.y - origin.y);
  for (int y = 0; y < pixels.height(); ++y) {
    const MapPoint start = cellsAt(0.5, y + 0.5);
    int first = 0, last = pixels.width();
    Narrow(start.x, du, geometry_.nx, first, last);
    Narrow(start.y, dv, geometry_.ny, first, last);
    auto* line = reinterpret_cast<QRgb*>(image.scanLine(y));
    for (int x = first; x < last; ++x) {
      const double u = start.x + x * du, v = start.y + x * dv;
      if (u < 0 || v < 0) continue;
      const int i = static_cast<int>(u), j = static_cast<int>(v);
      if (i >= geometry_.nx || j >= geometry_.ny) continue;
      line[x] = colors[level.colors[static_cast<std::size_t>(j >> number) * static_cast<std::size_t>(level.nx) +
                                    static_cast<std::size_t>(i >> number)]];
    }
  }
  painter.save();
  painter.setOpacity(opacity);
  image.setDevicePixelRatio(pixelRatio);
  painter.drawImage(corner, image);
  painter.restore();
}

// ---- Shapes

namespace {

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

/// The lines of a part on the screen: points within a pixel of each other are one, and what is far outside is cut away,
/// so that no coordinate grows beyond what the painter can draw.
void AddLines(std::vector<QPolygonF>& lines, const Shape& shape, std::size_t part, bool isRing,
              const MapWindow& window) {
  const QRectF limits = window.rect.adjusted(-10, -10, 10, 10);
  const std::size_t first = shape.parts[part], end = shape.PartEnd(part);
  if (end <= first) return;
  QPointF before = window.ToScreen(shape.points[first]);
  const QPointF closing = before;
  QPolygonF line;
  const auto finish = [&] {
    if (line.size() > 1) lines.push_back(line);
    line.clear();
  };
  const auto go = [&](QPointF to, bool always) {
    const QPointF by = to - before;
    if (!always && std::abs(by.x()) < 0.75 && std::abs(by.y()) < 0.75) return;
    QPointF a = before, b = to;
    before = to;
    if (!Cut(a, b, limits)) return finish();
    if (line.isEmpty() || line.back() != a) {
      finish();
      line << a;
    }
    line << b;
  };
  for (std::size_t i = first + 1; i < end; ++i) go(window.ToScreen(shape.points[i]), i + 1 == end);
  if (isRing) go(closing, true);
  finish();
}

/// Even-odd over all rings, so that holes are outside.
bool IsInside(const Shape& shape, MapPoint place) {
  bool inside = false;
  for (std::size_t part = 0; part < shape.parts.size(); ++part) {
    const std::size_t end = shape.PartEnd(part);
    for (std::size_t i = shape.parts[part], j = end - 1; i < end; j = i++) {
      const MapPoint &a = shape.points[i], &b = shape.points[j];
      if ((a.y > place.y) != (b.y > place.y) && place.x < (b.x - a.x) * (place.y - a.y) / (b.y - a.y) + a.x)
        inside = !inside;
    }
  }
  return inside;
}

double DistanceToSegment(MapPoint p, MapPoint a, MapPoint b) {
  const double dx = b.x - a.x, dy = b.y - a.y, length = dx * dx + dy * dy;
  const double t = length > 0 ? std::clamp(((p.x - a.x) * dx + (p.y - a.y) * dy) / length, 0.0, 1.0) : 0.0;
  return std::hypot(a.x + t * dx - p.x, a.y + t * dy - p.y);
}

double DistanceTo(const Shape& shape, ShapeKind kind, MapPoint place) {
  double distance = std::numeric_limits<double>::infinity();
  if (kind != ShapeKind::Line) {
    for (const MapPoint& point : shape.points)
      distance = std::min(distance, std::hypot(point.x - place.x, point.y - place.y));
    return distance;
  }
  for (std::size_t part = 0; part < shape.parts.size(); ++part)
    for (std::size_t i = shape.parts[part] + 1; i < shape.PartEnd(part); ++i)
      distance = std::min(distance, DistanceToSegment(place, shape.points[i - 1], shape.points[i]));
  return distance;
}

const QColor kHighlightColor(0xe0, 0x3c, 0x31);

/// The colour of outlines on the paper of the theme, and that of the edge that keeps them apart from any ground.
QColor InkColor(bool onDark) { return onDark ? QColor(0xf4, 0xf5, 0xf7) : QColor(0x26, 0x2b, 0x33); }
QColor EdgeColor(bool onDark) { return onDark ? QColor(0x14, 0x16, 0x1a, 170) : QColor(0xff, 0xff, 0xff, 170); }

void DrawMarker(QPainter& painter, QPointF at, bool isHighlighted, double zoom) {
  const double radius = (isHighlighted ? 5.0 : 3.6) * zoom;
  painter.setPen(QPen(QColor(0x1d, 0x22, 0x2a), 1.3 * zoom));
  painter.setBrush(isHighlighted ? kHighlightColor : QColor(0xff, 0xff, 0xff));
  painter.drawEllipse(at, radius, radius);
}

}  // namespace

ShapePicture::ShapePicture(ShapeLayer layer) : layer_(std::move(layer)) {
  for (const Shape& shape : layer_.shapes->GetData()) {
    constexpr double kFar = std::numeric_limits<double>::infinity();
    Envelope around{kFar, kFar, -kFar, -kFar};
    for (const MapPoint& point : shape.points) {
      around = {std::min(around.xMin, point.x), std::min(around.yMin, point.y), std::max(around.xMax, point.x),
                std::max(around.yMax, point.y)};
    }
    around_.push_back(around);
    if (shape.points.empty()) continue;
    if (!area_) area_ = around;
    area_ = Envelope{std::min(area_->xMin, around.xMin), std::min(area_->yMin, around.yMin),
                     std::max(area_->xMax, around.xMax), std::max(area_->yMax, around.yMax)};
  }
}

bool ShapePicture::IsHighlighted(const Shape& shape) const {
  return !layer_.highlighted.empty() && shape.HasValue() && TextOf(shape.Value()) == layer_.highlighted;
}

void ShapePicture::Draw(QPainter& painter, const MapWindow& window, bool onDark, double zoom) const {
  const CYbShapeData& data = *layer_.shapes;
  if (data.Kind() == ShapeKind::Point || data.Kind() == ShapeKind::MultiPoint) return DrawPoints(painter, window, zoom);
  const bool isRing = data.Kind() == ShapeKind::Polygon;
  const Envelope seen = SeenArea(window);
  std::vector<QPolygonF> lines, highlighted;
  QPainterPath filled;
  filled.setFillRule(Qt::OddEvenFill);
  for (std::size_t i = 0; i < around_.size(); ++i) {
    if (!Overlap(around_[i], seen)) continue;
    const Shape& shape = data.GetData()[i];
    const bool standsOut = IsHighlighted(shape);
    for (std::size_t part = 0; part < shape.parts.size(); ++part) {
      AddLines(standsOut ? highlighted : lines, shape, part, isRing, window);
      if (!standsOut || !isRing) continue;
      QPolygonF ring;
      for (std::size_t p = shape.parts[part]; p < shape.PartEnd(part); ++p) ring << window.ToScreen(shape.points[p]);
      filled.addPolygon(ring);
    }
  }
  const QColor ink = layer_.lineColor ? QColor::fromRgb(*layer_.lineColor)
                     : isRing         ? InkColor(onDark)
                     : onDark         ? QColor(0x7c, 0xc4, 0xff)
                                      : QColor(0x14, 0x5a, 0xa8);
  const auto draw = [&](const std::vector<QPolygonF>& drawn, const QColor& color, double width) {
    // Outlines of one layer share their edge, so that none lies over another's line.
    for (const QPen& pen : {QPen(EdgeColor(onDark), (width + 2.2) * zoom, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin),
                            QPen(color, width * zoom, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin)}) {
      painter.setPen(pen);
      for (const QPolygonF& line : drawn) painter.drawPolyline(line);
    }
  };
  painter.setBrush(Qt::NoBrush);
  draw(lines, ink, layer_.lineWidth.value_or(isRing ? 1.1 : 1.6));
  if (highlighted.empty()) return;
  QColor veil = kHighlightColor;
  veil.setAlpha(50);
  painter.fillPath(filled, veil);
  draw(highlighted, kHighlightColor, 2.2);
}

void ShapePicture::DrawPoints(QPainter& painter, const MapWindow& window, double zoom) const {
  const QRectF limits = window.rect.adjusted(-10, -10, 10, 10);
  // Many points in little room are dots, so that the ground between them is seen.
  std::size_t visible = 0;
  for (const Shape& shape : layer_.shapes->GetData())
    for (const MapPoint& point : shape.points) visible += limits.contains(window.ToScreen(point)) ? 1 : 0;
  constexpr double kRoomOfMarker = 200;  // square pixels at zoom 1
  const bool areDots =
      static_cast<double>(visible) * kRoomOfMarker * zoom * zoom > window.rect.width() * window.rect.height();
  painter.setPen(QPen(InkColor(false), std::max(1.0, zoom)));
  // Those that stand out lie above the others.
  for (const bool standsOut : {false, true}) {
    for (const Shape& shape : layer_.shapes->GetData()) {
      if (IsHighlighted(shape) != standsOut) continue;
      for (const MapPoint& point : shape.points)
        if (const QPointF at = window.ToScreen(point); limits.contains(at))
          areDots && !standsOut ? painter.drawPoint(at) : DrawMarker(painter, at, standsOut, zoom);
    }
  }
}

std::optional<std::size_t> ShapePicture::At(MapPoint place, double reach) const {
  const CYbShapeData& data = *layer_.shapes;
  std::optional<std::size_t> found;
  double nearest = reach;
  const Envelope near{place.x - reach, place.y - reach, place.x + reach, place.y + reach};
  for (std::size_t i = around_.size(); i-- > 0;) {
    if (!Overlap(around_[i], near)) continue;
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

// ---- Points

void DrawOutlinedText(QPainter& painter, QPointF baseline, const QString& text, const QColor& color,
                      const QColor& around) {
  QPainterPath path;
  path.addText(baseline, painter.font(), text);
  painter.setBrush(Qt::NoBrush);
  painter.setPen(QPen(around, 3, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
  painter.drawPath(path);
  painter.fillPath(path, color);
}

void DrawLabelledPoints(QPainter& painter, const MapWindow& window, const PointLayer& layer, bool onDark, double zoom,
                        std::vector<QRectF>& taken) {
  const QRectF limits = window.rect.adjusted(-10, -10, 10, 10);
  const QFontMetricsF metrics(painter.font());
  std::vector<std::pair<QPointF, std::size_t>> seen;
  for (std::size_t i = 0; i < layer.points.size(); ++i) {
    const QPointF at = window.ToScreen(layer.points[i]);
    if (!limits.contains(at)) continue;
    DrawMarker(painter, at, false, zoom);
    seen.emplace_back(at, i);
    taken.emplace_back(at.x() - 4 * zoom, at.y() - 4 * zoom, 8 * zoom, 8 * zoom);
  }
  constexpr std::size_t kMostLabels = 400;  // beyond, a map is full of names anyway
  if (layer.labels.size() != layer.points.size() || seen.size() > kMostLabels) return;
  QColor edge = EdgeColor(onDark);
  edge.setAlpha(220);
  for (const auto& [at, i] : seen) {
    const QString text = ToQt(layer.labels[i]);
    const QSizeF size(metrics.horizontalAdvance(text), metrics.height() * 0.8);
    const double gap = 6 * zoom;
    for (const QPointF corner : {QPointF(gap, -size.height() / 2), QPointF(-gap - size.width(), -size.height() / 2),
                                 QPointF(-size.width() / 2, -gap - size.height()), QPointF(-size.width() / 2, gap)}) {
      const QRectF place(at + corner, size);
      const bool isFree = window.rect.contains(place) &&
                          std::ranges::none_of(taken, [&](const QRectF& other) { return other.intersects(place); });
      if (!isFree) continue;
      taken.push_back(place.adjusted(-2, -1, 2, 1));
      DrawOutlinedText(painter, {place.left(), place.bottom() - metrics.descent() * 0.6}, text, InkColor(onDark), edge);
      break;
    }
  }
}

}  // namespace tervane
