// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/maps/map_rendering.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <limits>

namespace tervane {

namespace {

/// The whole numbers x of [0, count) for which 0 <= start + x * step < limit, perhaps with one more at either end.
void Narrow(double start, double step, double limit, int& first, int& last) {
  if (step == 0) {
    if (start < 0 || start >= limit) last = first;
    return;
  }
  double from = -start / step, to = (limit - start) / step;
  if (from > to) std::swap(from, to);
  if (to < first || from > last) {
    last = first;
    return;
  }
  first = std::max(first, static_cast<int>(std::max(from - 1, static_cast<double>(first))));
  last = std::min(last, static_cast<int>(std::min(to + 2, static_cast<double>(last))));
}

/// How the ground is lit from the north-west, cell by cell.
class Hillshade {
 public:
  explicit Hillshade(const CTvn2DOrthoRotatedGridData& grid) : grid_(grid), geometry_(grid.Geometry()) {
    constexpr double kAzimuth = 135;  // Towards the light, counter-clockwise from east, as the grid's turn counts.
    const double turned = (kAzimuth - geometry_.rotation) * std::acos(-1.0) / 180;
    toLight_ = {std::cos(turned), std::sin(turned)};
    // Slopes of coarse cells are slight: heights are stretched until the usual one is seen.
    constexpr std::size_t kSamples = 10'000;
    constexpr double kUsual = 0.35;
    const std::size_t cells = geometry_.CellCount(), stride = std::max<std::size_t>(1, cells / kSamples) | 1;
    double sum = 0;
    std::size_t count = 0;
    for (std::size_t cell = 0; cell < cells; cell += stride) {
      const auto [dx, dy] = SlopeAt(cell);
      sum += std::hypot(dx, dy);
      ++count;
    }
    if (sum > 0) stretch_ = kUsual * static_cast<double>(count) / sum;
  }

  /// From 0, in the shade, to `MapPalette::kShades` - 1.
  int ShadeOf(std::size_t cell) const {
    const auto [dx, dy] = SlopeAt(cell);
    const double rise = -stretch_ * (dx * toLight_.x + dy * toLight_.y);
    const double steep = stretch_ * std::hypot(dx, dy);
    // The light stands 45 degrees high: of flat ground half of the way from shade to full light is seen.
    const double light = (1 + rise) / std::sqrt(1 + steep * steep);
    const double part = 0.5 + 0.5 * (light - 1);
    return static_cast<int>(std::clamp(std::lround(part * MapPalette::kShades), 0L, MapPalette::kShades - 1L));
  }

 private:
  /// How much the values rise to the next cell along the grid's axes.
  std::pair<double, double> SlopeAt(std::size_t cell) const {
    const std::vector<float>& values = grid_.Values();
    const auto nx = static_cast<std::size_t>(geometry_.nx), ny = static_cast<std::size_t>(geometry_.ny);
    const std::size_t i = cell % nx, j = cell / nx;
    const auto rise = [&](std::size_t before, std::size_t behind, std::size_t steps) {
      const float low = values[before], high = values[behind];
      if (steps == 0 || grid_.IsEmptyValue(low) || grid_.IsEmptyValue(high)) return 0.0;
      return static_cast<double>(high - low) / static_cast<double>(steps);
    };
    const std::size_t left = i > 0 ? 1 : 0, right = i + 1 < nx ? 1 : 0;
    const std::size_t below = j > 0 ? 1 : 0, above = j + 1 < ny ? 1 : 0;
    return {rise(cell - left, cell + right, left + right), rise(cell - below * nx, cell + above * nx, below + above)};
  }

