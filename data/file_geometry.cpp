// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/file_geometry.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstddef>
#include <limits>
#include <numbers>

#include <fmt/format.h>

#include "platform/text.h"

namespace tervane {

namespace {

constexpr double kRadiansPerDegree = std::numbers::pi / 180;

/// Sine and cosine of degrees, exact at right angles.
void SineAndCosine(double degrees, double& sine, double& cosine) {
  const double turns = degrees / 90;
  if (turns == std::trunc(turns)) {
    constexpr double kSines[] = {0, 1, 0, -1};
    const auto quarter = static_cast<std::size_t>(std::fmod(std::fmod(turns, 4) + 4, 4));
    sine = kSines[quarter];
    cosine = kSines[(quarter + 1) % 4];
    return;
  }
  sine = std::sin(degrees * kRadiansPerDegree);
  cosine = std::cos(degrees * kRadiansPerDegree);
}

/// The number with 13 significant digits, so that a length of 50 comes back as 50 behind sines and roots.
double WithoutLastDigits(double value) {
  if (value == 0) return 0;
  const double scale = std::pow(10, 12 - std::floor(std::log10(std::abs(value))));
  return std::round(value * scale) / scale;
}

bool BeginsWithAny(std::string_view text, std::initializer_list<std::string_view> names) {
  const std::string_view name = Trimmed(text.substr(0, text.find_first_of("[(")));
  return std::ranges::any_of(names, [&](std::string_view other) { return EqualIgnoringCase(name, other); });
}

}  // namespace

EvenAxis FindSpacing(std::span<const double> values, bool areSinglePrecision) {
  EvenAxis axis;
  if (values.empty()) return axis;
  axis.first = values.front();
  axis.last = values.back();
  double largest = 0;
  for (const double& value : values) {
    if (!std::isfinite(value)) {
      axis.error = fmt::format("number {} of its values is missing", &value - values.data() + 1);
      return axis;
    }
    largest = std::max(largest, std::abs(value));
  }
  if (values.size() == 1) return axis;
  axis.spacing = (axis.last - axis.first) / static_cast<double>(values.size() - 1);
  const double epsilon = areSinglePrecision ? static_cast<double>(std::numeric_limits<float>::epsilon())
                                            : std::numeric_limits<double>::epsilon();
  const double tolerance = std::max(1e-3 * std::abs(axis.spacing), 2 * largest * epsilon);
  for (std::size_t i = 0; i < values.size(); ++i) {
    const double expected = axis.first + axis.spacing * static_cast<double>(i);
    // A tolerance as large as the step would let any order pass.
    const bool isStep = i == 0 || (values[i] - values[i - 1]) * axis.spacing > 0;
    if (isStep && std::abs(values[i] - expected) <= tolerance) continue;
    axis.error = fmt::format("its values are not equally spaced: number {} is {}, {} was expected", i + 1,
                             ShortestNumber(values[i]), ShortestNumber(WithoutLastDigits(expected)));
    return axis;
  }
  return axis;
}

GeoTransform GeoTransformOf(const FileGeometry& geometry, bool isNorthFirst) {
  double sine = 0, cosine = 1;
  SineAndCosine(geometry.rotation, sine, cosine);
  const double width = geometry.cellSize, height = geometry.cellHeight;
  GeoTransform transform{geometry.x0, width * cosine, -height * sine, geometry.y0, width * sine, height * cosine};
  if (!isNorthFirst) return transform;
  transform[0] += geometry.ny * transform[2];
  transform[3] += geometry.ny * transform[5];
  transform[2] = -transform[2];
  transform[5] = -transform[5];
  return transform;
}

std::string GeoTransformText(const FileGeometry& geometry) {
  std::string text;
  for (const double number : GeoTransformOf(geometry, false))
    text += (text.empty() ? "" : " ") + ShortestNumber(number + 0.0);  // + 0.0: without the sign of a zero
  return text;
}

std::optional<GeoTransform> ParseGeoTransform(std::string_view text) {
  GeoTransform transform;
  for (text = Trimmed(text); !text.empty(); text = Trimmed(text)) {
    double number = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    if (error != std::errc() || !std::isfinite(number)) return std::nullopt;
    text.remove_prefix(static_cast<std::size_t>(end - text.data()));
    transform.push_back(number);
  }
  return transform.size() == 6 ? std::optional(transform) : std::nullopt;
}

bool PlaceByGeoTransform(const GeoTransform& transform, FileGeometry& geometry, bool& isNorthFirst) {
  const double a = transform[1], d = transform[4];
  double b = transform[2], e = transform[5], x0 = transform[0], y0 = transform[3];
  const double width = std::hypot(a, d), height = std::hypot(b, e);
  const double turned = a * e - b * d;
  if (!(std::isfinite(turned) && std::abs(turned) > 0) || std::abs(a * b + d * e) > 1e-6 * width * height) return false;
  isNorthFirst = turned < 0;
  if (isNorthFirst) {
    x0 += geometry.ny * b;
    y0 += geometry.ny * e;
    b = -b;
    e = -e;
  }
  const bool isTurned = b != 0 || d != 0;
  geometry.cellSize = isTurned ? WithoutLastDigits(width) : width;
  geometry.cellHeight = isTurned ? WithoutLastDigits(height) : height;
  geometry.x0 = x0;
  geometry.y0 = y0;
  geometry.rotation = std::round(std::atan2(d, a) / kRadiansPerDegree * 1e9) / 1e9 + 0.0;
  return true;
}

const std::string_view kLocalPlaneWkt =
    R"wkt(ENGCRS["Local plane",EDATUM["Local plane"],CS[Cartesian,2],AXIS["easting (E)",east,ORDER[1]],)wkt"
    R"wkt(AXIS["northing (N)",north,ORDER[2]],LENGTHUNIT["metre",1]])wkt";

bool IsLocalPlane(std::string_view wkt) { return BeginsWithAny(wkt, {"ENGCRS", "ENGINEERINGCRS", "LOCAL_CS"}); }

bool IsGeographicalWkt(std::string_view wkt) { return BeginsWithAny(wkt, {"GEOGCRS", "GEOGRAPHICCRS", "GEOGCS"}); }

std::string ToModelGrid(const FileGeometry& file, GridGeometry& grid) {
  if (!file.HasSquareCells())
    return fmt::format("cells of {} x {}, square ones were expected", ShortestNumber(file.cellSize),
                       ShortestNumber(file.cellHeight));
  grid = {file.nx, file.ny, file.IsPlaced() ? file.cellSize : 1.0, file.x0, file.y0, file.rotation, file.projection};
  return {};
}

FileGeometry FileGeometryOf(const GridGeometry& grid) {
  FileGeometry place;
  place.nx = grid.nx;
  place.ny = grid.ny;
  place.cellSize = place.cellHeight = grid.cellSize;
  place.x0 = grid.x0;
  place.y0 = grid.y0;
  place.rotation = grid.rotation;
  place.projection = grid.projection;
  return place;
}

Envelope EnvelopeOf(const FileGeometry& geometry) {
  // As of a grid of one cell width whose rows are as high as the file's.
  const GridTransform transform({geometry.nx, geometry.ny, 1, geometry.x0, geometry.y0, geometry.rotation, {}});
  const double width = geometry.nx * geometry.cellSize, height = geometry.ny * geometry.cellHeight;
  Envelope box{geometry.x0, geometry.y0, geometry.x0, geometry.y0};
  for (const MapPoint corner : {MapPoint{width, 0}, MapPoint{0, height}, MapPoint{width, height}}) {
    const MapPoint at = transform.ToWorld(corner);
    box = {std::min(box.xMin, at.x), std::min(box.yMin, at.y), std::max(box.xMax, at.x), std::max(box.yMax, at.y)};
  }
  return box;
}

}  // namespace tervane
