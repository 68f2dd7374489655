// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What the sources of the map's canvas share.
#pragma once

#include <QFutureWatcher>
#include <QPalette>
#include <atomic>
#include <memory>

#include "platform/item_types.h"
#include "shell/maps/map_canvas.h"
#include "shell/widgets/theme.h"

namespace tervane {

/// In pixels, of pixels at zoom 1.
inline double Scaled(double pixels) { return pixels * Theme::Get().Zoom(); }

/// Between map and legend, in pixels at zoom 1.
inline constexpr int kLegendPadding = 10;

inline ShownUnit CoordinateUnit(const DisplayUnits& units) { return {quantity::kMapCoordinate, 1000, &units}; }

/// A grid with its picture, which may still be in the making.
struct MapCanvas::Layer {
  GridLayer grid;
  int unitKey = 0;
  std::shared_ptr<const GridPicture> picture;
  bool isOld = false;  ///< The picture is that of the grid before, until the new one is ready.
  std::shared_ptr<std::atomic<bool>> isGivenUp = std::make_shared<std::atomic<bool>>(false);
  QFutureWatcher<std::shared_ptr<const GridPicture>> watcher;

  ~Layer() { *isGivenUp = true; }
};

/// A text on paper of its own over the map.
void DrawChip(QPainter& painter, const QRectF& chip, const QString& text, const QPalette& colors);

/// Over the whole canvas; without a picture nothing was drawn yet.
struct MapCanvas::Scene {
  QPixmap picture;
  MapWindow window;
};

struct MapCanvas::Backdrop {
  std::shared_ptr<SharedLayer> layer;
  double transparency = 0;
  QFutureWatcher<SharedLayer::Picture> watcher;
};

/// The length that the scale bar shows, with its texts and its place.
struct MapCanvas::ScaleBar {
  double pixels = 0;
  QString text, half;
  QRectF box;
};

}  // namespace tervane
