// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/river_places.h"

#include <algorithm>
#include <cmath>

namespace tervane {

namespace {

MapPoint Between(const RiverPoint& a, const RiverPoint& b, double share) {
  return {a.place.x + share * (b.place.x - a.place.x), a.place.y + share * (b.place.y - a.place.y)};
}

/// The share of a piece at which it lies nearest to a point.
double NearestShare(const RiverPoint& a, const RiverPoint& b, const MapPoint& point) {
  const double dx = b.place.x - a.place.x, dy = b.place.y - a.place.y;
  const double length = dx * dx + dy * dy;
  if (length == 0) return 0;
  return std::clamp(((point.x - a.place.x) * dx + (point.y - a.place.y) * dy) / length, 0.0, 1.0);
}

}  // namespace

RiverPlace NearestPlace(const CYbSimpleRiverData& network, const MapPoint& point, std::string_view branch) {
  RiverPlace nearest;
  for (const RiverBranch& candidate : network.branches) {
    if (!branch.empty() && candidate.name != branch) continue;
    for (std::size_t i = 1; i < candidate.points.size(); ++i) {
      const RiverPoint &a = candidate.points[i - 1], &b = candidate.points[i];
      const double share = NearestShare(a, b, point);
      const MapPoint place = Between(a, b, share);
      const double distance = std::hypot(place.x - point.x, place.y - point.y);
      if (nearest.branch && distance >= nearest.distance) continue;
      nearest = {&candidate, a.chainage + share * (b.chainage - a.chainage), distance};
    }
  }
  return nearest;
}

std::vector<MapPoint> CourseBetween(const RiverBranch& branch, double from, double to) {
  const auto [least, most] = std::minmax(from, to);
  std::vector<MapPoint> course;
  for (std::size_t i = 1; i < branch.points.size(); ++i) {
    const RiverPoint &a = branch.points[i - 1], &b = branch.points[i];
    const double length = b.chainage - a.chainage;
    if (length <= 0) continue;
    const double first = std::max((least - a.chainage) / length, 0.0);
    const double last = std::min((most - a.chainage) / length, 1.0);
    if (first > last) continue;
    if (course.empty()) course.push_back(Between(a, b, first));
    course.push_back(Between(a, b, last));
  }
  if (from > to) std::ranges::reverse(course);
  return course;
}

}  // namespace tervane
