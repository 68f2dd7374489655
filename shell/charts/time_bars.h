// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QString>
#include <vector>

#include <qcustomplot.h>

#include "forms/plots.h"

namespace tervane {

/// Stretches of time as bars, with their names where there is room. Gaps and overlaps are hatched. Things at once stand
/// below each other, unless an overlap tells that they are.
class TimeBarPlottable : public QCPAbstractPlottable {
 public:
  TimeBarPlottable(QCPAxis* keys, QCPAxis* values, const std::vector<TimeBar>& bars);

  /// How many bars stand below each other: 1 where they follow each other.
  static int LanesOf(const std::vector<TimeBar>& bars);
  /// What was going on at a time: the names of all bars there.
  QString NamesAt(double time) const;

  double selectTest(const QPointF& /*at*/, bool /*onlySelectable*/, QVariant* /*details*/) const override { return -1; }
  QCPRange getKeyRange(bool& isFound, QCP::SignDomain domain) const override;
  QCPRange getValueRange(bool& isFound, QCP::SignDomain domain, const QCPRange& keys) const override;

 protected:
  void draw(QCPPainter* painter) override;
  void drawLegendIcon(QCPPainter* /*painter*/, const QRectF& /*place*/) const override {}

 private:
  struct Bar {
    double start, end;
    QString name;
    std::size_t color;  ///< Of its name.
    TimeBar::Kind kind;
    int lane = 0;
  };

  void DrawBar(QCPPainter& painter, const Bar& bar, const QRectF& place) const;

  std::vector<Bar> bars_;  ///< Ascending by their start.
  double longest_ = 0;     ///< Of all bars.
  int lanes_ = 1;
};

}  // namespace tervane
