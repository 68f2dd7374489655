// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/charts/chart_panels.h"

#include <QApplication>
#include <algorithm>

#include <qcustomplot.h>

#include "shell/charts/chart_axis.h"
#include "shell/widgets/theme.h"

namespace tervane {

ChartPanels::ChartPanels(QCustomPlot& chart, int firstRow)
    : QObject(&chart), chart_(chart), firstRow_(firstRow), margins_(new QCPMarginGroup(&chart)) {
  rects_.push_back(chart.axisRect());
  rects_.front()->setMarginGroup(QCP::msLeft | QCP::msRight, margins_);
  connect(chart.xAxis, qOverload<const QCPRange&>(&QCPAxis::rangeChanged), this, &ChartPanels::Follow);
}

void ChartPanels::SetUp(int count, int stripLines, const std::optional<NumberAxis>& numbers) {
  stripLines_ = stripLines;
  count = std::max(count, 1) + (stripLines > 0 ? 1 : 0);
  while (static_cast<int>(rects_.size()) > count) {
    chart_.plotLayout()->remove(rects_.back());
    rects_.pop_back();
  }
  chart_.plotLayout()->simplify();
  while (static_cast<int>(rects_.size()) < count) {
    auto* rect = new QCPAxisRect(&chart_, true);
    chart_.plotLayout()->addElement(firstRow_ + static_cast<int>(rects_.size()), 0, rect);
    rect->setMarginGroup(QCP::msLeft | QCP::msRight, margins_);
    for (QCPAxis* axis : rect->axes()) {
      axis->setLayer("axes");
      axis->grid()->setLayer("grid");
    }
    connect(rect->axis(QCPAxis::atBottom), qOverload<const QCPRange&>(&QCPAxis::rangeChanged), this,
            &ChartPanels::Follow);
    rects_.push_back(rect);
  }
  for (QCPAxisRect* rect : rects_) SetUpPanel(*rect, numbers);
}

void ChartPanels::SetUpPanel(QCPAxisRect& rect, const std::optional<NumberAxis>& numbers) {
  const bool isStrip = &rect == Strip(), isLast = &rect == rects_.back();
  const int height = stripLines_ * (QFontMetrics(QApplication::font()).height() + Theme::Get().Scaled(6));
  rect.setMinimumSize(0, isStrip ? height : 0);
  rect.setMaximumSize(QWIDGETSIZE_MAX, isStrip ? height : QWIDGETSIZE_MAX);
  QCPAxis *keys = rect.axis(QCPAxis::atBottom), *opposite = rect.axis(QCPAxis::atTop);
  SetUpAxis(*keys, numbers);
  keys->setTickLabels(isLast);
  keys->setLabel(isLast ? AxisTitle(numbers) : QString());
  opposite->setVisible(true);
  opposite->setTicks(false);
  opposite->setTickLabels(false);
  QList<QCPAxis*> moved{keys};
  for (QCPAxis* values : {rect.axis(QCPAxis::atLeft), rect.axis(QCPAxis::atRight)}) {
    values->setTicks(!isStrip);
    values->setTickLabels(!isStrip);
    values->grid()->setVisible(!isStrip && values == rect.axis(QCPAxis::atLeft));
    if (isStrip) {
      values->setLabel({});
      values->setVisible(true);
      values->setRange(0, 1);
    } else {
      moved.push_back(values);
    }
  }
  keys->setTicks(!isStrip);
  rect.setRangeDragAxes(moved);
  rect.setRangeZoomAxes(moved);
}

void ChartPanels::Follow(const QCPRange& range) {
  // An axis that has the range already tells nothing, so that this ends.
  for (QCPAxisRect* rect : rects_) rect->axis(QCPAxis::atBottom)->setRange(range);
}

QCPAxis& ChartPanels::Keys() const { return *rects_.front()->axis(QCPAxis::atBottom); }
QCPAxis& ChartPanels::Keys(int panel) const { return *Panel(panel).axis(QCPAxis::atBottom); }

QCPAxis& ChartPanels::Values(int panel, bool isSecond) const {
  return *Panel(panel).axis(isSecond ? QCPAxis::atRight : QCPAxis::atLeft);
}

std::vector<QCPAxis*> ChartPanels::AllValues() const {
  std::vector<QCPAxis*> all;
  for (QCPAxisRect* rect : rects_) {
    if (rect == Strip()) continue;
    all.push_back(rect->axis(QCPAxis::atLeft));
    all.push_back(rect->axis(QCPAxis::atRight));
  }
  return all;
}

}  // namespace tervane
