// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Layers of the backdrop, made ready so that they are drawn quickly, and shared by all maps of the program.
#pragma once

#include <QFuture>
#include <QPainter>
#include <atomic>
#include <memory>
#include <optional>

#include "forms/plots.h"
#include "shell/maps/map_drawing.h"
#include "shell/maps/map_labels.h"

namespace tervane {

/// A layer that is ready.
class LayerPicture {
 public:
  virtual ~LayerPicture() = default;

  /// Around all that it draws; nothing when it draws nothing.
  virtual std::optional<Envelope> Area() const = 0;
  virtual void Draw(QPainter& painter, const DrawnMap& map, double pixelRatio) const = 0;
  /// Texts, where they have room.
  virtual void DrawTexts(QPainter& /*painter*/, const DrawnMap& /*map*/, LabelPlaces& /*places*/) const {}
};

/// A layer that is made ready in another thread, once for all maps that show it at a time.
class SharedLayer {
 public:
  using Drawn = decltype(BackdropLayer::drawn);
  using Picture = std::shared_ptr<const LayerPicture>;

  /// The one that is shown elsewhere, or a new one.
  static std::shared_ptr<SharedLayer> Of(const Drawn& drawn);
  explicit SharedLayer(Drawn drawn);
  /// What is still in the making is given up.
  ~SharedLayer();
  SharedLayer(const SharedLayer&) = delete;
  SharedLayer& operator=(const SharedLayer&) = delete;

  bool IsReady() const { return future_.isFinished(); }
  /// Null while it is not ready, and where nothing can be drawn, such as of a file that is no image.
  Picture Get() const;
  const QFuture<Picture>& Future() const { return future_; }

 private:
  Drawn drawn_;
  std::shared_ptr<std::atomic<bool>> isGivenUp_ = std::make_shared<std::atomic<bool>>(false);
  QFuture<Picture> future_;
};

}  // namespace tervane
