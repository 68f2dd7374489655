// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "forms/plots.h"

#include <algorithm>
#include <bit>
#include <cstdint>

#include <fmt/format.h>
#include <fmt/ranges.h>

namespace tervane {

bool LooksSame(const MapContent& a, const MapContent& b) {
  return a.grids == b.grids && a.shapes == b.shapes && a.points == b.points && a.area == b.area &&
         a.message == b.message;
}

namespace {

bool LooksSame(const Series& a, const Series& b) {
  // By their bits, since a gap, which is no number, equals nothing.
  const auto sameBits = [](double x, double y) {
    return std::bit_cast<std::uint64_t>(x) == std::bit_cast<std::uint64_t>(y);
  };
  return a.name == b.name && a.unit == b.unit && a.isStepped == b.isStepped && a.times == b.times &&
         std::ranges::equal(a.values, b.values, sameBits);
}

}  // namespace

bool LooksSame(const SeriesContent& a, const SeriesContent& b) {
  return a.period == b.period && a.message == b.message &&
         std::ranges::equal(a.series, b.series, [](const Series& x, const Series& y) { return LooksSame(x, y); });
}

std::string Summary(const MapContent& content) {
  if (content.IsEmpty()) return content.message;
  std::vector<std::string> parts;
  for (const GridLayer& layer : content.grids)
    parts.push_back(fmt::format("grid {}x{}", layer.grid->Geometry().nx, layer.grid->Geometry().ny));
  std::size_t shapes = 0, points = 0;
  for (const ShapeLayer& layer : content.shapes) shapes += layer.shapes->GetData().size();
  for (const PointLayer& layer : content.points) points += layer.points.size();
  if (!content.shapes.empty()) parts.push_back(fmt::format("{} shapes", shapes));
  if (!content.points.empty()) parts.push_back(fmt::format("{} points", points));
  return fmt::format("{}", fmt::join(parts, ", "));
}

std::string Summary(const SeriesContent& content) {
  if (content.IsEmpty()) return content.message;
  std::size_t values = 0;
  for (const Series& series : content.series) values += series.values.size();
  return fmt::format("{} series, {} values", content.series.size(), values);
}

}  // namespace tervane
