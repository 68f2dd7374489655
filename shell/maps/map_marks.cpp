// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What tells a reader of the map where he is and what he sees: frame, north arrow, scale bar.
#include <QPainter>
#include <QPainterPath>
#include <algorithm>
#include <array>
#include <cmath>

#include "platform/item_types.h"
#include "shell/maps/map_arrows.h"
#include "shell/maps/map_canvas_parts.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

void MapCanvas::DrawFrame(QPainter& painter) {
  const QColor ink = Theme::Get().QuietColor();
  painter.setRenderHint(QPainter::Antialiasing, false);
  painter.setPen(QPen(ink, 1));
  painter.setBrush(Qt::NoBrush);
  painter.drawRect(window_.rect.adjusted(0, 0, -1, -1));
  if (hasTicks_) {
    const ShownUnit unit = CoordinateUnit(units_);
    const QFontMetricsF metrics(painter.font());
    const double width = metrics.horizontalAdvance("0000000.0") + Scaled(24);
    const double step = NiceStep(unit.Shown(window_.metresPerPixel) * width);
    const MapPoint low = window_.ToMap(window_.rect.bottomLeft()), high = window_.ToMap(window_.rect.topRight());
    const double tick = Scaled(4);
    painter.setPen(ink);
    for (double i = std::ceil(unit.Shown(low.x) / step); i * step <= unit.Shown(high.x); ++i) {
      const double x = window_.ToScreen({unit.Stored(i * step), 0}).x(), y = window_.rect.bottom();
      const QString text = NumberInSteps(i * step, step);
      const double half = metrics.horizontalAdvance(text) / 2;
      // A label may reach a little beyond the frame, not into the legend.
      if (x - half < 0 || x + half > window_.rect.right() + Scaled(kLegendPadding)) continue;
      painter.drawLine(QPointF(x, y), QPointF(x, y + tick));
      painter.drawText(QPointF(x - half, y + tick + metrics.ascent()), text);
    }
    for (double i = std::ceil(unit.Shown(low.y) / step); i * step <= unit.Shown(high.y); ++i) {
      const double y = window_.ToScreen({0, unit.Stored(i * step)}).y(), x = window_.rect.left();
      const QString text = NumberInSteps(i * step, step);
      const double half = metrics.horizontalAdvance(text) / 2;
      // Below the frame it would meet the first label of the other axis.
      if (y - half < 0 || y + half > window_.rect.bottom() + tick) continue;
      painter.drawLine(QPointF(x, y), QPointF(x - tick, y));
      painter.save();
      painter.translate(x - tick - metrics.descent(), y + half);
      painter.rotate(-90);
      painter.drawText(QPointF(0, 0), text);
      painter.restore();
    }
  }
  painter.setRenderHint(QPainter::Antialiasing);
}

QRectF MapCanvas::NorthArrowPlace() const {
  const double size = Scaled(22);
  return {window_.rect.right() - size - Scaled(8), window_.rect.top() + Scaled(8), size, size * 1.7};
}

void MapCanvas::DrawNorthArrow(QPainter& painter) {
  const QRectF place = NorthArrowPlace();
  const double size = place.width();
  QColor paper = palette().color(QPalette::Base);
  paper.setAlpha(215);
  painter.setPen(Qt::NoPen);
  painter.setBrush(paper);
  painter.drawRoundedRect(place.adjusted(-2, -2, 2, 2), Scaled(4), Scaled(4));
  const QColor ink = palette().color(QPalette::Text);
  const double x = place.center().x(), top = place.top() + Scaled(2), bottom = top + size * 0.85;
  QPainterPath left, right;
  left.addPolygon(QPolygonF({{x, top}, {x, bottom - size * 0.2}, {x - size * 0.32, bottom}, {x, top}}));
  right.addPolygon(QPolygonF({{x, top}, {x, bottom - size * 0.2}, {x + size * 0.32, bottom}, {x, top}}));
  painter.setPen(QPen(ink, 1));
  painter.setBrush(Qt::NoBrush);
  painter.fillPath(left, ink);
  painter.drawPath(left);
  painter.drawPath(right);
  QFont bold = painter.font();
  bold.setBold(true);
  const QFont plain = painter.font();
  painter.setFont(bold);
  painter.drawText(QRectF(place.left(), bottom, size, place.bottom() - bottom), Qt::AlignCenter, tr("N", "north"));
  painter.setFont(plain);
}

MapCanvas::ScaleBar MapCanvas::MakeScaleBar() const {
  const ShownUnit unit = CoordinateUnit(units_);
  const double widest = std::min(Scaled(140), window_.rect.width() / 3) * window_.metresPerPixel;
  QString name = ToQt(unit.Text());
  // Metres become kilometres where they are many; another unit of the user's stays.
  const bool inKilometres = name == "m" && widest >= 1000;
  if (inKilometres) name = "km";
  const double factor = inKilometres ? 1000 : 1, most = unit.Shown(widest) / factor;
  // Halves are told too: 2.5 would give odd ones.
  double length = std::pow(10.0, std::floor(std::log10(most)));
  for (const double times : {5.0, 2.0})
    if (times * length <= most) {
      length *= times;
      break;
    }
  ScaleBar scale;
  scale.pixels = unit.Stored(length * factor) / window_.metresPerPixel;
  scale.text = ToQt(FormatNumber(length, "%.6g")) + " " + name;
  scale.half = ToQt(FormatNumber(length / 2, "%.6g"));
  const QFontMetricsF metrics(font());
  const double padding = Scaled(6), height = Scaled(5) + metrics.height() + 2 * padding - Scaled(4);
  const double textEnd = scale.pixels + metrics.horizontalAdvance(scale.text) - metrics.horizontalAdvance("0") / 2;
  scale.box = QRectF(window_.rect.left() + Scaled(8), window_.rect.bottom() - Scaled(8) - height, textEnd + 2 * padding,
                     height);
  return scale;
}

