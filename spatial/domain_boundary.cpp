// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/domain_boundary.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <numeric>

namespace tervane {

namespace {

/// The neighbours in the order of the trace: number n stands at n - 1.
constexpr std::array<GridCell, 8> kSteps{GridCell{0, 1}, {-1, 1}, {-1, 0}, {-1, -1}, {0, -1}, {1, -1}, {1, 0}, {1, 1}};
constexpr int kEast = 7, kSouthEast = 6, kSouth = 5;

GridCell Neighbour(GridCell cell, int number) {
  const GridCell step = kSteps[static_cast<std::size_t>(number - 1)];
  return {cell.i + step.i, cell.j + step.j};
}

/// The number of the neighbour of `cell` that is `other`.
int NumberOf(GridCell cell, GridCell other) {
  for (int number = 1; number <= 8; ++number)
    if (Neighbour(cell, number) == other) return number;
  return 0;
}

}  // namespace

std::size_t CGeoDataBoundCondCatchmentData::IndexOf(GridCell cell) const {
  return static_cast<std::size_t>(cell.j) * static_cast<std::size_t>(Geometry().nx) + static_cast<std::size_t>(cell.i);
}

int CGeoDataBoundCondCatchmentData::CodeAt(GridCell cell) const {
  if (cell.i < 0 || cell.j < 0 || cell.i >= Geometry().nx || cell.j >= Geometry().ny) return -10000;
  return static_cast<int>(std::floor(Values()[IndexOf(cell)] + 0.5F));
}

int CGeoDataBoundCondCatchmentData::PrepareBoundary(std::string& message) {
  message.clear();
  BoundaryCells.clear();
  const int nx = Geometry().nx, ny = Geometry().ny;
  for (const float value : Values()) {
    if (IsEmptyValue(value)) continue;
    const int code = static_cast<int>(value + 0.5F);
    if (code != 1 && code != 2) return 0;
  }
  const auto findStart = [&]() -> std::optional<GridCell> {
    for (int j = ny - 1; j >= 0; --j)
      for (int i = 0; i < nx; ++i)
        if (!IsEmptyValue(Value(i, j))) return GridCell{i, j};
    return std::nullopt;
  };
  const std::optional<GridCell> start = findStart();
  if (!start) return 0;
  if (CodeAt(*start) != 2) {
    message = "Invalid value found at catchment boundary";
    return 0;
  }
  StartCell = *start;
  std::vector<GridCell> cells{StartCell};
  std::optional<GridCell> second;
  for (const int number : {kEast, kSouthEast, kSouth})
    if (!second && CodeAt(Neighbour(StartCell, number)) == 2) second = Neighbour(StartCell, number);
  if (!second) return 0;
  cells.push_back(*second);

  GridCell previous = StartCell, current = *second;
  const std::size_t most = Geometry().CellCount();
  for (std::size_t count = 1;; ++count) {
    // From behind the previous cell on, so that the model stays on the right; the previous cell comes last.
    const int back = NumberOf(current, previous);
    std::optional<GridCell> next;
    for (int turn = 2; turn <= 8 && !next; ++turn) {
      const GridCell tried = Neighbour(current, (back + turn - 1) % 8 + 1);
      if (CodeAt(tried) == 2) next = tried;
    }
    if (count > most) {
      message = "Invalid nds2 file for Model Domain.\nCheck for and remove disconnected outer boundary cells";
      return 0;
    }
    if (!next) return 0;
    previous = current;
    current = *next;
    if (current == StartCell) break;
    cells.push_back(current);
  }
  BoundaryCells = std::move(cells);
  BoundaryIndex.assign(most, 0);
  for (std::size_t place = 0; place < BoundaryCells.size(); ++place)
    BoundaryIndex[IndexOf(BoundaryCells[place])] = static_cast<int>(place) + 1;
  OriginalCells = Values();
  OriginalDeleteValue = DeleteValue();
  SetDeleteValue(kOutside);
  return 1;
}

GridCell CGeoDataBoundCondCatchmentData::NearestBoundaryCell(double x, double y) const {
  double i = 0, j = 0;
  GetCellCoordFromXYWorldCoord(x, y, i, j);
  GridCell nearest;
  double smallest = std::numeric_limits<double>::infinity();
  for (const GridCell cell : BoundaryCells) {
    const double di = cell.i + 0.5 - i, dj = cell.j + 0.5 - j;
    if (const double distance = di * di + dj * dj; distance < smallest) {
      smallest = distance;
      nearest = cell;
    }
  }
  return nearest;
}

int CGeoDataBoundCondCatchmentData::GetBoundaryIndex(GridCell cell) const {
  if (BoundaryIndex.empty()) return -1;
  const bool isOnGrid = cell.i >= 0 && cell.j >= 0 && cell.i < Geometry().nx && cell.j < Geometry().ny;
  return isOnGrid ? BoundaryIndex[IndexOf(cell)] : 0;
}

std::vector<std::size_t> CGeoDataBoundCondCatchmentData::BoundaryOrder(const std::vector<BoundaryItem>& items) const {
  std::vector<std::size_t> order(items.size());
  std::iota(order.begin(), order.end(), std::size_t{0});
  if (BoundaryIndex.empty() ||
      !std::ranges::all_of(items, [](const BoundaryItem& item) { return item.point.has_value(); }))
    return order;
  std::vector<int> places;
  for (const BoundaryItem& item : items)
    places.push_back(GetBoundaryIndex(NearestBoundaryCell(item.point->x, item.point->y)));
  std::ranges::stable_sort(order, {}, [&](std::size_t item) { return places[item]; });
  return order;
}

void CGeoDataBoundCondCatchmentData::Paint(const std::vector<BoundaryItem>& items, bool byNumber) {
  if (BoundaryIndex.empty()) return;
  float* cells = GetData();
  for (std::size_t place = 0; place < OriginalCells.size(); ++place) {
    const float original = OriginalCells[place];
    const bool isEmpty = original == OriginalDeleteValue || std::isnan(original);
    cells[place] = isEmpty ? kOutside : std::floor(original + 0.5F) == 2.0F ? kUnpaintedBoundary : kInside;
  }
  BoundaryPoints.clear();
  const auto paint = [&](std::size_t from, std::size_t to, float value) {
    for (std::size_t place = from; place < to; ++place) cells[IndexOf(BoundaryCells[place])] = value;
  };
  const auto valueOf = [&](std::size_t item) {
    return byNumber ? static_cast<float>(item + 1) : static_cast<float>(items[item].type);
  };
  if (items.size() == 1) paint(0, BoundaryCells.size(), valueOf(0));
  for (std::size_t item = 0; items.size() > 1 && item < items.size(); ++item) {
    const auto& from = items[item].point;
    const auto& to = items[(item + 1) % items.size()].point;
    if (!from || !to) return;
    BoundaryPoints.push_back(*from);
    const auto p = static_cast<std::size_t>(GetBoundaryIndex(NearestBoundaryCell(from->x, from->y)) - 1);
    const auto q = static_cast<std::size_t>(GetBoundaryIndex(NearestBoundaryCell(to->x, to->y)) - 1);
    if (p < q) {
      paint(p, q, valueOf(item));
    } else if (p > q) {
      paint(p, BoundaryCells.size(), valueOf(item));
      paint(0, q, valueOf(item));
    }
  }
}

}  // namespace tervane
