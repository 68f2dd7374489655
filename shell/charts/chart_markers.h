// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QObject>
#include <QPointF>
#include <optional>
#include <vector>

#include "forms/plots.h"

class QCPAxisRect;
class QCPItemText;
class QCustomPlot;
class QLabel;
class QMouseEvent;

namespace tervane {

/// Dates that are marked in a chart and may be dragged, and the date that a page asks for.
class ChartMarkers : public QObject {
  Q_OBJECT

 public:
  explicit ChartMarkers(QCustomPlot& chart);

  /// Takes what is marked out of the chart; before its content goes.
  void Clear();
  /// Marks dates over all charts that stand below each other; the names stand in the first one.
  void Show(const std::vector<DateMarker>& markers, const std::vector<QCPAxisRect*>& charts);
  /// What a dragged marker does, of markers that look the same.
  void SetMoves(const std::vector<DateMarker>& markers);
  /// Asks for a date, or no longer.
  void Ask(std::optional<DateRequest> request);
  bool IsAsking() const { return request_.has_value(); }
  /// Gives the date at that place of the axis of time as the answer; false where none is asked for.
  bool AnswerWith(double place);
  void ApplyTheme();
  /// Names keep off each other: one that would meet the one before it stands a line lower.
  void Arrange();

 protected:
  bool eventFilter(QObject* watched, QEvent* event) override;

 private:
  class Lines;

  bool Press(const QMouseEvent& event);
  bool Move(const QMouseEvent& event);
  bool Release(const QMouseEvent& event);
  void GiveUp();
  void Place(std::size_t marker, double at);
  void MakeName(const DateMarker& marker);
  std::optional<std::size_t> MarkerAt(QPointF pointer) const;
  double PerPixel() const;
  bool IsInside(QPointF pointer) const;

  QCustomPlot& chart_;
  QLabel* prompt_;
  std::vector<DateMarker> markers_;
  std::vector<double> places_;       ///< Of the markers on the axis of time, also while they are dragged.
  std::vector<Lines*> lines_;        ///< Of all markers, in each of the charts.
  std::vector<QCPItemText*> names_;  ///< As many as markers, or none where they are too many to be read.
  std::vector<QCPAxisRect*> charts_;
  std::optional<DateRequest> request_;
  std::optional<std::size_t> dragged_;
  std::optional<QPointF> pressedAt_;  ///< Where a click that is to give a date began.
};

}  // namespace tervane
