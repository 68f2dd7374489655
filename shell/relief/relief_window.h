// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>

#include "core/host.h"
#include "forms/relief_content.h"
#include "shell/widgets/plot_frame.h"

class QComboBox;
class QDoubleSpinBox;
class QListWidget;
class QListWidgetItem;
class QSlider;

namespace tervane {

class ReliefCanvas;

/// The 3D view with its status line and buttons.
///
/// Drag turns it, Shift and drag or the right button moves it, the wheel zooms, a double click or Home shows
/// everything; the arrows, + and - do the same from the keyboard.
class ReliefView : public PlotFrame {
  Q_OBJECT

 public:
  explicit ReliefView(Host& host, QWidget* parent = nullptr);

  /// `paint` puts colours and pictures onto a relief that has none. What is shown stays until the next is computed.
  void ShowWhenThere(ReliefSource source, std::function<void(Relief& relief)> paint, const DisplayUnits& units);
  ReliefCanvas& Canvas() const { return *canvas_; }

 signals:
  /// Another relief is shown.
  void Shown();

 private:
  ReliefCanvas* canvas_;
  std::shared_ptr<const Relief> shown_;
};

/// A window with a 3D view, and beside it what is shown and how.
class ReliefWindow : public QWidget {
  Q_OBJECT

 public:
  /// Goes with its parent, and when it is closed.
  ReliefWindow(QWidget* parent, Host& host, const QString& title);

  ReliefView& View() const { return *view_; }
  /// Follows another content, or the same one that has changed.
  void Show(ReliefSource source, std::function<void(Relief& relief)> paint, const DisplayUnits& units);
  /// Cuts the block from a side: 0 none, then south, north, west, east; up to a fraction of it.
  void Slice(int side, double part);

 private:
  QWidget* BuildPanel();
  void FillBodies();
  void TakeBody(QListWidgetItem* item);
  void TakeSlice();

  ReliefView* view_;
  QListWidget* bodies_ = nullptr;
  QSlider *transparency_ = nullptr, *place_ = nullptr;
  QDoubleSpinBox* exaggeration_ = nullptr;
  QComboBox* side_ = nullptr;
  bool isFilling_ = false;
};

/// Colours of the ground and its layers, lenses and curves, as sections have them.
void PaintGround(Relief& relief);
/// A factor for heights with which a relief looks neither flat nor spiky: 1, 2, 2.5 or 5 times a power of ten.
double GoodExaggeration(const Relief& relief);

}  // namespace tervane
