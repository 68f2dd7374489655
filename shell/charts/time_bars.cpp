// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/charts/time_bars.h"

#include <QApplication>
#include <algorithm>
#include <map>
#include <string>

#include "shell/charts/chart_axis.h"
#include "shell/charts/chart_style.h"
#include "shell/widgets/layer_colors.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

/// The lane of each bar, from the top, for bars with a start and an end.
std::vector<int> LanesFor(const std::vector<TimeBar>& bars) {
  std::vector<int> lanes(bars.size(), 0);
  if (std::ranges::any_of(bars, [](const TimeBar& bar) { return bar.kind != TimeBar::Kind::Thing; })) return lanes;
  std::vector<CYbDateTime> ends;  // Of what stands last in each lane.
  for (std::size_t i = 0; i < bars.size(); ++i) {
    const auto free = std::ranges::find_if(ends, [&](const CYbDateTime& end) { return end <= bars[i].start; });
    lanes[i] = static_cast<int>(free - ends.begin());
    if (free == ends.end())
      ends.push_back(bars[i].end);
    else
      *free = bars[i].end;
  }
  return lanes;
}

std::vector<TimeBar> WithDates(const std::vector<TimeBar>& bars) {
  std::vector<TimeBar> dated;
  for (const TimeBar& bar : bars)
    if (bar.start.IsValid() && bar.end.IsValid() && bar.end > bar.start) dated.push_back(bar);
  std::ranges::stable_sort(dated, {}, &TimeBar::start);
  return dated;
}

}  // namespace

int TimeBarPlottable::LanesOf(const std::vector<TimeBar>& bars) {
  const std::vector<int> lanes = LanesFor(WithDates(bars));
  return lanes.empty() ? 1 : *std::ranges::max_element(lanes) + 1;
}

TimeBarPlottable::TimeBarPlottable(QCPAxis* keys, QCPAxis* values, const std::vector<TimeBar>& bars)
    : QCPAbstractPlottable(keys, values) {
  removeFromLegend();
  std::map<std::string, std::size_t> colors;
  const std::vector<TimeBar> dated = WithDates(bars);
  const std::vector<int> lanes = LanesFor(dated);
  for (std::size_t i = 0; i < dated.size(); ++i) {
    const TimeBar& bar = dated[i];
    const std::size_t color =
        bar.kind == TimeBar::Kind::Thing ? colors.emplace(bar.name, colors.size()).first->second : 0;
    bars_.push_back(
        {AxisCoordinate(bar.start), AxisCoordinate(bar.end), Translated(bar.name), color, bar.kind, lanes[i]});
    longest_ = std::max(longest_, bars_.back().end - bars_.back().start);
    lanes_ = std::max(lanes_, lanes[i] + 1);
  }
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
  std::vector<double> drawn(static_cast<std::size_t>(lanes_), -1);
  const double height = static_cast<double>(frame.height()) / lanes_;
  for (auto bar = std::ranges::lower_bound(bars_, seen.lower - longest_, {}, &Bar::start);
       bar != bars_.end() && bar->start <= seen.upper; ++bar) {
    if (bar->end < seen.lower) continue;
    const double left = std::max(keyAxis()->coordToPixel(bar->start), static_cast<double>(frame.left()));
    const double right = std::min(keyAxis()->coordToPixel(bar->end), static_cast<double>(frame.right()) + 1);
    double& drawnTo = drawn[static_cast<std::size_t>(bar->lane)];
    if (right - left < 1 && right <= drawnTo) continue;
    DrawBar(*painter, *bar,
            QRectF(left, frame.top() + bar->lane * height + 1, std::max(right - left, 1.0), height - 2));
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
  if (room < metrics.horizontalAdvance("MMM") || place.height() < metrics.ascent()) return;
  painter.setPen(QApplication::palette().color(QPalette::Text));
  painter.setFont(QApplication::font());
  painter.drawText(place.adjusted(margin, 0, -margin, 0), Qt::AlignVCenter | Qt::AlignLeft,
                   metrics.elidedText(bar.name, Qt::ElideRight, room));
}

}  // namespace tervane
