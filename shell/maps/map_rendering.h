// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Grids, made ready so that any part of them is drawn quickly.
#pragma once

#include <QImage>
#include <QPainter>
#include <array>
#include <atomic>
#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <vector>

#include "data/file_geometry.h"
#include "forms/plots.h"
#include "shell/maps/map_drawing.h"
#include "shell/maps/map_palette.h"

namespace tervane {

/// A grid as colours, in levels of which each has half as many cells in a row as the one before.
class GridPicture {
 public:
  /// May run in any thread. Null when `isGivenUp` was set meanwhile.
  static std::shared_ptr<const GridPicture> Make(const GridLayer& layer, const DisplayUnits& units,
                                                 const std::atomic<bool>& isGivenUp);

  /// Cells of the layer have other values; the colours stay. Only of a picture that nobody else draws.
  void Update(const GridLayer& layer, std::span<const CellWindow> windows);

  const MapPalette& Palette() const { return palette_; }
  /// Draws what the window shows of the grid; `pixelRatio` is that of the device.
  void Draw(QPainter& painter, const MapWindow& window, double pixelRatio, double opacity) const;

 private:
  struct Level {
    int nx = 0, ny = 0;
    std::vector<std::uint8_t> colors;
  };

  /// Colours for those cells of the finest level.
  void Paint(const GridLayer& layer, const CellWindow& cells);
  /// Of the four colours that become one, that with the least rank counts.
  using Ranks = std::array<std::size_t, MapPalette::kMostColors + 1>;
  Ranks RanksOfColors() const;
  /// The next coarser level of those cells.
  static void Halve(const Level& finer, Level& level, const CellWindow& cells, const Ranks& rank);
  const Level& LevelFor(double cellsPerPixel, int& number) const;

  GridGeometry geometry_;
  MapPalette palette_;
  std::vector<Level> levels_;
  std::vector<std::size_t> cellsOfColor_;  ///< As far as anybody asks how many there are.
};

}  // namespace tervane
