// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What is selected of a grid, and what is done to the selection.
#include <algorithm>
#include <cmath>
#include <limits>
#include <new>

#include <fmt/format.h>

#include "edits/cell_figures.h"
#include "edits/grid_edit.h"
#include "platform/text.h"

namespace tervane {

// ---- The selection

void GridEdit::SelectNothing() {
  selection_ = Cells();
  hasSelection_ = false;
}

void GridEdit::Select(const CellSet& cells, SelectionMode mode) {
  switch (mode) {
    case SelectionMode::Replace:
      selection_ = cells;
      break;
    case SelectionMode::Add:
      selection_.AddAll(cells);
      break;
    case SelectionMode::Remove:
      selection_.RemoveAll(cells);
      break;
    case SelectionMode::Keep:
      selection_.KeepAll(cells);
      break;
  }
  hasSelection_ = !selection_.IsEmpty();
}

void GridEdit::SelectPolygon(const std::vector<MapPoint>& corners, SelectionMode mode) {
  CellSet cells = Cells();
  const auto nx = static_cast<std::size_t>(grid_->Geometry().nx);
  CellsWithin(grid_->Geometry(), corners, [&](int j, int begin, int end) {
    for (int i = begin; i < end; ++i) cells.Add(static_cast<std::size_t>(j) * nx + static_cast<std::size_t>(i));
  });
  Select(cells, mode);
}

void GridEdit::SelectRectangle(MapPoint one, MapPoint other, SelectionMode mode) {
  const GridGeometry& geometry = grid_->Geometry();
  const GridTransform transform(geometry);
  const MapPoint a = transform.ToCells(one), b = transform.ToCells(other);
  const auto within = [](double place, int count) {
    return static_cast<int>(std::clamp(std::floor(place), -1.0, static_cast<double>(count)));
  };
  CellSet cells = Cells();
  const int left = std::max(within(std::min(a.x, b.x), geometry.nx), 0);
  const int right = std::min(within(std::max(a.x, b.x), geometry.nx), geometry.nx - 1);
  const int top = std::min(within(std::max(a.y, b.y), geometry.ny), geometry.ny - 1);
  for (int j = std::max(within(std::min(a.y, b.y), geometry.ny), 0); j <= top; ++j)
    for (int i = left; i <= right; ++i)
      cells.Add(static_cast<std::size_t>(j) * static_cast<std::size_t>(geometry.nx) + static_cast<std::size_t>(i));
  Select(cells, mode);
}

void GridEdit::SelectRange(double from, double to, SelectionMode mode) {
  CellSet cells = Cells();
  const std::vector<float>& values = grid_->Values();
  for (std::size_t cell = 0; cell < values.size(); ++cell) {
    const auto value = static_cast<double>(values[cell]);
    if (values[cell] != kDeleteValue && value >= from && value <= to) cells.Add(cell);
  }
  Select(cells, mode);
}

void GridEdit::SelectMissing(SelectionMode mode) {
  CellSet cells = Cells();
  const std::vector<float>& values = grid_->Values();
  for (std::size_t cell = 0; cell < values.size(); ++cell)
    if (values[cell] == kDeleteValue) cells.Add(cell);
  Select(cells, mode);
}

std::optional<CellWindow> GridEdit::SelectedWindow() const {
  std::optional<CellWindow> window;
  const auto nx = static_cast<std::size_t>(grid_->Geometry().nx);
  if (hasSelection_)
    selection_.ForEach([&](std::size_t cell) {
      const int i = static_cast<int>(cell % nx), j = static_cast<int>(cell / nx);
      // Rows ascend.
      if (!window) window = {i, j, 1, 1};
      const int right = std::max(window->i + window->nx, i + 1);
      window->i = std::min(window->i, i);
      window->nx = right - window->i;
      window->ny = j + 1 - window->j;
    });
  return window;
}

template <class NewValue>
std::string GridEdit::ChangeSelection(const std::string& name, const NewValue& newValue) {
  CellRuns runs;
  std::string why;
  const std::vector<float>& values = grid_->Values();
  const auto look = [&](std::size_t cell) {
    if (!why.empty()) return;
    const float old = values[cell];
    const std::optional<double> wanted = newValue(old);
    if (!wanted) return;
    const bool isDeleted = *wanted == static_cast<double>(kDeleteValue);
    const auto made = isDeleted ? kDeleteValue : static_cast<float>(*wanted);
    if (made == old) return;
    if (!isDeleted)
      if (std::string reason = WhyNotValue(*wanted); !reason.empty())
        why = fmt::format("{} would become {}: {}", ShortestNumber(static_cast<double>(old)), ShortestNumber(*wanted),
                          reason);
    runs.Add(cell, made);
  };
  try {
    if (hasSelection_)
      selection_.ForEach(look);
    else
      for (std::size_t cell = 0; cell < values.size(); ++cell) look(cell);
  } catch (const std::bad_alloc&) {
    return "it needs more than the free memory";
  }
  if (why.empty()) Change(name, std::move(runs));
  return why;
}

std::string GridEdit::Apply(CellOperation operation, double operand) {
  if (std::string why = WhyNot(kDeleteValue); !why.empty()) return why;
  if (!std::isfinite(operand)) return "a number was expected";
  if (operation == CellOperation::Divide && operand == 0) return "0 divides nothing";
  constexpr const char* kNames[] = {"Set Values",     "Add",           "Subtract", "Multiply", "Divide",
                                    "Raise to Limit", "Lower to Limit"};
  return ChangeSelection(kNames[static_cast<std::size_t>(operation)], [&](float old) -> std::optional<double> {
    if (operation == CellOperation::Set) return operand;
    if (old == kDeleteValue) return std::nullopt;
    const auto value = static_cast<double>(old);
    switch (operation) {
      case CellOperation::Add:
        return value + operand;
      case CellOperation::Subtract:
        return value - operand;
      case CellOperation::Multiply:
        return value * operand;
      case CellOperation::Divide:
        return value / operand;
      case CellOperation::AtLeast:
        return std::max(value, operand);
      default:
        return std::min(value, operand);
    }
  });
}

std::string GridEdit::Replace(float value, float by) {
  if (std::string why = WhyNot(by); !why.empty()) return why;
  return ChangeSelection("Replace Values", [&](float old) -> std::optional<double> {
    return old == value ? std::optional(static_cast<double>(by)) : std::nullopt;
  });
}

std::string GridEdit::DeleteValues() {
  if (std::string why = WhyNot(kDeleteValue); !why.empty()) return why;
  return ChangeSelection("Delete Values", [](float) { return std::optional(static_cast<double>(kDeleteValue)); });
}

SelectionStatistics GridEdit::Statistics() const {
  SelectionStatistics found;
  constexpr double kInfinity = std::numeric_limits<double>::infinity();
  double smallest = kInfinity, largest = -kInfinity, mean = 0, squares = 0;
  const std::vector<float>& values = grid_->Values();
  const auto look = [&](std::size_t cell) {
    if (values[cell] == kDeleteValue) {
      ++found.missing;
      return;
    }
    const auto value = static_cast<double>(values[cell]);
    smallest = std::min(smallest, value);
    largest = std::max(largest, value);
    found.sum += value;
    // Welford's, which loses nothing where values are large and close to each other.
    const double before = value - mean;
    mean += before / static_cast<double>(++found.count);
    squares += before * (value - mean);
  };
  if (hasSelection_)
    selection_.ForEach(look);
  else
    for (std::size_t cell = 0; cell < values.size(); ++cell) look(cell);
  constexpr double kNone = std::numeric_limits<double>::quiet_NaN();
  const auto count = static_cast<double>(found.count);
  found.smallest = found.count > 0 ? smallest : kNone;
  found.largest = found.count > 0 ? largest : kNone;
  found.mean = found.count > 0 ? mean : kNone;
  found.deviation = found.count > 0 ? std::sqrt(squares / count) : kNone;
  const FileGeometry& geometry = ItemFacts().geometry;
  if (geometry.IsPlaced() && !geometry.isGeographical) found.area = count * geometry.cellSize * geometry.cellHeight;
  return found;
}

}  // namespace tervane
