// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/grid.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <limits>
#include <new>
#include <numbers>
#include <unordered_set>

#include <fmt/format.h>

namespace tervane {
namespace {

/// Codes below this are found with a byte for each; it is small enough for the second cache of a processor.
constexpr unsigned kMappedCodes = 1u << 16;

int AsInt(double value) {
  constexpr double kLeast = std::numeric_limits<int>::min(), kMost = std::numeric_limits<int>::max();
  return static_cast<int>(std::clamp(std::floor(value + 0.5), kLeast, kMost));
}

}  // namespace

std::string GridGeometry::Problem() const {
  if (nx <= 0 || ny <= 0) return fmt::format("a grid needs columns and rows, not {} by {}", nx, ny);
  if (CellCount() > kMostCells) {
    return fmt::format("{} by {} cells are more than the {} million that a grid may have", nx, ny,
                       kMostCells / 1'000'000);
  }
  if (!(cellSize > 0) || !std::isfinite(cellSize)) return fmt::format("the cell size is {}, not above 0", cellSize);
  if (!std::isfinite(x0) || !std::isfinite(y0)) return fmt::format("the origin is ({}, {})", x0, y0);
  if (!std::isfinite(rotation)) return fmt::format("the rotation is {}", rotation);
  const Envelope envelope = EnvelopeOf(*this);
  for (const double side : {envelope.xMin, envelope.yMin, envelope.xMax, envelope.yMax}) {
    if (!std::isfinite(side)) return "the grid is larger than numbers reach";
  }
  return {};
}

GridTransform::GridTransform(const GridGeometry& geometry)
    : x0_(geometry.x0), y0_(geometry.y0), cellSize_(geometry.cellSize) {
  double turn = std::fmod(geometry.rotation, 360.0);
  if (turn < 0) turn += 360;
  // The sine of pi is not zero in floating point.
  constexpr std::array<double, 5> kQuarterCos = {1, 0, -1, 0, 1};
  const double quarters = turn / 90;
  if (quarters == std::floor(quarters)) {
    const auto quarter = static_cast<std::size_t>(quarters);
    cos_ = kQuarterCos[quarter];
    sin_ = quarter % 2 == 0 ? 0 : (quarter == 1 ? 1 : -1);
  } else {
    const double angle = turn / 180 * std::numbers::pi;
    cos_ = std::cos(angle);
    sin_ = std::sin(angle);
  }
}

Envelope EnvelopeOf(const GridGeometry& geometry) {
  const GridTransform transform(geometry);
  const double nx = geometry.nx, ny = geometry.ny;
  Envelope envelope{geometry.x0, geometry.y0, geometry.x0, geometry.y0};
  for (const MapPoint corner : {MapPoint{nx, 0}, MapPoint{0, ny}, MapPoint{nx, ny}}) {
    const MapPoint world = transform.ToWorld(corner);
    envelope.xMin = std::min(envelope.xMin, world.x);
    envelope.yMin = std::min(envelope.yMin, world.y);
    envelope.xMax = std::max(envelope.xMax, world.x);
    envelope.yMax = std::max(envelope.yMax, world.y);
  }
  return envelope;
}

std::string CTvn2DOrthoRotatedGridData::SetGridData(GridGeometry geometry, float value, float deleteValue, int itemUnit,
                                                    int itemType) {
  if (std::string problem = geometry.Problem(); !problem.empty()) return problem;
  try {
    std::vector<float> values(geometry.CellCount(), value);
    return TakeValues(std::move(geometry), std::move(values), deleteValue, itemUnit, itemType);
  } catch (const std::bad_alloc&) {
    return fmt::format("there is no memory for {} by {} cells", geometry.nx, geometry.ny);
  }
}

std::string CTvn2DOrthoRotatedGridData::TakeValues(GridGeometry geometry, std::vector<float> values, float deleteValue,
                                                   int itemUnit, int itemType) {
  if (std::string problem = geometry.Problem(); !problem.empty()) return problem;
  if (values.size() != geometry.CellCount()) {
    return fmt::format("{} values were given for {} by {} cells", values.size(), geometry.nx, geometry.ny);
  }
  geometry_ = std::move(geometry);
  values_ = std::move(values);
  deleteValue_ = deleteValue;
  itemUnit_ = itemUnit;
  itemType_ = itemType;
  return {};
}

void CTvn2DOrthoRotatedGridData::SetDeleteValue(float deleteValue) {
  for (float& value : values_) {
    if (IsEmptyValue(value)) value = deleteValue;
  }
  deleteValue_ = deleteValue;
}

bool CTvn2DOrthoRotatedGridData::GetIntValues(std::vector<unsigned>& values) const {
  // 2^32 is the first number that no code can be.
  constexpr float kTooLarge = 4294967296.0f;
  std::vector<unsigned char> isMapped(kMappedCodes);
  std::unordered_set<unsigned> others;
  float before = std::numeric_limits<float>::quiet_NaN();
  for (const float value : values_) {
    // Codes come in patches, so that most cells repeat their neighbour.
    if (value == before || IsEmptyValue(value)) continue;
    before = value;
    const double rounded = std::floor(static_cast<double>(value) + 0.5);
    if (rounded < 0 || value >= kTooLarge) continue;
    const auto code = static_cast<unsigned>(rounded);
    if (code < kMappedCodes)
      isMapped[code] = 1;
    else
      others.insert(code);
  }
  values.clear();
  for (unsigned code = 0; code < kMappedCodes; ++code) {
    if (isMapped[code]) values.push_back(code);
  }
  const auto mapped = static_cast<std::ptrdiff_t>(values.size());
  values.insert(values.end(), others.begin(), others.end());
  std::sort(values.begin() + mapped, values.end());
  return !values.empty();
}

bool CTvn2DOrthoRotatedGridData::GetMaxMin(float& largest, float& smallest) const {
  bool isAny = false;
  for (const float value : values_) {
    if (IsEmptyValue(value)) continue;
    largest = isAny ? std::max(largest, value) : value;
    smallest = isAny ? std::min(smallest, value) : value;
    isAny = true;
  }
  return isAny;
}

bool CTvn2DOrthoRotatedGridData::GetMaxMin(int& largest, int& smallest) const {
  float most = 0, least = 0;
  if (!GetMaxMin(most, least)) return false;
  largest = AsInt(static_cast<double>(most));
  smallest = AsInt(static_cast<double>(least));
  return true;
}

Envelope CTvn2DOrthoRotatedGridData::GetEnvelope() const { return EnvelopeOf(geometry_); }

void CTvn2DOrthoRotatedGridData::GetCellCoordFromXYWorldCoord(double x, double y, double& i, double& j) const {
  const MapPoint cells = GridTransform(geometry_).ToCells({x, y});
  i = cells.x;
  j = cells.y;
}

MapPoint CTvn2DOrthoRotatedGridData::CellCentre(int i, int j) const {
  return GridTransform(geometry_).ToWorld({i + 0.5, j + 0.5});
}

void CTvn2DOrthoRotatedGridData::GetXYAxisInfo(int* nx, int* ny, double* cellSize) const {
  if (nx) *nx = geometry_.nx;
  if (ny) *ny = geometry_.ny;
  if (cellSize) *cellSize = geometry_.cellSize;
}

}  // namespace tervane
