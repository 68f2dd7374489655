// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/grid_resampling.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <limits>
#include <new>
#include <optional>

#include <fmt/format.h>

#include "data/datafile.h"

namespace tervane {

namespace {

/// Leads between places counted in cells of the grid and of the raster.
class Places {
 public:
  explicit Places(const ResamplingTask& task)
      : grid_(task.grid),
        raster_({task.raster.nx, task.raster.ny, 1, task.raster.x0, task.raster.y0, task.raster.rotation, {}}),
        width_(task.raster.cellSize),
        height_(task.raster.cellHeight),
        change_(task.change) {}

  std::optional<MapPoint> ToRaster(MapPoint cells) const {
    MapPoint place = grid_.ToWorld(cells);
    if (change_ != nullptr && !change_->Back(place.x, place.y)) return std::nullopt;
    place = raster_.ToCells(place);
    return MapPoint{place.x / width_, place.y / height_};
  }
  std::optional<MapPoint> ToGrid(MapPoint cells) const {
    MapPoint place = raster_.ToWorld({cells.x * width_, cells.y * height_});
    if (change_ != nullptr && !change_->Forward(place.x, place.y)) return std::nullopt;
    return grid_.ToCells(place);
  }

 private:
  GridTransform grid_;
  GridTransform raster_;  ///< In meters, whose cells need not be squares.
  double width_, height_;
  const CYbProjectionChange* change_;
};

/// A part of the raster with its values.
struct Part {
  CellWindow window;
  std::vector<float> values;

  /// kDeleteValue outside.
  float At(int i, int j) const {
    if (i < window.i || j < window.j || i >= window.i + window.nx || j >= window.j + window.ny) return kDeleteValue;
    return values[static_cast<std::size_t>(j - window.j) * static_cast<std::size_t>(window.nx) +
                  static_cast<std::size_t>(i - window.i)];
  }
};

/// The range of places along one axis.
struct Range {
  double from = std::numeric_limits<double>::infinity(), to = -std::numeric_limits<double>::infinity();

