// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/charts/time_bars.h"

#include <QApplication>
#include <algorithm>
#include <map>
#include <string>

#include "shell/charts/chart_axis.h"
#include "shell/charts/chart_style.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

TimeBarPlottable::TimeBarPlottable(QCPAxis* keys, QCPAxis* values, const std::vector<TimeBar>& bars)
    : QCPAbstractPlottable(keys, values) {
  removeFromLegend();
  std::map<std::string, std::size_t> colors;
  for (const TimeBar& bar : bars) {
    if (!bar.start.IsValid() || !bar.end.IsValid() || bar.end <= bar.start) continue;
    const std::size_t color =
        bar.kind == TimeBar::Kind::Thing ? colors.emplace(bar.name, colors.size()).first->second : 0;
    bars_.push_back({AxisCoordinate(bar.start), AxisCoordinate(bar.end), ToQt(bar.name), color, bar.kind});
    longest_ = std::max(longest_, bars_.back().end - bars_.back().start);
  }
  std::ranges::stable_sort(bars_, {}, &Bar::start);
}

QString TimeBarPlottable::NamesAt(double time) const {
  QStringList names;
  auto bar = std::ranges::lower_bound(bars_, time - longest_, {}, &Bar::start);
  for (; bar != bars_.end() && bar->start <= time; ++bar)
    if (time < bar->end) names << bar->name;
  return names.join(", ");
}

QCPRange TimeBarPlottable::getKeyRange(bool& isFound, QCP::SignDomain /*domain*/) const {
  isFound = !bars_.empty();
  if (!isFound) return {};
  const auto last = std::ranges::max_element(bars_, {}, &Bar::end);
  return {bars_.front().start, last->end};
}

QCPRange TimeBarPlottable::getValueRange(bool& isFound, QCP::SignDomain /*domain*/, const QCPRange& /*keys*/) const {
  isFound = !bars_.empty();
  return {0, 1};
}

void TimeBarPlottable::draw(QCPPainter* painter) {
  const QCPRange seen = keyAxis()->range();
  const QRect frame = keyAxis()->axisRect()->rect();
  // Bars of one pixel each run together: one of them is drawn.
  double drawnTo = -1;
  for (auto bar = std::ranges::lower_bound(bars_, seen.lower - longest_, {}, &Bar::start);
       bar != bars_.end() && bar->start <= seen.upper; ++bar) {
    if (bar->end < seen.lower) continue;
    const double left = std::max(keyAxis()->coordToPixel(bar->start), static_cast<double>(frame.left()));
    const double right = std::min(keyAxis()->coordToPixel(bar->end), static_cast<double>(frame.right()) + 1);
    if (right - left < 1 && right <= drawnTo) continue;
    DrawBar(*painter, *bar, QRectF(left, frame.top() + 1, std::max(right - left, 1.0), frame.height() - 2));
    drawnTo = std::max(drawnTo, left + 1);
  }
}

void TimeBarPlottable::DrawBar(QCPPainter& painter, const Bar& bar, const QRectF& place) const {
  const Theme& theme = Theme::Get();
  const bool isThing = bar.kind == TimeBar::Kind::Thing;
  const QColor warning = theme.WarningColor();
  painter.setAntialiasing(false);
  painter.setPen(isThing ? QPen(theme.QuietColor(), 1) : QPen(warning, 1));
  if (isThing)
    painter.setBrush(LayerColor(bar.color, theme.IsDark()));
  else
    painter.setBrush(QBrush(warning, bar.kind == TimeBar::Kind::Gap ? Qt::BDiagPattern : Qt::DiagCrossPattern));
  // Without a frame where there is nothing but the frame.
  if (place.width() < 3) painter.setPen(Qt::NoPen);
  painter.drawRect(place);
  if (!isThing) return;
  const QFontMetrics metrics(QApplication::font());
  const int margin = theme.Scaled(3);
  const int room = static_cast<int>(place.width()) - 2 * margin;
  if (room < metrics.horizontalAdvance("MMM")) return;
  painter.setPen(QApplication::palette().color(QPalette::Text));
  painter.setFont(QApplication::font());
  painter.drawText(place.adjusted(margin, 0, -margin, 0), Qt::AlignVCenter | Qt::AlignLeft,
                   metrics.elidedText(bar.name, Qt::ElideRight, room));
}

}  // namespace tervane
