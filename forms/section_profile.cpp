// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "forms/section_profile.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <utility>

#include "platform/text.h"

namespace tervane {

namespace {

constexpr double kNone = std::numeric_limits<double>::quiet_NaN();

SectionProfile::Lens LensAlong(const SectionLens& lens, const SectionProfile& profile) {
  SectionProfile::Lens shown{lens.name, ElevationsAlong(lens.top, profile.points, profile.ground),
                             ElevationsAlong(lens.bottom, profile.points, profile.ground)};
  std::vector<double> extent;
  if (lens.extent) extent = ValuesAlong(*lens.extent, profile.points, GridSampling::Nearest);
  for (std::size_t i = 0; i < shown.top.size(); ++i) {
    const bool isThere = extent.empty() || (!std::isnan(extent[i]) && extent[i] != 0);
    if (!isThere || !(shown.top[i] > shown.bottom[i])) shown.top[i] = shown.bottom[i] = kNone;
  }
  return shown;
}

/// The screens that lie within reach of the line.
std::vector<SectionProfile::Screen> ScreensAlong(const SectionContent& content) {
  std::vector<SectionProfile::Screen> shown;
  for (const SectionScreen& screen : content.screens) {
    double nearest = content.screenReach, at = kNone, before = 0;
    for (std::size_t i = 1; i < content.line.size(); ++i) {
      const MapPoint from = content.line[i - 1], to = content.line[i];
      const double dx = to.x - from.x, dy = to.y - from.y, length = std::hypot(dx, dy);
      if (!(length > 0)) continue;
      const double along = ((screen.place.x - from.x) * dx + (screen.place.y - from.y) * dy) / (length * length);
      const double part = std::clamp(along, 0.0, 1.0);
      const double away = std::hypot(from.x + part * dx - screen.place.x, from.y + part * dy - screen.place.y);
      if (away <= nearest) {
        nearest = away;
        at = before + part * length;
      }
      before += length;
    }
    if (!std::isnan(at)) shown.push_back({screen.name, at, screen.top, screen.bottom});
  }
  std::ranges::stable_sort(shown, {}, &SectionProfile::Screen::distance);
  return shown;
}

}  // namespace

SectionProfile ProfileAt(const SectionContent& content, std::vector<SectionPoint> points) {
  SectionProfile profile;
  if (!content.ground) return profile;
  profile.points = std::move(points);
  profile.ground = ElevationsAlong(*content.ground, profile.points, std::vector<double>(profile.points.size(), kNone));
  std::vector<double> above = profile.ground;
  for (const SectionSurface& surface : content.surfaces) {
    SectionProfile::Band band{surface.name, above, ElevationsAlong(surface.bottom, profile.points, profile.ground)};
    band.crossing = band.thin = std::vector<double>(above.size(), kNone);
    for (std::size_t i = 0; i < above.size(); ++i) {
      if (std::isnan(band.bottom[i])) continue;
      if (!std::isnan(above[i])) {
        const bool isCrossing = band.bottom[i] > above[i];
        band.bottom[i] = std::min(band.bottom[i], above[i]);
        if (isCrossing)
          band.crossing[i] = band.bottom[i];
        else if (above[i] - band.bottom[i] < content.minimumThickness)
          band.thin[i] = band.bottom[i];
      }
      above[i] = band.bottom[i];
    }
    profile.bands.push_back(std::move(band));
  }
  for (const SectionLens& lens : content.lenses) profile.lenses.push_back(LensAlong(lens, profile));
  for (const SectionCurve& curve : content.curves)
    profile.curves.push_back(
        {curve.name, ElevationsAlong(curve.level, profile.points, profile.ground,
                                     curve.isStepped ? GridSampling::Nearest : GridSampling::Bilinear)});
  return profile;
}

SectionProfile ProfileOf(const SectionContent& content, double step) {
  if (content.IsEmpty()) return {};
  SectionProfile profile = ProfileAt(content, PointsAlong(content.line, step));
  profile.screens = ScreensAlong(content);
  return profile;
}

std::vector<std::vector<std::string>> SectionRows(const SectionProfile& profile) {
  std::vector<std::string> heads{"Distance [m]", "X", "Y", "Ground [m]"};
  std::vector<const std::vector<double>*> columns{&profile.ground};
  const auto add = [&](const std::string& head, const std::vector<double>& values) {
    heads.push_back(head + " [m]");
    columns.push_back(&values);
  };
  for (const SectionProfile::Band& band : profile.bands) add(band.name + ", bottom", band.bottom);
  for (const SectionProfile::Lens& lens : profile.lenses) {
    add(lens.name + ", top", lens.top);
    add(lens.name + ", bottom", lens.bottom);
  }
  for (const SectionProfile::Curve& curve : profile.curves) add(curve.name, curve.heights);
  std::vector<std::vector<std::string>> rows{std::move(heads)};
  const auto number = [](double value) { return std::isnan(value) ? std::string() : FormatNumber(value, "%.10g"); };
  for (std::size_t i = 0; i < profile.points.size(); ++i) {
    const SectionPoint& point = profile.points[i];
    auto& row = rows.emplace_back(
        std::vector<std::string>{number(point.distance), number(point.place.x), number(point.place.y)});
    for (const auto* column : columns) row.push_back(number((*column)[i]));
  }
  return rows;
}

double StepFor(const SectionContent& content) {
  constexpr double kMostPoints = 4000, kPointsInCell = 4, kLeastCells = 50;
  const double length = LengthOf(content.line);
  double cell = length / kLeastCells;
  const auto look = [&cell](const Level& level) {
    if (level.grid) cell = std::min(cell, level.grid->Geometry().cellSize);
  };
  if (content.ground) look(*content.ground);
  for (const SectionSurface& surface : content.surfaces) look(surface.bottom);
  for (const SectionLens& lens : content.lenses) look(lens.top), look(lens.bottom);
  for (const SectionCurve& curve : content.curves) look(curve.level);
  return std::max({length / kMostPoints, cell / kPointsInCell, std::numeric_limits<double>::min()});
}

std::optional<std::pair<double, double>> SectionProfile::Range(double from, double to) const {
  std::optional<std::pair<double, double>> range;
  const auto add = [&](const std::vector<double>& values) {
    for (std::size_t i = 0; i < points.size(); ++i) {
      if (std::isnan(values[i]) || points[i].distance < from || points[i].distance > to) continue;
      if (!range) range = {values[i], values[i]};
      range = {std::min(range->first, values[i]), std::max(range->second, values[i])};
    }
  };
  add(ground);
  for (const Band& band : bands) add(band.bottom);
  for (const Lens& lens : lenses) add(lens.top), add(lens.bottom);
  for (const Curve& curve : curves) add(curve.heights);
  for (const Screen& screen : screens)
    if (range && screen.distance >= from && screen.distance <= to)
      range = {std::min(range->first, screen.bottom), std::max(range->second, screen.top)};
  return range;
}

}  // namespace tervane