void MapCanvas::DrawScaleBar(QPainter& painter, const ScaleBar& scale) {
  if (!(scale.pixels > 4) || scale.box.width() > window_.rect.width()) return;
  const QFontMetricsF metrics(painter.font());
  const double bar = Scaled(5), padding = Scaled(6), digit = metrics.horizontalAdvance("0") / 2;
  QColor paper = palette().color(QPalette::Base);
  paper.setAlpha(215);
  painter.setPen(Qt::NoPen);
  painter.setBrush(paper);
  painter.drawRoundedRect(scale.box, Scaled(4), Scaled(4));
  const QColor ink = palette().color(QPalette::Text);
  const QPointF start(scale.box.left() + padding, scale.box.bottom() - padding - bar);
  painter.fillRect(QRectF(start, QSizeF(scale.pixels, bar)), palette().color(QPalette::Base));
  painter.fillRect(QRectF(start, QSizeF(scale.pixels / 2, bar)), ink);
  painter.setPen(QPen(ink, 1));
  painter.setBrush(Qt::NoBrush);
  painter.drawRect(QRectF(start, QSizeF(scale.pixels, bar)));
  const double baseline = start.y() - Scaled(3) - metrics.descent() * 0.5;
  painter.drawText(QPointF(start.x() - digit / 2, baseline), "0");
  const double halfWidth = metrics.horizontalAdvance(scale.half), halfAt = start.x() + (scale.pixels - halfWidth) / 2;
  if (halfAt + halfWidth + digit < start.x() + scale.pixels - digit)
    painter.drawText(QPointF(halfAt, baseline), scale.half);
  painter.drawText(QPointF(start.x() + scale.pixels - digit, baseline), scale.text);
}

void MapCanvas::DrawFlow(QPainter& painter) {
  if (!content_.arrows) return;
  const DrawnMap map = Drawn();
  DrawArrows(painter, ArrowsOn(*content_.arrows, map), map);
  const KeyArrow key = KeyOf(*content_.arrows, map, units_);
  if (!(key.length > 4)) return;
  const QFontMetricsF metrics(painter.font());
  const double padding = Scaled(8), height = metrics.height() + padding;
  const QRectF box(window_.rect.left() + Scaled(8), window_.rect.top() + Scaled(8),
                   key.length + metrics.horizontalAdvance(key.text) + 3 * padding, height);
  if (box.width() > window_.rect.width()) return;
  QColor paper = palette().color(QPalette::Base);
  paper.setAlpha(215);
  painter.setPen(Qt::NoPen);
  painter.setBrush(paper);
  painter.drawRoundedRect(box, Scaled(4), Scaled(4));
  const QPointF start(box.left() + padding, box.center().y());
  DrawArrows(painter, {{start, start + QPointF(key.length, 0)}}, map);
  painter.setPen(palette().color(QPalette::Text));
  painter.drawText(box.adjusted(key.length + 2 * padding, 0, 0, 0), Qt::AlignLeft | Qt::AlignVCenter, key.text);
}

void DrawChip(QPainter& painter, const QRectF& chip, const QString& text, const QPalette& colors) {
  painter.setPen(colors.color(QPalette::Mid));
  painter.setBrush(colors.color(QPalette::Window));
  painter.drawRoundedRect(chip, Scaled(6), Scaled(6));
  painter.setPen(colors.color(QPalette::WindowText));
  painter.drawText(chip, Qt::AlignCenter | Qt::TextWordWrap, text);
}

void MapCanvas::SetCellLines(std::optional<GridGeometry> grid) {
  cellLines_ = std::move(grid);
  Redraw();
}

void MapCanvas::DrawCellLines(QPainter& painter) const {
  constexpr double kFinest = 4;  // In pixels: nearer to each other they would be a grey veil.
  if (!cellLines_ || cellLines_->cellSize / window_.metresPerPixel < Scaled(kFinest)) return;
  const GridTransform transform(*cellLines_);
  // Only the cells that are seen, however large the grid is.
  double low[2] = {1e300, 1e300}, high[2] = {-1e300, -1e300};
  const QRectF seen = window_.rect;
  for (const QPointF corner : {seen.topLeft(), seen.topRight(), seen.bottomLeft(), seen.bottomRight()}) {
    const MapPoint cells = transform.ToCells(window_.ToMap(corner));
    low[0] = std::min(low[0], cells.x);
    high[0] = std::max(high[0], cells.x);
    low[1] = std::min(low[1], cells.y);
    high[1] = std::max(high[1], cells.y);
  }
  const auto border = [](double cells, int count) {
    return static_cast<int>(std::clamp(cells, 0.0, static_cast<double>(count)));
  };
  const int left = border(std::floor(low[0]), cellLines_->nx), right = border(std::ceil(high[0]), cellLines_->nx);
  const int bottom = border(std::floor(low[1]), cellLines_->ny), top = border(std::ceil(high[1]), cellLines_->ny);
  const auto at = [&](int i, int j) {
    return window_.ToScreen(transform.ToWorld({static_cast<double>(i), static_cast<double>(j)}));
  };
  QList<QLineF> lines;
  for (int i = left; i <= right; ++i) lines << QLineF(at(i, bottom), at(i, top));
  for (int j = bottom; j <= top; ++j) lines << QLineF(at(left, j), at(right, j));
  QColor color = InkColor(Theme::Get().IsDark());
  color.setAlpha(90);
  painter.setPen(QPen(color, 1));
  painter.drawLines(lines);
}

}  // namespace tervane
