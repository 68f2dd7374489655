// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/maps/map_labels.h"

#include <QFontMetricsF>
#include <QPainterPath>
#include <QPixmapCache>
#include <algorithm>
#include <cmath>

#include "shell/widgets/qt_text.h"

namespace tervane {

// ---- Places

template <class Visit>
bool LabelPlaces::AnyBucket(const QRectF& place, Visit visit) {
  const auto number = [](double pixels) { return static_cast<long long>(std::floor(pixels / kBucket)); };
  for (long long x = number(place.left()); x <= number(place.right()); ++x)
    for (long long y = number(place.top()); y <= number(place.bottom()); ++y)
      if (visit(x * 100'000 + y)) return true;
  return false;
}

void LabelPlaces::Take(const QRectF& place) {
  AnyBucket(place, [&](long long bucket) {
    taken_[bucket].push_back(place);
    return false;
  });
}

bool LabelPlaces::IsTaken(const QRectF& place) const {
  return AnyBucket(place, [&](long long bucket) {
    const auto found = taken_.find(bucket);
    return found != taken_.end() &&
           std::ranges::any_of(found->second, [&](const QRectF& other) { return other.intersects(place); });
  });
}

bool LabelPlaces::Draw(QPainter& painter, const QRectF& place, const QString& text, const DrawnMap& map,
                       const std::optional<LabelLook>& look) {
  if (IsFull() || !limits_.contains(place) || IsTaken(place)) return false;
  ++names_;
  Take(place.adjusted(-2, -1, 2, 1));
  QColor edge = EdgeColor(map.isDark);
  edge.setAlpha(220);
  const QFontMetricsF metrics(painter.font());
  const QPointF baseline(place.left(), place.bottom() - metrics.descent() * 0.6);
  if (look && look->isOpaque) {
    painter.fillRect(place.adjusted(-2, -1, 2, 1), QColor(0xff, 0xff, 0xff));
    painter.setPen(look->color);
    painter.drawText(baseline, text);
  } else {
    // Around a chosen colour stands what it is read on.
    if (look) edge = look->color.lightnessF() < 0.6F ? QColor(0xff, 0xff, 0xff, 220) : QColor(0x14, 0x16, 0x1a, 220);
    DrawOutlinedText(painter, baseline, text, look ? look->color : InkColor(map.isDark), edge);
  }
  return true;
}

bool LabelPlaces::DrawAround(QPainter& painter, QPointF marker, double radius, const QString& text, const DrawnMap& map,
                             const std::optional<LabelLook>& look) {
  const QSizeF size = LabelSize(QFontMetricsF(painter.font()), text);
  const double gap = radius + 2.4 * map.zoom, slant = 0.7 * gap, w = size.width(), h = size.height();
  const std::array<QPointF, 8> corners{QPointF(gap, -h / 2),       QPointF(-gap - w, -h / 2),
                                       QPointF(-w / 2, -gap - h),  QPointF(-w / 2, gap),
                                       QPointF(slant, -slant - h), QPointF(-slant - w, -slant - h),
                                       QPointF(slant, slant),      QPointF(-slant - w, slant)};
  return std::ranges::any_of(
      corners, [&](QPointF corner) { return Draw(painter, QRectF(marker + corner, size), text, map, look); });
}

bool LabelPlaces::DrawAt(QPainter& painter, QPointF middle, const QString& text, const DrawnMap& map,
                         const std::optional<LabelLook>& look) {
  QRectF place({}, LabelSize(QFontMetricsF(painter.font()), text));
  place.moveCenter(middle);
  return Draw(painter, place, text, map, look);
}

QSizeF LabelSize(const QFontMetricsF& metrics, const QString& text) {
  return {metrics.horizontalAdvance(text), metrics.height() * 0.8};
}

// ---- Texts

void DrawOutlinedText(QPainter& painter, QPointF baseline, const QString& text, const QColor& color,
                      const QColor& around) {
  // Outlines of letters are slow to draw, and the same names are drawn while a map is moved.
  const double ratio = painter.device()->devicePixelRatioF();
  const QString key = QString("map %1 %2 %3 %4 %5")
                          .arg(text, painter.font().key(), color.name(QColor::HexArgb), around.name(QColor::HexArgb))
                          .arg(ratio);
  constexpr double kEdge = 3;
  const QFontMetricsF metrics(painter.font());
  const double margin = kEdge + metrics.averageCharWidth(), ascent = std::ceil(metrics.ascent()) + kEdge;
  QPixmap picture;
  if (!QPixmapCache::find(key, &picture)) {
    const QSizeF size(metrics.horizontalAdvance(text) + 2 * margin, ascent + metrics.descent() + kEdge);
    picture = QPixmap((size * ratio).toSize() + QSize(1, 1));
    picture.setDevicePixelRatio(ratio);
    picture.fill(Qt::transparent);
    QPainter inner(&picture);
    inner.setRenderHint(QPainter::Antialiasing);
    QPainterPath path;
    path.addText({margin, ascent}, painter.font(), text);
    inner.setPen(QPen(around, kEdge, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
    inner.drawPath(path);
    inner.fillPath(path, color);
    inner.end();
    QPixmapCache::insert(key, picture);
  }
  // At whole pixels, so that letters stay sharp.
  const QPointF corner = (baseline - QPointF(margin, ascent)) * ratio;
  painter.drawPixmap(QPointF(std::round(corner.x()), std::round(corner.y())) / ratio, picture);
}

// ---- Points

namespace {

constexpr double kMarkerReach = 4;  ///< Of a marker without a number, in pixels at zoom 1.

QFont NumberFont(const QFont& font) {
  QFont small = font;
  small.setPointSizeF(font.pointSizeF() * 0.8);
  small.setBold(true);
  return small;
}

/// A disc that holds a number; one that stands out has the colour for that.
void DrawNumbered(QPainter& painter, QPointF at, std::size_t number, bool isHighlighted, double radius, double zoom) {
  painter.setPen(QPen(QColor(0x1d, 0x22, 0x2a), 1.3 * zoom));
  painter.setBrush(isHighlighted ? kHighlightColor : QColor(0xff, 0xff, 0xff));
  const QFont font = painter.font();
  painter.setFont(NumberFont(font));
  const QString text = QString::number(number);
  const double wide = std::max(radius, QFontMetricsF(painter.font()).horizontalAdvance(text) / 2 + 3 * zoom);
  const QRectF disc(at.x() - wide, at.y() - radius, 2 * wide, 2 * radius);
  painter.drawRoundedRect(disc, radius, radius);
  painter.setPen(isHighlighted ? QColor(0xff, 0xff, 0xff) : QColor(0x1d, 0x22, 0x2a));
  painter.drawText(disc, Qt::AlignCenter, text);
  painter.setFont(font);
}

}  // namespace

double MarkerReach(const PointLayer& layer, double zoom) { return (layer.isNumbered ? 8.5 : kMarkerReach) * zoom; }

void DrawLabelledPoints(QPainter& painter, const PointLayer& layer, const DrawnMap& map, LabelPlaces& places) {
  const QRectF limits = map.part.adjusted(-10, -10, 10, 10);
  const double reach = MarkerReach(layer, map.zoom);
  const bool areNamed = layer.labels.size() == layer.points.size();
  const auto standsOut = [&](std::size_t i) { return layer.highlighted.IsOf(i, areNamed ? layer.labels[i] : ""); };
  std::vector<std::pair<QPointF, std::size_t>> seen;
  for (std::size_t i = 0; i < layer.points.size(); ++i)
    if (const QPointF at = map.window.ToScreen(layer.points[i]); limits.contains(at)) seen.emplace_back(at, i);
  // Those that stand out lie above the others, and get their numbers and names first.
  std::ranges::stable_partition(seen, [&](const auto& point) { return standsOut(point.second); });
  // Where numbers would cover each other, a marker without one stands.
  std::vector<bool> hasNumber;
  for (const auto& [at, i] : seen) {
    const QRectF disc(at.x() - reach, at.y() - reach, 2 * reach, 2 * reach);
    hasNumber.push_back(layer.isNumbered && (standsOut(i) || !places.IsTaken(disc)));
    const double small = hasNumber.back() ? reach : kMarkerReach * map.zoom;
    places.Take({at.x() - small, at.y() - small, 2 * small, 2 * small});
  }
  for (std::size_t k = seen.size(); k-- > 0;) {
    const auto& [at, i] = seen[k];
    if (hasNumber[k])
      DrawNumbered(painter, at, i + 1, standsOut(i), reach, map.zoom);
    else
      DrawMarker(painter, at, standsOut(i), map.zoom);
  }
  constexpr std::size_t kMostLabels = 400;  // beyond, a map is full of names anyway
  if (!areNamed || seen.size() > kMostLabels) return;
  for (std::size_t k = 0; k < seen.size(); ++k)
    if (const auto& [at, i] = seen[k]; !layer.labels[i].empty())
      places.DrawAround(painter, at, hasNumber[k] ? reach : kMarkerReach * map.zoom, ToQt(layer.labels[i]), map);
}

}  // namespace tervane
