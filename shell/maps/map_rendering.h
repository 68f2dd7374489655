// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Grids, made ready so that any part of them is drawn quickly.
#pragma once

#include <QImage>
#include <QPainter>
#include <atomic>
#include <cstdint>
#include <memory>
#include <optional>
#include <vector>

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

  const MapPalette& Palette() const { return palette_; }
  /// Draws what the window shows of the grid; `pixelRatio` is that of the device.
  void Draw(QPainter& painter, const MapWindow& window, double pixelRatio, double opacity) const;

 private:
  struct Level {
    int nx = 0, ny = 0;
    std::vector<std::uint8_t> colors;
  };

  Level Halved(const Level& finer, const std::vector<std::size_t>& cellsOfColor) const;
  const Level& LevelFor(double cellsPerPixel, int& number) const;

  GridGeometry geometry_;
  MapPalette palette_;
  std::vector<Level> levels_;
};

}  // namespace tervane
