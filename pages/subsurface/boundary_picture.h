// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <optional>
#include <vector>

#include "data/grid_files.h"
#include "forms/plots.h"
#include "subsurface/boundary.h"

namespace tervane {

/// The domain with the segments of its boundary, as pages show it. It is painted beside the window, and again when the
/// domain or a segment is another one.
class BoundaryPicture {
 public:
  enum class By { Type, Number };

  explicit BoundaryPicture(const CGeoDataBoundCondListKvf& boundary, By by) : boundary_(boundary), by_(by) {}

  /// The map with the numbered starts of the segments.
  MapContent Map();
  /// Length of a segment in metres and its part of the whole boundary; nothing while they cannot be told.
  struct Extent {
    double length, share;
  };
  std::optional<Extent> ExtentOf(const CGeoDataBoundCondItemKvf& segment);

 private:
  const CGeoDataBoundCondListKvf& boundary_;
  By by_;
  std::shared_ptr<Computed<TracedDomain>> trace_;
  std::vector<BoundaryItem> segments_;
  std::shared_ptr<ComputedGrid> painted_;
  std::vector<double> lengths_;  ///< Of the painted segments; empty until somebody asks.
};

}  // namespace tervane
