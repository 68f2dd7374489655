// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/ring_faults.h"

#include <algorithm>
#include <optional>
#include <span>

#include <fmt/format.h>

#include "platform/text.h"

namespace tervane {

namespace {

/// Pairs of edges that are looked at, over all rings; some 0.1 s.
constexpr std::size_t kMostPairs = 20'000'000;

struct RingEdge {
  MapPoint from, to;

  double Left() const { return std::min(from.x, to.x); }
  double Right() const { return std::max(from.x, to.x); }
};

/// Positive when the point lies left of the line from a to b.
double Side(MapPoint a, MapPoint b, MapPoint point) {
  return (b.x - a.x) * (point.y - a.y) - (b.y - a.y) * (point.x - a.x);
}

/// Where the insides of two edges cross; touching ends are no crossing.
std::optional<MapPoint> Crossing(const RingEdge& a, const RingEdge& b) {
  const double b1 = Side(a.from, a.to, b.from), b2 = Side(a.from, a.to, b.to);
  const double a1 = Side(b.from, b.to, a.from), a2 = Side(b.from, b.to, a.to);
  if (!(b1 * b2 < 0 && a1 * a2 < 0)) return std::nullopt;
  const double share = a1 / (a1 - a2);
  return MapPoint{a.from.x + share * (a.to.x - a.from.x), a.from.y + share * (a.to.y - a.from.y)};
}

/// Goes through the edges from west to east, each against those that reach as far.
std::optional<MapPoint> FirstCrossing(std::span<const MapPoint> ring, std::size_t& pairs) {
  if (pairs > kMostPairs) return std::nullopt;
  std::vector<RingEdge> edges;
  for (std::size_t i = 0; i + 1 < ring.size(); ++i)
    if (!(ring[i] == ring[i + 1])) edges.push_back({ring[i], ring[i + 1]});
  std::ranges::sort(edges, {}, &RingEdge::Left);
  std::vector<const RingEdge*> reaching;
  for (const RingEdge& edge : edges) {
    std::erase_if(reaching, [&](const RingEdge* other) { return other->Right() < edge.Left(); });
    pairs += reaching.size();
    if (pairs > kMostPairs) return std::nullopt;
    for (const RingEdge* other : reaching)
      if (const auto crossing = Crossing(edge, *other)) return crossing;
    reaching.push_back(&edge);
  }
  return std::nullopt;
}

}  // namespace

std::string FirstRingFault(const std::vector<Shape>& polygons) {
  std::size_t pairs = 0;
  for (std::size_t k = 0; k < polygons.size(); ++k) {
    const Shape& shape = polygons[k];
    for (std::size_t part = 0; part < shape.parts.size(); ++part) {
      const auto ring = std::span(shape.points).subspan(shape.parts[part], shape.PartEnd(part) - shape.parts[part]);
      if (ring.size() < 4) return fmt::format("shape {}: ring {} has no area", k + 1, part + 1);
      if (!(ring.front() == ring.back())) return fmt::format("shape {}: ring {} is not closed", k + 1, part + 1);
      if (const auto place = FirstCrossing(ring, pairs))
        return fmt::format("shape {}: ring {} crosses itself near {}, {}", k + 1, part + 1,
                           ShortestNumber(static_cast<float>(place->x)), ShortestNumber(static_cast<float>(place->y)));
    }
  }
  return {};
}

}  // namespace tervane
