// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/ground_layers.h"

#include "core/list.h"
#include "subsurface/ground_properties.h"
#include "subsurface/saturated_zone.h"

namespace tervane {

namespace {

std::vector<GroundBody> BodiesOf(const CSatZoneKvf& zone, std::string_view listSection) {
  std::vector<GroundBody> bodies;
  for (CYbSEKvfBase* child = zone.GetFirstChild(); child; child = zone.GetNextChild(child)) {
    const auto* list = dynamic_cast<const CYbSEKvfListBaseInterface*>(child);
    if (!list || child->GetSectionName() != listSection) continue;
    for (int number = 1; number <= list->GetItemCount(); ++number) {
      CYbSEKvfBase* item = list->GetItemNode(number);
      bodies.push_back({.name = item->GetAbbreviatedTitle(),
                        .node = item,
                        .extent = PropertyOf(*item, "HorBoundary"),
                        .top = PropertyOf(*item, "UpperLevel"),
                        .bottom = PropertyOf(*item, "LowerLevel"),
                        .head = PropertyOf(*item, "InitPotHead")});
    }
  }
  return bodies;
}

}  // namespace

std::vector<GroundBody> GeologicalLayersOf(const CSatZoneKvf& zone) { return BodiesOf(zone, "GeoLayersSZ"); }

std::vector<GroundBody> GeologicalLensesOf(const CSatZoneKvf& zone) { return BodiesOf(zone, "GeoLensesSZ"); }

std::vector<GroundBody> ComputationalLayersOf(const CSatZoneKvf& zone) {
  switch (zone.TypeOfVerDiscr) {
    case CSatZoneKvf::kAsGeology:
      return BodiesOf(zone, "CompLayersGeoSZ");
    case CSatZoneKvf::kExplicitLevels:
      return BodiesOf(zone, "CompLayersSZ");
    default:
      return {};
  }
}

}  // namespace tervane