  void Add(double place) {
    from = std::min(from, place);
    to = std::max(to, place);
  }
};

/// The cells of the raster within the ranges, one more on each side.
CellWindow WindowOf(const Range& x, const Range& y, const FileGeometry& raster) {
  const auto cut = [](double place, int count) { return static_cast<int>(std::clamp<double>(place, 0, count)); };
  CellWindow window;
  if (!(x.from <= x.to && y.from <= y.to)) return window;
  window.i = cut(std::floor(x.from) - 1, raster.nx);
  window.j = cut(std::floor(y.from) - 1, raster.ny);
  window.nx = cut(std::floor(x.to) + 2, raster.nx) - window.i;
  window.ny = cut(std::floor(y.to) + 2, raster.ny) - window.j;
  return window;
}

/// A place so near to the edge between two cells that only rounding tells its side counts as the edge.
int CellOf(double place) {
  constexpr double kRounding = 1e-7;
  return static_cast<int>(std::clamp(std::floor(place + kRounding), -2e9, 2e9));
}

float Bilinear(const Part& part, MapPoint place) {
  const float own = part.At(CellOf(place.x), CellOf(place.y));
  if (own == kDeleteValue) return own;
  const double x = place.x - 0.5, y = place.y - 0.5;
  const int i = CellOf(x), j = CellOf(y);
  const double toEast = std::clamp(x - i, 0.0, 1.0), toNorth = std::clamp(y - j, 0.0, 1.0);
  double sum = 0, weights = 0;
  for (const int di : {0, 1}) {
    for (const int dj : {0, 1}) {
      const float value = part.At(i + di, j + dj);
      const double weight = (di == 0 ? 1 - toEast : toEast) * (dj == 0 ? 1 - toNorth : toNorth);
      if (value == kDeleteValue || weight == 0) continue;
      sum += weight * static_cast<double>(value);
      weights += weight;
    }
  }
  return static_cast<float>(sum / weights);
}

std::string ReadPart(const ResamplingTask& task, Part& part) {
  const CellWindow& window = part.window;
  const double cells = static_cast<double>(window.nx) * static_cast<double>(window.ny);
  if (cells > static_cast<double>(kMostCells)) {
    return fmt::format(
        "{:.0f} cells of the raster would be needed at once, {} at most can be read; make it coarser first", cells,
        kMostCells);
  }
  part.values.resize(window.CellCount());
  return task.read(window, part.values);
}

/// Takes for each cell's centre what the method makes of the raster there, some rows of the grid at a time.
std::string TakeAtCentres(const ResamplingTask& task, Resampling method, std::vector<float>& values) {
  const Places places(task);
  const auto nx = static_cast<std::size_t>(task.grid.nx);
  constexpr std::size_t kPiece = std::size_t{1} << 18;
  const int rows = static_cast<int>(std::clamp<std::size_t>(kPiece / nx, 1, static_cast<std::size_t>(task.grid.ny)));
  std::vector<std::optional<MapPoint>> centres;
  for (int row = 0; row < task.grid.ny; row += rows) {
    const int end = std::min(row + rows, task.grid.ny);
    centres.clear();
    Range x, y;
    for (int j = row; j < end; ++j) {
      for (int i = 0; i < task.grid.nx; ++i) {
        const std::optional<MapPoint> place = places.ToRaster({i + 0.5, j + 0.5});
        centres.push_back(place);
        if (!place) continue;
        x.Add(place->x);
        y.Add(place->y);
      }
    }
    Part part{WindowOf(x, y, task.raster), {}};
    if (part.window.nx <= 0 || part.window.ny <= 0) continue;
    if (std::string error = ReadPart(task, part); !error.empty()) return error;
    float* target = values.data() + static_cast<std::size_t>(row) * nx;
    for (const std::optional<MapPoint>& place : centres) {
      if (place)
        *target = method == Resampling::Bilinear ? Bilinear(part, *place) : part.At(CellOf(place->x), CellOf(place->y));
      ++target;
    }
  }
  return {};
}

/// The part of the raster that the grid covers. A line that is straight in one projection is bent in the other: so the
/// whole edge is asked, and the inside too, which can reach further (a pole).
CellWindow CoveredWindow(const ResamplingTask& task, const Places& places) {
  constexpr int kPlaces = 100;
  Range x, y;
  for (int a = 0; a <= kPlaces; ++a) {
    for (int b = 0; b <= kPlaces; ++b) {
      const auto place = places.ToRaster(
          {task.grid.nx * (a / static_cast<double>(kPlaces)), task.grid.ny * (b / static_cast<double>(kPlaces))});
      if (!place) continue;
      x.Add(place->x);
      y.Add(place->y);
    }
  }
  if (task.change != nullptr) {
    // What bends between two of these places.
    const double more = 0.02 * std::max({x.to - x.from, y.to - y.from, 0.0});
    x = {x.from - more, x.to + more};
    y = {y.from - more, y.to + more};
  }
  return WindowOf(x, y, task.raster);
}

/// Adds each cell of the raster to the cell of the grid in which its centre lies.
std::string TakeMeans(const ResamplingTask& task, std::vector<float>& values) {
  const Places places(task);
  const CellWindow all = CoveredWindow(task, places);
  if (all.nx <= 0 || all.ny <= 0) return {};
  std::vector<double> sums(values.size());
  std::vector<std::uint32_t> counts(values.size());
  constexpr int kPiece = 1 << 20;
  const int rows = std::clamp(kPiece / all.nx, 1, all.ny);
  Part part;
  for (int row = 0; row < all.ny; row += rows) {
    part.window = {all.i, all.j + row, all.nx, std::min(rows, all.ny - row)};
    if (std::string error = ReadPart(task, part); !error.empty()) return error;
    const float* value = part.values.data();
    for (int j = part.window.j; j < part.window.j + part.window.ny; ++j) {
      for (int i = part.window.i; i < part.window.i + part.window.nx; ++i, ++value) {
        if (*value == kDeleteValue) continue;
        const std::optional<MapPoint> place = places.ToGrid({i + 0.5, j + 0.5});
        if (!place) continue;
        const int column = CellOf(place->x), line = CellOf(place->y);
        if (column < 0 || line < 0 || column >= task.grid.nx || line >= task.grid.ny) continue;
        const std::size_t target =
            static_cast<std::size_t>(line) * static_cast<std::size_t>(task.grid.nx) + static_cast<std::size_t>(column);
        sums[target] += static_cast<double>(*value);
        ++counts[target];
      }
    }
  }
  for (std::size_t i = 0; i < values.size(); ++i)
    if (counts[i] > 0) values[i] = static_cast<float>(sums[i] / counts[i]);
  return {};
}

/// How many cells of the raster go across a cell in the grid's middle, in the direction in which they are fewest.
double CellsAcross(const Places& places, const GridGeometry& grid) {
  const MapPoint middle{grid.nx / 2.0, grid.ny / 2.0};
  const auto here = places.ToRaster(middle);
  const auto east = places.ToRaster({middle.x + 1, middle.y}), north = places.ToRaster({middle.x, middle.y + 1});
  if (!here || !east || !north) return 1;
  const double a = east->x - here->x, b = east->y - here->y, c = north->x - here->x, d = north->y - here->y;
  // The shortest radius of the ellipse that a circle becomes.
  const double half = (a * a + b * b + c * c + d * d) / 2, area = a * d - b * c;
  return std::sqrt(std::max(0.0, half - std::sqrt(std::max(0.0, half * half - area * area))));
}

/// True when each cell of the grid lies just over one of the raster, or beside the raster.
bool AreCellsTheSame(const ResamplingTask& task, const Places& places) {
  if (task.change != nullptr) return false;
  // Of a cell, at any corner of the grid.
  constexpr double kTolerance = 1e-3;
  const auto isNear = [](double a, double b) { return std::abs(a - b) <= kTolerance; };
  const auto origin = places.ToRaster({0, 0});
  const auto east = places.ToRaster({static_cast<double>(task.grid.nx), 0});
  const auto north = places.ToRaster({0, static_cast<double>(task.grid.ny)});
  return origin && east && north && isNear(origin->x, std::round(origin->x)) &&
         isNear(origin->y, std::round(origin->y)) && isNear(east->x, origin->x + task.grid.nx) &&
         isNear(east->y, origin->y) && isNear(north->x, origin->x) && isNear(north->y, origin->y + task.grid.ny);
}

}  // namespace

std::string_view ResamplingText(Resampling method) {
  switch (method) {
    case Resampling::CellForCell:
      return "cell for cell, nothing was resampled";
    case Resampling::Nearest:
      return "the nearest cell of the raster (nearest)";
    case Resampling::Bilinear:
      return "interpolated between the raster's cells (bilinear)";
    default:
      return "the mean of the raster's cells within each cell (average)";
  }
}

Resampling SuitableResampling(const ResamplingTask& task, bool areCodes) {
  const Places places(task);
  if (AreCellsTheSame(task, places)) return Resampling::CellForCell;
  if (areCodes) return Resampling::Nearest;
  constexpr double kTwo = 2 - 1e-6;
  return CellsAcross(places, task.grid) >= kTwo ? Resampling::Average : Resampling::Bilinear;
}

std::string Resample(const ResamplingTask& task, Resampling method, std::vector<float>& values) {
  try {
    values.assign(task.grid.CellCount(), kDeleteValue);
    return method == Resampling::Average ? TakeMeans(task, values) : TakeAtCentres(task, method, values);
  } catch (const std::bad_alloc&) {
    return "the grid needs more than the free memory";
  }
}

}  // namespace tervane
