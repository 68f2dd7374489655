// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The layers of a map, made ready so that any part of them is drawn quickly.
#pragma once

#include <QImage>
#include <QPainter>
#include <QPointF>
#include <QRectF>
#include <atomic>
#include <cstdint>
#include <memory>
#include <optional>
#include <vector>

#include "forms/plots.h"
#include "shell/maps/map_palette.h"

namespace tervane {

/// The part of the map that is seen: a rectangle of the screen, north up.
struct MapWindow {
  QRectF rect;
  MapPoint centre;
  double metresPerPixel = 1;

  QPointF ToScreen(MapPoint place) const {
    return {rect.center().x() + (place.x - centre.x) / metresPerPixel,
            rect.center().y() - (place.y - centre.y) / metresPerPixel};
  }
  MapPoint ToMap(QPointF screen) const {
    return {centre.x + (screen.x() - rect.center().x()) * metresPerPixel,
            centre.y - (screen.y() - rect.center().y()) * metresPerPixel};
  }
};

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

/// Shapes with the rectangles around them.
class ShapePicture {
 public:
  explicit ShapePicture(ShapeLayer layer);

  const ShapeLayer& Layer() const { return layer_; }
  /// Around all shapes; nothing when there are none.
  const std::optional<Envelope>& Area() const { return area_; }
  void Draw(QPainter& painter, const MapWindow& window, bool onDark, double zoom) const;
  /// The topmost shape at a place, lines and points within `reach` metres.
  std::optional<std::size_t> At(MapPoint place, double reach) const;

 private:
  bool IsHighlighted(const Shape& shape) const;
  void DrawPoints(QPainter& painter, const MapWindow& window, double zoom) const;

  ShapeLayer layer_;
  std::vector<Envelope> around_;
  std::optional<Envelope> area_;
};

/// Points with their names; a name for which there is no room is left out. `taken` is where others stand, and names
/// that are drawn are added to it.
void DrawLabelledPoints(QPainter& painter, const MapWindow& window, const PointLayer& layer, bool onDark, double zoom,
                        std::vector<QRectF>& taken);

/// A text that is read on any ground.
void DrawOutlinedText(QPainter& painter, QPointF baseline, const QString& text, const QColor& color,
                      const QColor& around);

}  // namespace tervane
