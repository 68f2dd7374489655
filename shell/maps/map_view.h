// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <map>

#include "forms/plots.h"
#include "shell/widgets/plot_frame.h"

namespace tervane {

class MapCanvas;
class ReliefWindow;

/// A map of a page with its status line and buttons.
///
/// Drag moves it, the wheel zooms towards the pointer, Shift and drag zooms to a box, a double click or Home shows
/// everything; + - and the arrows do the same from the keyboard. Ctrl and arrows move a mark in the place of the
/// pointer, at which Enter clicks. Layers of the backdrop are switched and made
/// transparent here for the looking alone.
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

  /// How a layer of the backdrop is looked at.
  struct LayerLook {
    bool isShown = true;
    double transparency = 0;
  };
  void Look(const std::string& layer, const LayerLook& look);
  /// The layers of the backdrop, the topmost first.
  std::vector<std::string> LayerTitles() const;

  /// Tells the ground on which the map lies in its 3D view. It is not asked once the map is gone. Without it, or where
  /// no ground is known, the values of the map's first grid serve as heights.
  void SetGround(std::function<SectionContent()> ground) { ground_ = std::move(ground); }
  /// Tells the cells of the model, whose borders can be drawn; without it those of the map's first grid are.
  void SetModelCells(std::function<std::optional<GridGeometry>()> cells) { modelCells_ = std::move(cells); }
  /// Lets files be dropped on the map; those that `wants` takes are handed to `dropped`.
  void TakeDrops(std::function<bool(const std::string& path)> wants,
                 std::function<void(const std::vector<std::string>& paths)> dropped);
  /// Asks for a file and writes the part of the map that is seen as a picture that knows its place, or the values of
  /// the first grid, as the file's name tells.
  void SaveMapAs();
  /// Shows the map from the side, in a window of its own; null where there is nothing to show, which is told.
  ReliefWindow* OpenRelief();

 protected:
  /// What is pointed at; else what there is to see.
  QString Description() const override;
  void dragEnterEvent(QDragEnterEvent* event) override;
  void dropEvent(QDropEvent* event) override;

 private:
  /// Lights the slopes of elevations, or no longer.
  void SetHillshade(bool isOn);
  void LightSlopes(MapContent& content, bool isOn);
  /// Frames of other times are drawn behind our back.
  void TakeFrame();
  /// The content as the user looks at it.
  MapContent AsLookedAt() const;
  void FillLayerMenu();

  MapContent content_;
  std::map<std::string, LayerLook> looks_;  ///< By the layer's title; those that were changed.
  void SyncLooks();

  std::function<SectionContent()> ground_;
  std::function<std::optional<GridGeometry>()> modelCells_;
  std::function<bool(const std::string& path)> wantsFile_;
  std::function<void(const std::vector<std::string>& paths)> dropped_;
  QAction *cellLines_, *layerLegend_;
  QToolButton* layersButton_;
  MapCanvas* canvas_;
  QAction* hillshade_;
  DisplayUnits units_;
  bool isShown_ = false;
};

}  // namespace tervane
