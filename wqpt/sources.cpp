// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/sources.h"

#include <algorithm>

#include <fmt/format.h>

#include "simspec/conditions.h"
#include "simspec/pages.h"
#include "wqpt/pages.h"
#include "wqpt/species.h"

namespace tervane {

namespace {

using Source = CSourceWQItemKvf;

constexpr KeyChoice kLocations[] = {{Source::kSurface, "Surface"}, {Source::kSubsurface, "Subsurface"}};
constexpr KeyChoice kSourceTypeChoices[] = {{0, "Precipitation"},  {1, "Overland"}, {2, "UZ mass"},
                                            {3, "SZ Fixed Conc."}, {4, "SZ mass"},  {5, "UZ Fixed Conc."}};

ForcingKind StrengthKind() {
  return {.className = "CStrengthWQKvf",
          .stationClassName = "CStrengthWQTimeSeriesKvf",
          .itemTypes = {quantity::kUndefined, quantity::kUndefined},
          .valueTypes = kMeansOrSums,
          .stationTitle = "Station Data - Strength",
          .page = &kStrengthPage,
          .stationPage = &kStrengthStationPage};
}

const SourceType* FindSourceType(int code) {
  const auto found = std::ranges::find(SourceTypes(), code, &SourceType::code);
  return found == SourceTypes().end() ? nullptr : &*found;
}

}  // namespace

const std::vector<SourceType>& SourceTypes() {
  static const std::vector<int> kConcentrations{quantity::kConcentration},
      kMasses{quantity::kMassRate, quantity::kMass};
  static const std::vector<int> kInstantaneous{static_cast<int>(ValueType::Instantaneous)};
  static const std::vector<SourceType> types{
      {0, "Precipitation", Source::kSurface, kConcentrations, kInstantaneous},
      {1, "Overland", Source::kSurface, kMasses, kMeansOrSums},
      {5, "UZ Fixed Conc.", Source::kSubsurface, kConcentrations, kInstantaneous},
      {2, "UZ mass", Source::kSubsurface, kMasses, kMeansOrSums},
      {3, "SZ Fixed Conc.", Source::kSubsurface, kConcentrations, kInstantaneous},
      {4, "SZ mass", Source::kSubsurface, kMasses, kMeansOrSums}};
  return types;
}

CStrengthWQKvf::CStrengthWQKvf(CYbSEKvfBase* parent)
    : C2DStationBasedDataKvf(StrengthKind(), "Strength", "Strength", parent) {}

// ---- A source

CSourceWQItemKvf::CSourceWQItemKvf(CYbSEKvfBase* parent) : CYbSEKvfGroupBase("Source", "Source_%d", parent) {
  SetHelp("Top.chm", "WQ_Source.htm");
  SetPage(kHelpPage);
  NewChild<ExtentKvf>("CSourceWQExtentKvf", Is(ExtentType, kPartDomain));
  MakeExtentLevels(*this, Is(Location, kSubsurface));
  strength_ = NewChild<CStrengthWQKvf>();
  UpdateStrength();
}

void CSourceWQItemKvf::SetSourceType(int code) {
  Type = code;
  UpdateStrength();
}

void CSourceWQItemKvf::UpdateStrength() {
  if (const SourceType* type = FindSourceType(Type)) strength_->SetItemTypes(type->itemTypes, type->valueTypes);
}

const std::string& CSourceWQItemKvf::GetTitle() const {
  return SourceName.empty() ? CYbSEKvfGroupBase::GetTitle() : SourceName;
}

void CSourceWQItemKvf::ReadData(KvfNode* section) {
  CYbSEKvfGroupBase::ReadData(section);
  UpdateStrength();
}

int CSourceWQItemKvf::ValidateData() {
  const SourceType* type = FindSourceType(Type);
  if (!type)
    AddWarning("The source has a type that does not exist", "SourceType", std::to_string(Type));
  else if (type->location != Location)
    AddWarning("The source has a type of the other location", "SourceType", std::string(type->text));
  const auto* species = Important(kSpecies);
  if (species && !species->FindByName(Species))
    AddWarning("The source names a species that the setup does not have", "Species", Species);
  return 1;
}

std::vector<Mend> CSourceWQItemKvf::MendsOf(const Finding& finding) const {
  const auto* species = Important(kSpecies);
  if (species && finding.key == "Species")
    return MendsByNames(finding.key, species->NamesWithoutType(CSpeciesItemKvf::kFixed));
  std::vector<Mend> mends;
  if (finding.key == "SourceType")
    for (const SourceType& type : SourceTypes())
      if (type.location == Location)
        mends.push_back({fmt::format("Change SourceType to {}", type.text), finding.key, std::to_string(type.code)});
  return mends;
}

void CSourceWQItemKvf::TakeMend(const Mend& mend) {
  if (mend.key == "Species") Species = mend.value;
  for (const SourceType& type : SourceTypes())
    if (mend.key == "SourceType" && mend.value == std::to_string(type.code)) SetSourceType(type.code);
}

void CSourceWQItemKvf::ExchangeKeys(KeyExchange& keys) {
  keys("SourceName", SourceName);
  keys("Species", Species);
  keys("Location", Location).OneOf(kLocations);
  keys("SourceType", Type).OneOf(kSourceTypeChoices);
  keys("ExtentType", ExtentType).OneOf(kExtentTypes);
}

void CSourceWQItemKvf::ExchangeState(KeyExchange& keys) {
  ExchangeKeys(keys);
  if (keys.IsReading()) UpdateStrength();
}

// ---- The list

CSourcesWQListKvf::CSourcesWQListKvf(CYbSEKvfBase* parent)
    : CYbSEKvfListBase("Water Quality Sources", "Sources", parent) {
  SetAbbreviatedTitle("WQ Sources");
  SetPage(kSourcesPage);
  TakesPartWhen(OwnEngine() && Component(&CModelCompKvf::WQ));
}

std::string CSourcesWQListKvf::GetItemName(int number) const {
  const CSourceWQItemKvf* item = GetItem(number);
  return item ? item->SourceName : std::string();
}

void CSourcesWQListKvf::BeginItem(int number) {
  const auto* species = Important(kSpecies);
  const CSpeciesItemKvf* first = species ? species->GetItem(1) : nullptr;
  if (first && first->Type != CSpeciesItemKvf::kFixed) GetItem(number)->Species = first->GetName();
}

}  // namespace tervane
