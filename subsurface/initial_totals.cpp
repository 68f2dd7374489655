// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/initial_totals.h"

#include <fmt/format.h>

#include "platform/item_types.h"
#include "platform/units.h"
#include "subsurface/geology.h"
#include "subsurface/ground_layers.h"
#include "subsurface/saturated_zone.h"
#include "wqpt/registration_lenses.h"
#include "wqpt/species_entries.h"

namespace tervane {

namespace {

constexpr int kKilogram = 4201, kKilogramPerCubicMetre = 2200;  // Unit keys.

/// What of the ground counts for a mass.
struct Share {
  const char* section;  ///< Of a geological layer.
  float CGeoUnitsSZItemKvf::*ofUnit;
  int itemType;
};
constexpr Share kPorosityShare{"Porosity", &CGeoUnitsSZItemKvf::Porosity, quantity::kPorosity},
    kMatrixPorosityShare{"MatrixPorosity", &CGeoUnitsSZItemKvf::MatrixPorosity, quantity::kPorosity},
    kBulkDensityShare{"BulkDensity", &CGeoUnitsSZItemKvf::BulkDensity, quantity::kBulkDensity};

/// The quantity of another computational layer that stands where one stands in its own.
CData2DKvf* SameIn(CYbSEKvfBase& layer, const CData2DKvf& quantity) {
  const CYbSEKvfBase* group = quantity.GetParent();
  for (CYbSEKvfBase* child = layer.GetFirstChild(); child; child = layer.GetNextChild(child)) {
    if (child->GetSectionName() == quantity.GetSectionName() && !dynamic_cast<const CSpeciesItemBase*>(&quantity))
      return dynamic_cast<CData2DKvf*>(child);
    if (child->GetSectionName() != group->GetSectionName()) continue;
    const int id = dynamic_cast<const CSpeciesItemBase&>(quantity).GetId();
    for (CYbSEKvfBase* entry = child->GetFirstChild(); entry; entry = child->GetNextChild(entry)) {
      const auto* item = dynamic_cast<const CSpeciesItemBase*>(entry);
      if (item && item->GetId() == id) return dynamic_cast<CData2DKvf*>(entry);
    }
  }
  return nullptr;
}

/// The share of each geological layer; none where one is not known.
std::vector<TotalledQuantity> SharesOf(const CSatZoneKvf& zone, const std::vector<GroundBody>& geology,
                                       const Share& share) {
  std::vector<TotalledQuantity> shares;
  for (const GroundBody& body : geology) {
    const bool isByUnits = zone.ParameterDistribution == CSatZoneKvf::kByUnits;
    CData2DKvf* quantity = PropertyOf(*body.node, isByUnits ? "GeoUnit" : share.section);
    if (!quantity) return {};
    shares.push_back(AskTotalled(*quantity));
    if (!isByUnits) continue;
    for (int number = 1; number <= zone.Units().GetItemCount(); ++number) {
      const CGeoUnitsSZItemKvf& unit = *zone.Units().GetItem(number);
      shares.back().valueOfCode.try_emplace(unit.SoilCode, static_cast<double>(unit.*share.ofUnit));
    }
    // A map of codes without units stands for nothing.
    if (shares.back().valueOfCode.empty()) return {};
  }
  return shares;
}

/// Ground and bottoms; nothing where a layer has no bottom.
std::optional<TotalledBodies> BodiesOf(const CSatZoneKvf& zone, const std::vector<GroundBody>& layers,
                                       const std::vector<GroundBody>& geology) {
  auto* topography = zone.Important(kTopography);
  if (!topography || layers.empty()) return std::nullopt;
  TotalledBodies bodies{AskTotalled(*topography), {}};
  for (std::size_t number = 0; number < layers.size(); ++number) {
    // One that follows the geology has its level.
    CData2DKvf* bottom = layers[number].bottom;
    if (!bottom && number < geology.size()) bottom = geology[number].bottom;
    if (!bottom) return std::nullopt;
    bodies.bottoms.push_back(AskTotalled(*bottom));
  }
  return bodies;
}

}  // namespace

std::optional<CellTotals> InitialTotalsOf(const CSatZoneKvf& zone, CData2DKvf& quantity) {
  const bool isParticles = IsParticleNumber(quantity);
  const auto* species = dynamic_cast<const CSatCompLayerInitConSpecy*>(&quantity);
  if (!isParticles && !species) return std::nullopt;
  const std::vector<GroundBody> layers = ComputationalLayersOf(zone), geology = GeologicalLayersOf(zone);
  CellTotals totals;
  bool isFound = false;
  for (std::size_t number = 0; number < layers.size(); ++number) {
    CData2DKvf* same = SameIn(*layers[number].node, quantity);
    if (!same) return std::nullopt;
    if (same == &quantity) {
      totals.layer = number;
      isFound = true;
    }
    totals.layers.push_back({layers[number].name, AskTotalled(*same), same->WhyFileNotValid()});
  }
  // The layers of the other list are not computed.
  if (!isFound) return std::nullopt;
  totals.domain = AskDomain(zone);
  if (isParticles) {
    totals.title = "Initial number of particles";
    return totals;
  }

  const bool isSorbed = quantity.GetItemType() == quantity::kSorbedConcentration;
  const bool isImmobile = dynamic_cast<const CSatCompLayersInitImmobileConcentrationKvf*>(quantity.GetParent());
  totals.title = fmt::format("Initial mass of {}", quantity.GetTitle());
  totals.unit = FindUnit(kKilogram)->abbreviation;
  totals.levels = BodiesOf(zone, layers, geology);
  const auto geologyBodies = BodiesOf(zone, geology, geology);
  totals.shares = SharesOf(zone, geology,
                           isSorbed     ? kBulkDensityShare
                           : isImmobile ? kMatrixPorosityShare
                                        : kPorosityShare);
  std::string problem;
  if (quantity.GetItemType() != quantity::kConcentration && !isSorbed)
    problem = "its concentration has no unit";
  else if (!totals.levels || !geologyBodies)
    problem = "a level of its layers is not known";
  else if (totals.shares.empty())
    problem = isSorbed ? "the bulk density is not known" : "the porosity is not known";
  if (!problem.empty()) {
    totals.levels.reset();
    for (CellTotals::Layer& layer : totals.layers) layer.problem = problem;
    return totals;
  }
  totals.bodies = *geologyBodies;
  // Bulk densities are in kilograms, as the mass is.
  if (!isSorbed)
    totals.factor = Convert(1, BaseUnit(*FindItemType(quantity::kConcentration)), *FindUnit(kKilogramPerCubicMetre));
  totals.remark = isSorbed ? "Counted with the bulk density of the geological layers"
                           : "Counted with the porosity of the geological layers, all pores full of water";
  totals.remark += GeologicalLensesOf(zone).empty() ? "." : "; lenses are passed over.";
  return totals;
}

}  // namespace tervane
