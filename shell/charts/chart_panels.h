// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QObject>
#include <vector>

#include "forms/plots.h"

class QCPAxis;
class QCPAxisRect;
class QCPMarginGroup;
class QCPRange;
class QCustomPlot;

namespace tervane {

/// Charts below each other over one horizontal axis: they are moved and zoomed along it together, and their frames
/// stand in line. The axis is labelled below the last one.
class ChartPanels : public QObject {
  Q_OBJECT

 public:
  /// `firstRow` is the row of the chart's layout in which its own axes stand.
  ChartPanels(QCustomPlot& chart, int firstRow);

  /// Makes so many charts, below a strip of so many lines where that is above 0; those beyond go. The chart must hold
  /// nothing meanwhile.
  void SetUp(int count, int stripLines, const std::optional<NumberAxis>& numbers);
  /// All from top to bottom, a strip too.
  const std::vector<QCPAxisRect*>& Rects() const { return rects_; }
  /// The strip above the charts; null without one.
  QCPAxisRect* Strip() const { return stripLines_ > 0 ? rects_.front() : nullptr; }
  /// The horizontal axis of the first chart, which all others follow.
  QCPAxis& Keys() const;
  QCPAxis& Keys(int panel) const;
  /// On the left, or for the second unit on the right.
  QCPAxis& Values(int panel, bool isSecond) const;
  /// Without that of a strip.
  std::vector<QCPAxis*> AllValues() const;

 private:
  void SetUpPanel(QCPAxisRect& rect, const std::optional<NumberAxis>& numbers);
  QCPAxisRect& Panel(int panel) const { return *rects_[static_cast<std::size_t>(panel + (stripLines_ > 0 ? 1 : 0))]; }
  void Follow(const QCPRange& range);

  QCustomPlot& chart_;
  int firstRow_;
  QCPMarginGroup* margins_;
  std::vector<QCPAxisRect*> rects_;
  int stripLines_ = 0;
};

}  // namespace tervane
