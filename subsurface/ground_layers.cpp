// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/ground_layers.h"

#include "core/list.h"
#include "libraries/wells.h"
#include "subsurface/geology.h"
#include "subsurface/ground_properties.h"
#include "subsurface/saturated_zone.h"
#include "subsurface/wells.h"

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

std::vector<CellCheck> GroundChecksOf(const CSatZoneKvf& zone) {
  std::vector<CellCheck> checks;
  auto* topography = zone.Important(kTopography);
  if (!topography) return checks;
  const CheckedQuantity ground = AskQuantity("the ground", *topography);
  const std::vector<GroundBody> layers = GeologicalLayersOf(zone), computed = ComputationalLayersOf(zone);

  CellCheck levels{.kind = CellCheck::Kind::LevelsDescend, .ground = ground};
  for (const GroundBody& layer : layers)
    if (layer.bottom) levels.quantities.push_back(AskQuantity(layer.name, *layer.bottom));
  CellCheck places{.kind = CellCheck::Kind::PlacesAboveLevel, .ground = ground};
  if (!levels.quantities.empty()) {
    places.quantities.push_back(levels.quantities.back());
    places.quantities.back().name = "the bottom of " + layers.back().name;
  }
  checks.push_back(std::move(levels));

  if (zone.TypeOfVerDiscr == CSatZoneKvf::kExplicitLevels) {
    CellCheck own{.kind = CellCheck::Kind::LevelsDescend, .ground = ground};
    for (const GroundBody& layer : computed)
      if (layer.bottom) own.quantities.push_back(AskQuantity("Computational layer " + layer.name, *layer.bottom));
    checks.push_back(std::move(own));
  }

  CellCheck heads{.kind = CellCheck::Kind::BelowGround, .ground = ground};
  for (const GroundBody& layer : computed)
    if (layer.head) heads.quantities.push_back(AskQuantity("The initial head of " + layer.name, *layer.head));
  if (!heads.quantities.empty()) checks.push_back(std::move(heads));

  if (zone.ParameterDistribution == CSatZoneKvf::kByUnits) {
    CellCheck codes{.kind = CellCheck::Kind::CodesKnown, .ground = ground};
    for (const GroundBody& layer : layers)
      if (CData2DKvf* units = PropertyOf(*layer.node, "GeoUnit"))
        codes.quantities.push_back(AskQuantity("The map of units of " + layer.name, *units));
    const auto* units = zone.Child<CGeoUnitsSZListKvf>();
    for (int number = 1; units && number <= units->GetItemCount(); ++number)
      codes.codes.push_back(units->GetItem(number)->SoilCode);
    checks.push_back(std::move(codes));
  }

  const auto* file = zone.Important(kWells);
  CTvnWellDataList wells;
  if (zone.Wells && file && !file->Filename.IsEmpty()) wells.LoadWellDataFile(file->Filename.Absolute());
  for (const CTvnWellData& well : wells.Wells())
    for (const CTvnWellFilter& filter : well.filters)
      places.places.push_back({"A filter of " + well.name, well.place, filter.bottom});
  if (!places.places.empty()) checks.push_back(std::move(places));
  return checks;
}

}  // namespace tervane
