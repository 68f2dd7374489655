// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/charts/depth_columns.h"

#include <QHelpEvent>
#include <QPainter>
#include <QToolTip>
#include <algorithm>
#include <cmath>

#include "platform/item_types.h"
#include "platform/text.h"
#include "shell/charts/chart_style.h"
#include "shell/widgets/drawing_access.h"
#include "shell/widgets/layer_colors.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/shown_unit.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kStoredDepthUnit = 1000;
/// Lines between parts stand at least so far apart, in pixels; closer ones would be a grey surface.
constexpr double kLeastPartGap = 3;
constexpr double kMostDepthTicks = 8;

/// A round step that is not smaller.
double RoundDepthStep(double step) {
  const double power = std::pow(10, std::floor(std::log10(step)));
  for (const double factor : {1.0, 2.0, 5.0})
    if (step <= factor * power) return factor * power;
  return 10 * power;
}

}  // namespace

DepthColumns::DepthColumns(QWidget* parent) : QWidget(parent) {
  setLayoutDirection(Qt::LeftToRight);
  setMinimumSize(Theme::Get().Scaled(200), Theme::Get().Scaled(140));
  setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Expanding);
  DescribeDrawing(*this, {});
}

void DepthColumns::Show(DepthContent content, const DisplayUnits* units) {
  const DisplayUnits shown = units ? *units : DisplayUnits();
  if (content == content_ && shown == units_) return;
  content_ = std::move(content);
  units_ = shown;
  setAccessibleName(Translated(Summary(content_)));
  update();
}

QRectF DepthColumns::Frame() const {
  const Theme& theme = Theme::Get();
  const QFontMetricsF metrics(font());
  const double left = metrics.horizontalAdvance("0000.00") + 2 * metrics.height();
  const double top = 1.8 * metrics.height();
  return {left, top, std::max(width() - left - theme.Scaled(12), 1.0),
          std::max(height() - top - theme.Scaled(12), 1.0)};
}

QRectF DepthColumns::PlaceOf(std::size_t column) const {
  const QRectF frame = Frame();
  const double gap = Theme::Get().Scaled(12);
  const auto count = static_cast<double>(content_.columns.size());
  const double wide = std::min((frame.width() - gap * (count - 1)) / count, 1.0 * Theme::Get().Scaled(180));
  return {frame.left() + static_cast<double>(column) * (wide + gap), frame.top(), wide, frame.height()};
}

double DepthColumns::ToPixel(double depth) const {
  const QRectF frame = Frame();
  return frame.top() + frame.height() * depth / content_.Bottom();
}

ShownUnit DepthColumns::DepthUnit() const { return {quantity::kDepthBelowGround, kStoredDepthUnit, &units_}; }

QString DepthColumns::DepthText(double depth) const {
  const ShownUnit unit = DepthUnit();
  return ToQt(FormatNumber(unit.Shown(depth), "%.6g"));
}

std::size_t DepthColumns::ColorOf(const std::string& name) const {
  std::vector<std::string> names;
  for (const DepthColumn& column : content_.columns)
    for (const DepthBlock& block : column.blocks) {
      if (block.name == name) return names.size();
      if (std::ranges::find(names, block.name) == names.end()) names.push_back(block.name);
    }
  return names.size();
}

void DepthColumns::paintEvent(QPaintEvent* /*event*/) {
  QPainter painter(this);
  painter.fillRect(rect(), palette().base());
  if (content_.columns.empty() || !(content_.Bottom() > 0) || !std::isfinite(content_.Bottom())) {
    painter.setPen(Theme::Get().QuietColor());
    painter.drawText(rect(), Qt::AlignCenter | Qt::TextWordWrap, Translated(content_.message));
    return;
  }
  PaintAxis(painter);
  for (std::size_t i = 0; i < content_.columns.size(); ++i) {
    const DepthColumn& column = content_.columns[i];
    const QRectF place = PlaceOf(i);
    painter.setPen(palette().text().color());
    painter.drawText(
        QRectF(place.left(), 0, place.width(), place.top()), Qt::AlignCenter,
        fontMetrics().elidedText(Translated(column.title), Qt::ElideRight, static_cast<int>(place.width())));
    double top = 0;
    for (const DepthBlock& block : column.blocks) {
      if (block.bottom > top) PaintBlock(painter, place, top, block);
      top = std::max(top, block.bottom);
    }
    // What the other column reaches and this one lacks.
    if (top < content_.Bottom()) {
      const double y = ToPixel(top);
      painter.setPen(QPen(Theme::Get().WarningColor(), Theme::Get().Scaled(1), Qt::DashLine));
      painter.setBrush(Qt::NoBrush);
      painter.drawRect(QRectF(place.left(), y, place.width(), place.bottom() - y));
    }
  }
}

