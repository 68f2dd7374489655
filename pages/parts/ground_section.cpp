// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/ground_section.h"

#include <algorithm>

#include <fmt/format.h>

#include "pages/parts/ground_level.h"
#include "spatial/domain.h"
#include "subsurface/ground_layers.h"
#include "subsurface/saturated_zone.h"
#include "subsurface/wells.h"

namespace tervane {

CTvnWellDataList WellsOf(const CSatZoneKvf& zone) {
  const auto* wells = zone.Important(kWells);
  CTvnWellDataList list;
  if (zone.Wells && wells && !wells->Filename.IsEmpty()) list.LoadWellDataFile(wells->Filename.Absolute());
  return list;
}

SectionContent SectionOf(const CSatZoneKvf& zone, GroundSoils& soils) {
  SectionContent section;
  std::string problem;
  const auto take = [&](CData2DKvf* quantity) -> std::optional<Level> {
    return quantity ? LevelOf(*quantity, section.awaited, problem) : std::nullopt;
  };
  section.ground = take(zone.Important(kTopography));
  for (const GroundBody& layer : GeologicalLayersOf(zone))
    if (const auto bottom = take(layer.bottom)) section.surfaces.push_back({layer.name, *bottom});
  for (const GroundBody& lense : GeologicalLensesOf(zone)) {
    const auto top = take(lense.top), bottom = take(lense.bottom), extent = take(lense.extent);
    const bool isEverywhere = extent && !extent->grid && double{extent->value} != 0;
    if (top && bottom && extent && (extent->grid || isEverywhere))
      section.lenses.push_back({lense.name, *top, *bottom, extent->grid});
  }
  for (const GroundBody& layer : ComputationalLayersOf(zone)) {
    if (const auto bottom = take(layer.bottom))
      section.curves.push_back({fmt::format("Bottom of {}", layer.name), *bottom, true});
    if (const auto head = take(layer.head)) {
      // Heads that are the same in all layers are one line.
      const bool isNew = std::ranges::none_of(section.curves, [&](const auto& curve) { return curve.level == *head; });
      if (isNew) section.curves.push_back({fmt::format("Initial head in {}", layer.name), *head});
    }
  }
  if (auto bottom = soils.Bottom(section.awaited)) section.curves.push_back(*std::move(bottom));
  const CTvnWellDataList wells = WellsOf(zone);
  for (const CTvnWellData& well : wells.Wells())
    for (const CTvnWellFilter& filter : well.filters)
      section.screens.push_back({well.name, well.place, filter.top, filter.bottom});
  if (const auto* domain = zone.Important(kDomain)) section.screenReach = domain->GetModelGeometry().cellSize;
  section.minimumThickness = static_cast<double>(zone.MimimumLayerThickness);
  if (section.IsEmpty() && section.awaited.empty() && section.message.empty())
    section.message = problem.empty() ? "The ground or the levels of the layers are not known." : problem;
  return section;
}

}  // namespace tervane