  const CTvn2DOrthoRotatedGridData& grid_;
  const GridGeometry geometry_;
  MapPoint toLight_;
  double stretch_ = 1;
};

}  // namespace

std::shared_ptr<const GridPicture> GridPicture::Make(const GridLayer& layer, const DisplayUnits& units,
                                                     const std::atomic<bool>& isGivenUp) {
  auto picture = std::make_shared<GridPicture>();
  picture->geometry_ = layer.grid->Geometry();
  picture->palette_ = MapPalette::Of(layer, &units);
  if (layer.isHillshaded && !layer.isCodes) picture->palette_.MakeShades();
  const int nx = picture->geometry_.nx, ny = picture->geometry_.ny;
  Level finest{nx, ny, {}};
  finest.colors.resize(picture->geometry_.CellCount());
  picture->levels_.push_back(std::move(finest));
  picture->cellsOfColor_.resize(MapPalette::kMostColors + 1);
  // All cells were empty until now.
  picture->cellsOfColor_[0] = picture->geometry_.CellCount();
  constexpr int kRows = 64;
  for (int row = 0; row < ny; row += kRows) {
    if (isGivenUp) return nullptr;
    picture->Paint(layer, {0, row, nx, std::min(kRows, ny - row)});
  }
  constexpr int kCoarsest = 64;
  const Ranks rank = picture->RanksOfColors();
  while (std::max(picture->levels_.back().nx, picture->levels_.back().ny) > kCoarsest) {
    if (isGivenUp) return nullptr;
    const Level& finer = picture->levels_.back();
    Level level{(finer.nx + 1) / 2, (finer.ny + 1) / 2, {}};
    level.colors.resize(static_cast<std::size_t>(level.nx) * static_cast<std::size_t>(level.ny));
    Halve(finer, level, {0, 0, level.nx, level.ny}, rank);
    picture->levels_.push_back(std::move(level));
  }
  return picture;
}

void GridPicture::Update(const GridLayer& layer, std::span<const CellWindow> windows) {
  const auto clip = [](CellWindow& window, int nx, int ny) {
    const int right = std::min(window.i + window.nx, nx), top = std::min(window.j + window.ny, ny);
    window.i = std::max(window.i, 0);
    window.j = std::max(window.j, 0);
    window.nx = right - window.i;
    window.ny = top - window.j;
  };
  const bool isLit = layer.isHillshaded && !layer.isCodes;
  std::vector<CellWindow> changed;
  for (CellWindow window : windows) {
    // How the neighbours are lit follows from a cell, too.
    if (isLit) window = {window.i - 1, window.j - 1, window.nx + 2, window.ny + 2};
    clip(window, geometry_.nx, geometry_.ny);
    if (window.nx <= 0 || window.ny <= 0) continue;
    Paint(layer, window);
    changed.push_back(window);
  }
  const Ranks rank = RanksOfColors();
  for (std::size_t number = 1; number < levels_.size(); ++number)
    for (CellWindow& window : changed) {
      const int right = (window.i + window.nx - 1) / 2, top = (window.j + window.ny - 1) / 2;
      window.i /= 2;
      window.j /= 2;
      window.nx = right + 1 - window.i;
      window.ny = top + 1 - window.j;
      Halve(levels_[number - 1], levels_[number], window, rank);
    }
}

GridPicture::Ranks GridPicture::RanksOfColors() const {
  // An empty cell never stands for others. Of codes the rarest one does, so that a single cell of it stays visible.
  Ranks rank{};
  for (std::size_t color = 0; color < rank.size(); ++color)
    rank[color] = palette_.KeepsSingleCells() ? cellsOfColor_[color] : 1;
  rank[0] = std::numeric_limits<std::size_t>::max();
  return rank;
}

void GridPicture::Paint(const GridLayer& layer, const CellWindow& cells) {
  std::optional<Hillshade> hillshade;
  if (layer.isHillshaded && !layer.isCodes) hillshade.emplace(*layer.grid);
  // Where no cell is more than another, nobody asks how many there are.
  const bool countsCells = palette_.KeepsSingleCells();
  const std::vector<float>& values = layer.grid->Values();
  std::vector<std::uint8_t>& colors = levels_.front().colors;
  for (int j = cells.j; j < cells.j + cells.ny; ++j) {
    const std::size_t first =
        static_cast<std::size_t>(j) * static_cast<std::size_t>(geometry_.nx) + static_cast<std::size_t>(cells.i);
    for (std::size_t cell = first; cell < first + static_cast<std::size_t>(cells.nx); ++cell) {
      std::uint8_t color = palette_.ColorNumber(values[cell]);
      if (hillshade && color != 0) color = palette_.Shaded(color, hillshade->ShadeOf(cell));
      if (countsCells) {
        --cellsOfColor_[colors[cell]];
        ++cellsOfColor_[color];
      }
      colors[cell] = color;
    }
  }
}

void GridPicture::Halve(const Level& finer, Level& level, const CellWindow& cells, const Ranks& rank) {
  for (int j = cells.j; j < cells.j + cells.ny; ++j) {
    const std::uint8_t* lower = &finer.colors[static_cast<std::size_t>(2 * j) * static_cast<std::size_t>(finer.nx)];
    const std::uint8_t* upper = 2 * j + 1 < finer.ny ? lower + finer.nx : lower;
    std::size_t out =
        static_cast<std::size_t>(j) * static_cast<std::size_t>(level.nx) + static_cast<std::size_t>(cells.i);
    for (int i = cells.i; i < cells.i + cells.nx; ++i) {
      const int left = 2 * i, right = std::min(left + 1, finer.nx - 1);
      std::uint8_t best = lower[left];
      for (const std::uint8_t other : {lower[right], upper[left], upper[right]})
        if (rank[other] < rank[best]) best = other;
      level.colors[out++] = best;
    }
  }
}

const GridPicture::Level& GridPicture::LevelFor(double cellsPerPixel, int& number) const {
  const double halvings = std::log2(std::max(cellsPerPixel, 1e-9));
  // A cell of a level is at least a pixel where each cell counts, and at most one where pictures are to be sharp.
  const double wanted = palette_.KeepsSingleCells() ? std::ceil(halvings - 1e-6) : std::floor(halvings);
  number = static_cast<int>(std::clamp(wanted, 0.0, static_cast<double>(levels_.size() - 1)));
  return levels_[static_cast<std::size_t>(number)];
}

void GridPicture::Draw(QPainter& painter, const MapWindow& window, double pixelRatio, double opacity) const {
  const QSize pixels = (window.rect.size() * pixelRatio).toSize();
  if (pixels.isEmpty() || levels_.front().colors.empty()) return;
  const double metres = window.metresPerPixel / pixelRatio;
  const GridTransform transform(geometry_);
  int number = 0;
  const bool isTurned = std::abs(std::remainder(geometry_.rotation, 90.0)) > 1e-6;
  // A turned cell of one pixel may slip between the centres of pixels.
  const double slack = isTurned && palette_.KeepsSingleCells() ? std::sqrt(2.0) : 1.0;
  const Level& level = LevelFor(slack * metres / geometry_.cellSize, number);
  const std::vector<QRgb>& colors = palette_.Colors();

  QImage image(pixels, QImage::Format_ARGB32_Premultiplied);
  image.fill(Qt::transparent);
  const QPointF corner = window.rect.topLeft();
  const auto cellsAt = [&](double x, double y) {
    return transform.ToCells(window.ToMap({corner.x() + x / pixelRatio, corner.y() + y / pixelRatio}));
  };
  const MapPoint origin = cellsAt(0.5, 0.5), right = cellsAt(1.5, 0.5);
  // What a turn leaves of a zero is one.
  const auto step = [&](double difference) {
    return std::abs(difference) < 1e-9 * metres / geometry_.cellSize ? 0.0 : difference;
  };
  const double du = step(right.x - origin.x), dv = step(right.y - origin.y);
  for (int y = 0; y < pixels.height(); ++y) {
    const MapPoint start = cellsAt(0.5, y + 0.5);
    int first = 0, last = pixels.width();
    Narrow(start.x, du, geometry_.nx, first, last);
    Narrow(start.y, dv, geometry_.ny, first, last);
    auto* line = reinterpret_cast<QRgb*>(image.scanLine(y));
    for (int x = first; x < last; ++x) {
      const double u = start.x + x * du, v = start.y + x * dv;
      if (u < 0 || v < 0) continue;
      const int i = static_cast<int>(u), j = static_cast<int>(v);
      if (i >= geometry_.nx || j >= geometry_.ny) continue;
      line[x] = colors[level.colors[static_cast<std::size_t>(j >> number) * static_cast<std::size_t>(level.nx) +
                                    static_cast<std::size_t>(i >> number)]];
    }
  }
  painter.save();
  painter.setOpacity(opacity);
  image.setDevicePixelRatio(pixelRatio);
  painter.drawImage(corner, image);
  painter.restore();
}

}  // namespace tervane
