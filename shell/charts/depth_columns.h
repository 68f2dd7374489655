// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QWidget>

#include "forms/plots.h"
#include "platform/units.h"
#include "shell/widgets/shown_unit.h"

namespace tervane {

/// Columns of the ground beside each other over one axis of depth, as blocks with names and parts. Where columns end at
/// different depths is marked.
class DepthColumns : public QWidget {
 public:
  explicit DepthColumns(QWidget* parent = nullptr);

  /// In the user's units; null for base units.
  void Show(DepthContent content, const DisplayUnits* units);
  /// What is at a place: "Loam, 0.5 to 1.2 m", empty for nothing.
  QString TextAt(const QPoint& place) const;

 protected:
  void paintEvent(QPaintEvent* event) override;
  bool event(QEvent* event) override;

 private:
  QRectF Frame() const;
  QRectF PlaceOf(std::size_t column) const;
  double ToPixel(double depth) const;
  ShownUnit DepthUnit() const;
  QString DepthText(double depth) const;
  void PaintAxis(QPainter& painter) const;
  void PaintBlock(QPainter& painter, const QRectF& place, double top, const DepthBlock& block) const;
  std::size_t ColorOf(const std::string& name) const;

  DepthContent content_;
  DisplayUnits units_;
};

}  // namespace tervane
