// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The grids of a data file as results: over time, in colours that stay the same, as differences, with flow, at single
// cells and along a line. Without any toolkit.
#pragma once

#include <cstddef>
#include <deque>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "core/host.h"
#include "forms/plots.h"
#include "pages/data_file_view.h"
#include "pages/grid_frames.h"
#include "results/viewed_setup.h"

namespace tervane {

/// Shows the grid that a view of a file has chosen, in its step and layer; to be asked for that only while it is one.
class ResultView {
 public:
  /// All must outlive it; units are null for base units. What the user chooses as colours is kept for the quantity in
  /// the settings of the host.
  ResultView(DataFileView& file, const DisplayUnits* units, Host& host);

  /// Also shows what a setup of the result viewer asks for beside its result: palette, flow, and what lies over it.
  void TakeSetup(const ViewedSetup& setup);
  /// What is put over each map, such as where a model lies.
  void PutOverMaps(std::function<void(MapContent& map)> put) { putOver_ = std::move(put); }
  /// Forgets what was read, after the file has become another one.
  void Forget();

  // ---- Colours

  /// Names to choose from.
  std::vector<std::string> Palettes() const;
  std::size_t Palette() const;
  void ChoosePalette(std::size_t number);

  // ---- Differences

  /// Each step minus this one.
  void SubtractStep(std::size_t step);
  /// Each step minus that of the same time in a file of another run, of the item of the same name or else number. "" or
  /// why not.
  std::string SubtractFile(const std::string& path);
  void SubtractNothing();
  bool IsDifference() const { return subtracted_.has_value(); }
  /// "Minus 2000-01-31 00:00", "Minus heads.nds3"; empty for none.
  std::string DifferenceText() const;

  // ---- Flow

  /// "Flow in x-direction", one for each pair of items that can be shown.
  std::vector<std::string> Flows() const;
  /// The pair that is shown, by its place.
  const std::optional<std::size_t>& ShownFlow() const { return flow_; }
  void ShowFlow(std::optional<std::size_t> number);

  // ---- Steps

  /// A step, of which every so many rows and columns are read. The same again while it is asked for.
  std::shared_ptr<ComputedFrame> Frame(std::size_t step, int every = 1);
  /// As many rows and columns may be left out where so many cells share a pixel.
  int EveryFor(double cellsPerPixel) const;
  /// How many steps are kept.
  std::size_t KeptFrames() const;
  /// The layer of a map in which steps are shown, without its grid; nothing while what decides its colours is not
  /// known.
  std::optional<GridLayer> Colors() const;
  std::optional<ArrowLayer> ArrowsOf(const GridFrame& frame) const;
  /// The chosen step. `pick` of the map is left to the caller.
  MapContent Map();

  // ---- Cells and lines

  /// Shows the series of this cell, in the place of the last one or, when cells are kept, beside all.
  void PickCell(int i, int j);
  void KeepCells(bool areKept) { keepsCells_ = areKept; }
  void ForgetCells() { cells_.clear(); }
  std::size_t CellCount() const { return cells_.size(); }
  SeriesContent CellSeries() const;

  void TakeLine(std::vector<MapPoint> line) { line_ = std::move(line); }
  const std::vector<MapPoint>& Line() const { return line_; }
  /// The values of a frame along the line.
  SeriesContent Profile(const GridFrame& frame) const;
  /// The same of the chosen step.
  SeriesContent Profile();

 private:
  struct Kept {
    std::size_t step = 0;
    int every = 1;
    std::shared_ptr<ComputedFrame> frame;
  };
  struct Cell {
    int i = 0, j = 0;
    MapPoint place;
    std::shared_ptr<Computed<FileSeries>> series;
  };

  FrameRecipe Recipe() const;
  /// Forgets what was made by another recipe.
  void Follow();
  bool NeedsRange() const;
  std::string PaletteSetting() const;
  std::vector<ScaleClass> ViewerScale() const;
  std::vector<ScaleClass> FileScale() const;
  std::shared_ptr<Computed<FileSeries>> SeriesOf(int i, int j) const;
  void AddOverlays(MapContent& map);

  DataFileView& file_;
  const DisplayUnits* units_;
  Host& host_;
  std::function<void(MapContent& map)> putOver_;
  std::optional<ViewedSetup> setup_;
  std::vector<std::shared_ptr<Computed<CTvnShapeData>>> overlays_;  ///< Those of the setup that are shapes.
  std::vector<FlowItems> flows_;
  std::optional<std::size_t> flow_;
  std::optional<Subtracted> subtracted_;
  bool usesFileScale_ = false;

  FrameRecipe recipe_;
  std::deque<Kept> frames_;  ///< The latest first.
  std::shared_ptr<Computed<FrameRange>> range_;
  std::shared_ptr<Computed<double>> strongest_;
  std::vector<Cell> cells_;
  bool keepsCells_ = false;
  std::vector<MapPoint> line_;
};

}  // namespace tervane