void DepthColumns::PaintAxis(QPainter& painter) const {
  const QRectF frame = Frame();
  const ShownUnit unit = DepthUnit();
  const double deepest = unit.Shown(content_.Bottom());
  const double ticks = std::clamp(frame.height() / (3.0 * fontMetrics().height()), 1.0, kMostDepthTicks);
  const double step = RoundDepthStep(deepest / ticks);
  painter.setPen(palette().text().color());
  const double gap = Theme::Get().Scaled(6);
  for (int number = 0; number * step <= deepest * 1.0001; ++number) {
    const double depth = number * step;
    const double y = frame.top() + frame.height() * depth / deepest;
    painter.drawLine(QPointF(frame.left() - gap, y), QPointF(frame.left() - gap / 3, y));
    painter.drawText(QRectF(0, y - fontMetrics().height(), frame.left() - 1.5 * gap, 2.0 * fontMetrics().height()),
                     Qt::AlignRight | Qt::AlignVCenter, ToQt(FormatNumber(depth, "%.6g")));
  }
  painter.save();
  painter.translate(fontMetrics().height(), frame.center().y());
  painter.rotate(-90);
  painter.drawText(QRectF(-frame.height() / 2, -fontMetrics().height(), frame.height(), 1.5 * fontMetrics().height()),
                   Qt::AlignCenter, Translated("Depth [" + unit.Text() + "]"));
  painter.restore();
}

void DepthColumns::PaintBlock(QPainter& painter, const QRectF& place, double top, const DepthBlock& block) const {
  const bool isDark = Theme::Get().IsDark();
  const QRectF shape(QPointF(place.left(), ToPixel(top)), QPointF(place.right(), ToPixel(block.bottom)));
  const QColor line = palette().text().color();
  painter.setPen(QPen(line, 1));
  painter.setBrush(LayerColor(ColorOf(block.name), isDark));
  painter.drawRect(shape);
  if (block.parts > 1 && shape.height() / block.parts >= kLeastPartGap) {
    QColor faint = line;
    faint.setAlphaF(0.35f);
    painter.setPen(QPen(faint, 1));
    for (int part = 1; part < block.parts; ++part) {
      const double y = shape.top() + shape.height() * part / block.parts;
      painter.drawLine(QPointF(shape.left() + 1, y), QPointF(shape.right() - 1, y));
    }
  }
  if (shape.height() < fontMetrics().height()) return;
  const int room = static_cast<int>(shape.width()) - Theme::Get().Scaled(8);
  const QString name = fontMetrics().elidedText(ToQt(block.name), Qt::ElideRight, room);
  if (block.parts > 1) {
    // Lines do not run through the name.
    QRectF behind(0, 0, fontMetrics().horizontalAdvance(name) + Theme::Get().Scaled(8), fontMetrics().height());
    behind.moveCenter(shape.center());
    painter.fillRect(behind, LayerColor(ColorOf(block.name), isDark));
  }
  painter.setPen(line);
  painter.drawText(shape, Qt::AlignCenter, name);
}

QString DepthColumns::TextAt(const QPoint& place) const {
  for (std::size_t i = 0; i < content_.columns.size(); ++i) {
    if (!PlaceOf(i).contains(place)) continue;
    double top = 0;
    for (const DepthBlock& block : content_.columns[i].blocks) {
      if (block.bottom > top && place.y() >= ToPixel(top) && place.y() <= ToPixel(block.bottom)) {
        const ShownUnit unit = DepthUnit();
        return tr("%1, %2 to %3 %4").arg(ToQt(block.name), DepthText(top), DepthText(block.bottom), ToQt(unit.Text()));
      }
      top = std::max(top, block.bottom);
    }
  }
  return {};
}

bool DepthColumns::event(QEvent* event) {
  if (event->type() != QEvent::ToolTip) return QWidget::event(event);
  const auto* help = static_cast<QHelpEvent*>(event);
  QToolTip::showText(help->globalPos(), TextAt(help->pos()), this);
  return true;
}

}  // namespace tervane
