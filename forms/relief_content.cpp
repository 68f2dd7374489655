// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "forms/relief_content.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <utility>

#include "forms/section_profile.h"
#include "platform/units.h"

namespace tervane {

namespace {

constexpr int kMetre = 1000;

std::vector<SectionPoint> CentresOfRaster(const GridGeometry& raster) {
  const GridTransform transform(raster);
  std::vector<SectionPoint> centres;
  centres.reserve(raster.CellCount());
  for (int row = 0; row < raster.ny; ++row)
    for (int column = 0; column < raster.nx; ++column)
      centres.push_back({0, transform.ToWorld({column + 0.5, row + 0.5})});
  return centres;
}

std::vector<float> Floats(const std::vector<double>& heights) { return {heights.begin(), heights.end()}; }

bool HasNumbers(const std::vector<float>& heights) {
  return std::ranges::any_of(heights, [](float height) { return !std::isnan(height); });
}

/// The grid of the first level that has one.
const CTvn2DOrthoRotatedGridData* FirstGrid(const SectionContent& section) {
  if (section.ground && section.ground->grid) return section.ground->grid.get();
  for (const SectionSurface& surface : section.surfaces)
    if (surface.bottom.grid) return surface.bottom.grid.get();
  for (const SectionCurve& curve : section.curves)
    if (curve.level.grid) return curve.level.grid.get();
  return nullptr;
}

}  // namespace

GridGeometry ReliefRaster(GridGeometry grid) {
  const int every = (std::max(grid.nx, grid.ny) + kMostReliefCells - 1) / kMostReliefCells;
  if (every <= 1) return grid;
  grid.nx = (grid.nx + every - 1) / every;
  grid.ny = (grid.ny + every - 1) / every;
  grid.cellSize *= every;
  return grid;
}

std::string ReliefOf(const SectionContent& section, Relief& relief) {
  if (!section.ground) return "The ground is not known.";
  const CTvn2DOrthoRotatedGridData* grid = FirstGrid(section);
  if (!grid || grid->Geometry().CellCount() == 0) return "All levels are the same everywhere.";
  relief = {};
  relief.raster = ReliefRaster(grid->Geometry());
  const SectionProfile profile = ProfileAt(section, CentresOfRaster(relief.raster));
  relief.bodies.push_back({.name = "Ground", .top = Floats(profile.ground), .color = 0});
  if (!HasNumbers(relief.bodies.front().top)) return "The ground has no elevations here.";
  // Layers show where they come to the surface, unless something is laid over the ground.
  relief.bodies.front().isShown = profile.bands.empty();
  for (std::size_t i = 0; i < profile.bands.size(); ++i) {
    const SectionProfile::Band& band = profile.bands[i];
    relief.bodies.push_back({.name = band.name,
                             .top = Floats(band.top),
                             .bottom = Floats(band.bottom),
                             .color = section.surfaces[i].color ? 0xff000000U | *section.surfaces[i].color : 0});
  }
  for (const SectionProfile::Lens& lens : profile.lenses)
    relief.bodies.push_back({.name = lens.name, .top = Floats(lens.top), .bottom = Floats(lens.bottom), .color = 0});
  for (const SectionProfile::Curve& curve : profile.curves)
    relief.bodies.push_back({.name = curve.name, .top = Floats(curve.heights), .color = 0, .isShown = false});
  for (const SectionScreen& screen : section.screens)
    relief.wells.push_back({screen.name, screen.place, screen.top, screen.bottom});
  return {};
}

std::string ReliefOfValues(const CTvn2DOrthoRotatedGridData& values, Relief& relief) {
  if (values.Geometry().CellCount() == 0) return "There is no area to show.";
  relief = {};
  relief.raster = ReliefRaster(values.Geometry());
  ReliefBody surface{.name = values.ItemName(), .top = {}, .color = 0};
  const std::vector<SectionPoint> centres = CentresOfRaster(relief.raster);
  const Unit* unit = FindUnit(values.ItemUnit());
  if (unit && ConversionBetween(unit->scale, FindUnit(kMetre)->scale)) {
    const std::vector<double> noGround(centres.size(), std::numeric_limits<double>::quiet_NaN());
    const Level level{std::shared_ptr<const CTvn2DOrthoRotatedGridData>(std::shared_ptr<void>(), &values)};
    surface.top = Floats(ElevationsAlong(level, centres, noGround, GridSampling::Nearest));
  } else {
    surface.top = Floats(ValuesAlong(values, centres, GridSampling::Nearest));
    relief.unit = unit ? std::string(unit->abbreviation) : std::string();
  }
  if (!HasNumbers(surface.top)) return "Nothing here has a height.";
  relief.bodies.push_back(std::move(surface));
  return {};
}

ReliefSource ReliefOf(std::function<SectionContent()> section,
                      std::shared_ptr<const CTvn2DOrthoRotatedGridData> values) {
  struct Sampled {
    SectionContent section;
    std::shared_ptr<Computed<Relief>> relief;
  };
  return [section = std::move(section), values = std::move(values),
          sampled = std::make_shared<Sampled>()]() -> ReliefContent {
    SectionContent now = section();
    if (!now.awaited.empty()) return {nullptr, {}, std::move(now.awaited)};
    if (!sampled->relief || !LooksSame(now, sampled->section)) {
      sampled->section = std::move(now);
      sampled->relief = std::make_shared<Computed<Relief>>(
          "Sampling the ground", [content = sampled->section, values](Relief& relief, ProgressPart) -> FileResult {
            std::string problem = ReliefOf(content, relief);
            if (!problem.empty() && values) problem = ReliefOfValues(*values, relief);
            return {std::move(problem), {}};
          });
    }
    if (!sampled->relief->IsDone()) return {nullptr, {}, {sampled->relief}};
    return {sampled->relief->Result(), sampled->relief->Problem()};
  };
}

}  // namespace tervane
