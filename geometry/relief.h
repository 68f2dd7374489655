// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Bodies of the ground, seen obliquely in parallel projection. A picture is a plain array of pixels: nothing of a
// screen is needed, so that tests and other threads make one as well.
#pragma once

#include <atomic>
#include <cstdint>
#include <limits>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "geometry/grid.h"

namespace tervane {

/// A picture that lies over the cells of a raster, row 0 in the north; 0xAARRGGBB, transparent where nothing lies.
struct ReliefDrape {
  int width = 0, height = 0;
  std::vector<std::uint32_t> pixels;
};

/// A picture of an area as it lies over a raster, which may be turned.
std::shared_ptr<const ReliefDrape> DrapeOver(const GridGeometry& raster, const ReliefDrape& picture,
                                             const Envelope& area);

/// What lies between two surfaces, or a surface alone. Heights in metres at the centres of the raster's cells, row by
/// row from the south; NaN where there is none.
struct ReliefBody {
  std::string name;
  std::vector<float> top;
  std::vector<float> bottom = {};  ///< Empty for a surface. A body is only where its top is above its bottom.
  std::uint32_t color = 0xffb0a080;
  std::shared_ptr<const ReliefDrape> drape = nullptr;  ///< On its top, over the colour.
  double opacity = 1;
  bool isShown = true;

  bool IsSurface() const { return bottom.empty(); }
};

/// A well, from its top to its bottom, in metres.
struct ReliefWell {
  std::string name;
  MapPoint place;
  double top = 0, bottom = 0;
};

struct Relief {
  GridGeometry raster;
  std::vector<ReliefBody> bodies;  ///< From the top down; of two at one place the first is seen.
  std::vector<ReliefWell> wells;
  /// Of heights that stand for something else than lengths, such as rain; nothing for metres.
  std::optional<std::string> unit = {};

  /// The lowest and highest height of all bodies and wells; nothing where there is none.
  std::optional<std::pair<double, double>> Heights() const;
};

/// A part of the raster: from and to a fraction of its columns and rows, 0 in the west and south.
struct ReliefPart {
  double west = 0, east = 1, south = 0, north = 1;

  bool operator==(const ReliefPart&) const = default;
};

/// From where and how large one looks.
struct ReliefCamera {
  double heading = 0;        ///< Degrees from north, clockwise: where one looks to.
  double pitch = 35;         ///< Degrees below the horizon, 90 straight down; negative from below.
  double exaggeration = 10;  ///< Of heights.
  double metresPerPixel = 1;
  MapPoint centre;          ///< Seen in the middle of the picture, at `height`.
  double height = 0;        ///< In metres.
  int width = 0, rows = 0;  ///< Of the picture, in pixels.

  /// A place on the screen, from the upper left corner, and how far behind the centre it is, in metres.
  struct Seen {
    double x = 0, y = 0, depth = 0;
  };
  Seen See(MapPoint place, double elevation) const;
  /// Moves and sizes the view so that all of a relief is in the picture.
  void Fit(const Relief& relief);
  /// Moves what is seen by pixels of the screen.
  void Pan(double right, double down);

  bool operator==(const ReliefCamera&) const = default;
};

/// A picture and what is seen at each of its pixels.
struct ReliefPicture {
  static constexpr std::uint16_t kNothing = std::numeric_limits<std::uint16_t>::max();

  int width = 0, height = 0;
  std::vector<std::uint32_t> pixels;  ///< 0xAARRGGBB, row by row from the top; 0 where nothing is seen.
  std::vector<std::uint16_t> body;    ///< The place of the body from 0; `kNothing`.
  std::vector<std::uint32_t> cell;    ///< Of the raster, row by row from the south; of bodies alone.
};

/// How a picture is made.
struct ReliefDrawing {
  ReliefPart part;
  int every = 1;  ///< Of the raster's columns and rows, so many stand for one.
  const std::atomic<bool>* isGivenUp = nullptr;
};

/// Draws bodies and wells. Opaque bodies first; those that are not lie over them, from the farthest to the nearest.
/// Wells that are hidden shine through. Uses all processors. An empty picture when it was given up.
ReliefPicture DrawRelief(const Relief& relief, const ReliefCamera& camera, const ReliefDrawing& drawing);

/// How many rows and columns must stand for one so that shown bodies have at most so many cells.
int EveryFor(const Relief& relief, std::size_t mostCells);

}  // namespace tervane
