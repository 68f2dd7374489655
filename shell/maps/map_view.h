// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "forms/plots.h"
#include "shell/widgets/plot_frame.h"

namespace tervane {

class MapCanvas;

/// A map of a page with its status line and buttons.
///
/// Drag moves it, the wheel zooms towards the pointer, Shift and drag zooms to a box, a double click or Home shows
/// everything; + - and the arrows do the same from the keyboard.
class MapView : public PlotFrame {
  Q_OBJECT

 public:
  explicit MapView(Host& host, QWidget* parent = nullptr);

  /// Shows what there is to show, in the user's units (null for base units); draws anew only where something differs.
  void Show(MapContent content, const DisplayUnits* units);
  /// The same of content that may have to be computed: what is shown stays until that is done.
  void ShowWhenThere(const std::function<MapContent()>& content, const DisplayUnits* units);
  bool IsBusy() const override;
  MapCanvas& Canvas() const { return *canvas_; }

 private:
  /// Lights the slopes of elevations, or no longer.
  void SetHillshade(bool isOn);
  void LightSlopes(MapContent& content, bool isOn);

  MapCanvas* canvas_;
  QAction* hillshade_;
  DisplayUnits units_;
  bool isShown_ = false;
};

}  // namespace tervane
