// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/species_entries.h"

#include <fmt/format.h>

#include "platform/units.h"
#include "simspec/conditions.h"
#include "wqpt/ground.h"

namespace tervane {

namespace {

using Species = CSpeciesItemKvf;

constexpr int kKilogramUnit = 4201, kKilogramPerSquareMetre = 4401;

constexpr EntriesKind kInitialMasses{.section = "InitialMass",
                                     .title = "Initial Mass on ground surface",
                                     .shortTitle = "Initial Mass",
                                     .helpPage = "Initial_Mass.htm",
                                     .master = kSpecies.text};
constexpr EntriesKind kMacroporeTransfer{.section = "Macropore_Transfer_Coeff",
                                         .title = "Mass transfer coefficient to unsaturated macropores",
                                         .shortTitle = "Macropore Transfer Coeff",
                                         .helpPage = "Macropore_Transfer_Coeff.htm",
                                         .master = kSpecies.text};
constexpr EntriesKind kSoilConcentrations{.section = "Initial_Concentration",
                                          .title = "Initial Concentration",
                                          .shortTitle = "",
                                          .helpPage = "UZ_Initial_Concentration.htm",
                                          .master = kSpecies.text};
constexpr EntriesKind kImmobileTransfer{.section = "Dual_Porosity_Transfer_Coeff",
                                        .title = "Mass transfer coefficient to secondary porosity",
                                        .shortTitle = "Dual Porosity Transfer Coeff",
                                        .helpPage = "Dual_Porosity.htm",
                                        .master = kSpecies.text};
constexpr EntriesKind kLayerConcentrations{.section = "Initial_Concentration",
                                           .title = "Initial Concentration",
                                           .shortTitle = "",
                                           .helpPage = "Initial_Concentration.htm",
                                           .master = kSpecies.text};
constexpr EntriesKind kImmobileConcentrations{.section = "Initial_Immobile_Concentration",
                                              .title = "Initial concentration in secondary porosity",
                                              .shortTitle = "Initial Secondary Conc",
                                              .helpPage = "Initial_Secondary_Concentration.htm",
                                              .master = kSpecies.text};

const Data2DKind kInitialMass{
    .className = "CInitialMassItem", .section = "Species_%d", .title = {}, .itemType = quantity::kMassPerArea};
const Data2DKind kLayerTransfer{
    .className = "CWQLayerSpecyKvf", .section = "Species_%d", .title = {}, .itemType = quantity::kKineticRate};
constexpr SoilValueKind kSoilTransfer{.className = "CMacroporeTransferCoeffItemKvf",
                                      .section = "Species_%d",
                                      .title = "",
                                      .shortTitle = "",
                                      .itemType = quantity::kKineticRate,
                                      .outside = "Fixed Value invalid, Valid Range: greater than or equal 0."};
constexpr SoilValueKind kSoilConcentration{.className = "CUnSatInitConcenSpecyKvf",
                                           .section = "Species_%d",
                                           .title = "",
                                           .shortTitle = "",
                                           .itemType = quantity::kConcentration};

const Data2DKind kLayerConcentration{.className = "CSatCompLayerInitConSpecy",
                                     .section = "Species_%d",
                                     .title = {},
                                     .itemType = quantity::kConcentration};

/// A suspended species has no concentration below ground.
const Condition& NotSuspended() {
  static const Condition rule = !SpeciesTypeIs({Species::kSuspended});
  return rule;
}

// Rules of groups are made once: each computational layer has such groups.

const Condition& LayerConcentrationsUsed() {
  const auto particles = [](const CYbSEKvfBase& node) { return node.Important(kParticleTrackingComponents); };
  static const Condition rule =
      Component(&CModelCompKvf::WQ) && AnySpecies() &&
      ((Method(&CModelCompKvf::ADPTRadio, kParticleTracking) &&
        Is<CModelCompPTKvf>(particles, &CModelCompPTKvf::InitDensityRadio, {CModelCompPTKvf::kByConcentration})) ||
       (!Method(&CModelCompKvf::ADPTRadio, kParticleTracking) && WaterQualityComponent(&CModelCompWQKvf::SZ)));
  return rule;
}

const Condition& ImmobileConcentrationsUsed() {
  static const Condition rule = Component(&CModelCompKvf::WQ) && Component(&CModelCompKvf::SZ) &&
                                WaterQualityComponent(&CModelCompWQKvf::SZ) && ImmobileWaterModelled();
  return rule;
}

}  // namespace

int ConcentrationQuantity(int speciesType) {
  switch (speciesType) {
    case Species::kDissolved:
    case Species::kSuspended:
      return quantity::kConcentration;
    case Species::kSorbed:
      return quantity::kSorbedConcentration;
    default:
      return quantity::kUndefined;
  }
}

// ---- Over ground

CInitialMassItem::CInitialMassItem(std::string name, CYbSEKvfBase* parent)
    : NamedEntry(std::move(name), kInitialMass, parent) {
  static const Condition kOnGround = SpeciesTypeIs({Species::kDissolved, Species::kSuspended, Species::kFixed});
  TakesPartWhen(kOnGround);
}

int CInitialMassItem::GetItemType() const {
  const Species* species = SpeciesOf(*this);
  return species && species->Type == Species::kFixed ? quantity::kUndefined : quantity::kMassPerArea;
}

COverlandSpeciesKvf::COverlandSpeciesKvf(CYbSEKvfBase* parent)
    : EntriesKvf(kInitialMasses, Component(&CModelCompKvf::WQ) && WaterQualityComponent(&CModelCompWQKvf::OL), parent) {
  FollowMaster();
}

std::optional<CellTotals> COverlandSpeciesKvf::TotalsOf(CData2DKvf& quantity) const {
  CellTotals totals;
  totals.title = fmt::format("Initial mass of {}", quantity.GetTitle());
  totals.unit = FindUnit(kKilogramUnit)->abbreviation;
  totals.factor = Convert(1, BaseUnit(*FindItemType(quantity::kMassPerArea)), *FindUnit(kKilogramPerSquareMetre));
  totals.isForArea = true;
  totals.domain = AskDomain(*this);
  const bool hasUnit = quantity.GetItemType() == quantity::kMassPerArea;
  totals.layers.push_back(
      {"the model area", AskTotalled(quantity), hasUnit ? quantity.WhyFileNotValid() : "its mass has no unit"});
  return totals;
}

// ---- In the soil

CMacroporeTransferCoeffItemKvf::CMacroporeTransferCoeffItemKvf(std::string name, CYbSEKvfBase* parent)
    : NamedEntry(std::move(name), kSoilTransfer, parent) {
  static const Condition kDissolvedOnly = SpeciesTypeIs({Species::kDissolved});
  TakesPartWhen(kDissolvedOnly);
}

CMacroporeTransferCoeff::CMacroporeTransferCoeff(CYbSEKvfBase* parent)
    : EntriesKvf(kMacroporeTransfer,
                 Component(&CModelCompKvf::WQ) && FullMacroporeFlow() && WaterQualityComponent(&CModelCompWQKvf::UZ),
                 parent) {
  FollowMaster();
}

CUnSatInitConcenSpecyKvf::CUnSatInitConcenSpecyKvf(std::string name, CYbSEKvfBase* parent)
    : NamedEntry(std::move(name), kSoilConcentration, parent) {
  TakesPartWhen(NotSuspended());
}

int CUnSatInitConcenSpecyKvf::GetItemType() const {
  const Species* species = SpeciesOf(*this);
  return ConcentrationQuantity(species ? species->Type : Species::kDissolved);
}

const std::string& CUnSatInitConcenSpecyKvf::GetTitle() const {
  return shownTitle_ = GetParent()->GetTitle() + ", " + GetName();
}

CUnSatInitConcenKvf::CUnSatInitConcenKvf(CYbSEKvfBase* parent)
    : EntriesKvf(kSoilConcentrations,
                 Component(&CModelCompKvf::WQ) && AnySpecies() && WaterQualityComponent(&CModelCompWQKvf::UZ), parent) {
  FollowMaster();
}

// ---- In the saturated zone

CWQLayerSpecyKvf::CWQLayerSpecyKvf(std::string name, CYbSEKvfBase* parent)
    : NamedEntry(std::move(name), kLayerTransfer, parent) {}

int CWQLayerSpecyKvf::ValidateData() {
  const int isValid = NamedEntry::ValidateData();
  if (FixedValue >= 0) return isValid;
  AddError("Valid Range: Greater than or equal 0.", "FixedValue");
  return 0;
}

CDualPorosityTransferCoeffListKvf::CDualPorosityTransferCoeffListKvf(CYbSEKvfBase* parent)
    : EntriesKvf(kImmobileTransfer, ImmobileWaterModelled(), parent) {
  FollowMaster();
}

CSatCompLayerInitConSpecy::CSatCompLayerInitConSpecy(std::string name, CYbSEKvfBase* parent)
    : NamedEntry(std::move(name), kLayerConcentration, parent) {
  TakesPartWhen(NotSuspended());
}

void CSatCompLayerInitConSpecy::BeginWith(int speciesType) {
  itemType_ = ConcentrationQuantity(speciesType);
  if (const ItemType* found = FindItemType(itemType_)) ShapeItemUnit = BaseUnit(*found).key;
}

void CSatCompLayerInitConSpecy::FitSpecies(int speciesType) {
  if (itemType_ == quantity::kConcentration && speciesType == Species::kSorbed)
    itemType_ = quantity::kSorbedConcentration;
  else if (itemType_ == quantity::kSorbedConcentration && speciesType == Species::kDissolved)
    itemType_ = quantity::kConcentration;
}

void CSatCompLayerInitConSpecy::ExchangeState(KeyExchange& keys) {
  ExchangeKeys(keys);
  keys("ItemType", itemType_);
}

CSpeciesItemBase* ConcentrationsKvf::CreateDependentItem(int id, const std::string& name) {
  CSpeciesItemBase* entry = EntriesKvf::CreateDependentItem(id, name);
  auto& concentration = static_cast<CSatCompLayerInitConSpecy&>(*entry);
  if (const Species* species = SpeciesOf(concentration)) concentration.BeginWith(species->Type);
  return entry;
}

void ConcentrationsKvf::RefreshDependents() {
  for (CYbSEKvfBase* child = GetFirstChild(); child; child = GetNextChild(child))
    if (auto* entry = dynamic_cast<CSatCompLayerInitConSpecy*>(child))
      if (const Species* species = SpeciesOf(*entry)) entry->FitSpecies(species->Type);
}

CSatCompLayersInitConcentrationKvf::CSatCompLayersInitConcentrationKvf(CYbSEKvfBase* parent)
    : ConcentrationsKvf(kLayerConcentrations, LayerConcentrationsUsed(), parent) {
  FollowMaster();
}

CSatCompLayersInitImmobileConcentrationKvf::CSatCompLayersInitImmobileConcentrationKvf(CYbSEKvfBase* parent)
    : ConcentrationsKvf(kImmobileConcentrations, ImmobileConcentrationsUsed(), parent) {
  FollowMaster();
}

}  // namespace tervane
