// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/decay_entries.h"

#include <algorithm>

#include "simspec/conditions.h"
#include "wqpt/ground.h"
#include "wqpt/layer_values.h"
#include "wqpt/soil_values.h"

namespace tervane {

namespace {

using Species = CSpeciesItemKvf;

constexpr EntriesKind kOverlandDecays{.section = "Decay_Processes",
                                      .title = "Decay Processes",
                                      .shortTitle = "",
                                      .helpPage = "OL_DecayProcesses.htm",
                                      .master = kDecays.text};
constexpr EntriesKind kSoilDecays{.section = "Decay_Processes",
                                  .title = "Decay Processes",
                                  .shortTitle = "",
                                  .helpPage = "UZ_DecayProcesses.htm",
                                  .master = kDecays.text};
constexpr EntriesKind kLayerDecays{.section = "Decay_Processes",
                                   .title = "Decay Processes",
                                   .shortTitle = "",
                                   .helpPage = "WQ_DecayProcesses.htm",
                                   .master = kDecays.text};

constexpr float kUsualHalfLife = 1000;
const Data2DKind kOverlandHalfLife{.className = "CData2DWQKvf",
                                   .section = "Half_Life",
                                   .title = "First-order decay half life",
                                   .itemType = quantity::kHalfLife,
                                   .fixedValue = kUsualHalfLife,
                                   .shortTitle = "Half-Life"};
constexpr const char* kHalfLifeOutside = "Invalid Data: Value must be greater than 0";
constexpr SoilValueKind kSoilHalfLife{.className = "CDecayDecayHalfLifeKvf",
                                      .section = "Half_Life",
                                      .title = "Decay half life in unsaturated soil matrix",
                                      .shortTitle = "Half life",
                                      .itemType = quantity::kHalfLife,
                                      .uniformValue = kUsualHalfLife,
                                      .mayBeZero = false,
                                      .outside = kHalfLifeOutside};
constexpr SoilValueKind kMacroporeHalfLife{.className = "CDecayMacroporeHalfLife",
                                           .section = "Macropore_Half_Life",
                                           .title = "Decay half life in unsaturated macropores",
                                           .shortTitle = "Macropore half life",
                                           .itemType = quantity::kHalfLife,
                                           .uniformValue = kUsualHalfLife,
                                           .mayBeZero = false,
                                           .outside = kHalfLifeOutside};
const Data2DKind kLayerHalfLives[] = {{.className = "CWQLayerData2DKVF",
                                       .section = "Half_Life",
                                       .title = "Decay half life in primary porosity",
                                       .itemType = quantity::kHalfLife,
                                       .fixedValue = kUsualHalfLife,
                                       .shortTitle = "Half life"},
                                      {.className = "CWQLayerData2DKVF",
                                       .section = "Secondary_Half_Life",
                                       .title = "Decay half life in secondary porosity",
                                       .itemType = quantity::kHalfLife,
                                       .fixedValue = kUsualHalfLife,
                                       .shortTitle = "Secondary Half Life"}};

/// The entries' own rule, shared by all.
const Condition& DecayEntryUsed() {
  static const Condition used =
      Condition::Sentence("its species is of a type that decays here", [](const CYbSEKvfBase& node) {
        const auto* entry = dynamic_cast<const DecayEntryKvf*>(&node);
        return entry && entry->IsUsed();
      });
  return used;
}

}  // namespace

DecayEntryKvf::DecayEntryKvf(std::string name, std::initializer_list<int> types, const char* helpPage,
                             CYbSEKvfBase* parent)
    : NamedEntry(std::move(name), std::string(), "Decay_%d", parent), types_(types) {
  SetHelp("Top.chm", helpPage);
  SetPage(kHelpPage);
  TakesPartWhen(DecayEntryUsed());
}

void DecayEntryKvf::OnMasterChanged(CTvnDependentListBase* list, int number) {
  const auto* processes = dynamic_cast<const CYbSEKvfListBaseInterface*>(list);
  const auto* species = Important(kSpecies);
  const Species* named = processes && processes->GetItemCount() > 0 && species ? species->GetItem(number) : nullptr;
  isUsed_ = named && std::ranges::find(types_, named->Type) != types_.end();
}

void DecayEntryKvf::ExchangeState(KeyExchange& keys) {
  ExchangeKeys(keys);
  keys("Used", isUsed_);
}

// ---- Over ground

CDecayProcessesItem::CDecayProcessesItem(std::string name, CYbSEKvfBase* parent)
    : DecayEntryKvf(std::move(name), {Species::kDissolved, Species::kSuspended}, "OL_DecayProcess.htm", parent) {
  NewChild<CData2DKvf>(kOverlandHalfLife);
}

CDecayProcessesKvf::CDecayProcessesKvf(CYbSEKvfBase* parent)
    : EntriesKvf(kOverlandDecays,
                 Component(&CModelCompKvf::WQ) && WaterQualityComponent(&CModelCompWQKvf::OL) &&
                     SorptionAndDecayModelled() && AnyDecay(),
                 parent) {
  FollowMaster();
}

// ---- In the soil

CDecayProcessChildKvf::CDecayProcessChildKvf(std::string name, CYbSEKvfBase* parent)
    : DecayEntryKvf(std::move(name), {Species::kDissolved, Species::kSorbed}, "UZ_DecayProcess.htm", parent) {
  NewChild<SoilValuesKvf>(kSoilHalfLife);
  static const Condition kFull = FullMacroporeFlow();
  NewChild<SoilValuesKvf>(kMacroporeHalfLife)->TakesPartWhen(kFull);
}

CDecayProcessListKvf::CDecayProcessListKvf(CYbSEKvfBase* parent)
    : EntriesKvf(kSoilDecays,
                 AnyDecay() && Component(&CModelCompKvf::WQ) && Component(&CModelCompKvf::UZ) &&
                     SorptionAndDecayModelled() && WaterQualityComponent(&CModelCompWQKvf::UZ),
                 parent) {
  FollowMaster();
}

// ---- In a water quality layer

CWQLayerDecayProcessItemKvf::CWQLayerDecayProcessItemKvf(std::string name, CYbSEKvfBase* parent)
    : DecayEntryKvf(std::move(name), {Species::kDissolved, Species::kSorbed}, "WQ_DecayProcess.htm", parent) {
  static const Condition kRules[] = {Condition(), ImmobileWaterModelled()};
  for (std::size_t i = 0; i < std::size(kLayerHalfLives); ++i)
    NewChild<CWQLayerData2DKVF>(kLayerHalfLives[i], kRules[i]);
}

int CWQLayerDecayProcessItemKvf::ValidateData() { return JudgeLayerValues(*this, false); }

CWQLayerDecayProcessesKvf::CWQLayerDecayProcessesKvf(CYbSEKvfBase* parent)
    : EntriesKvf(kLayerDecays, AnyDecay() && SorptionAndDecayModelled(), parent) {
  FollowMaster();
  // The processes of a setup stand before its layers are made by a user.
  if (auto* decays = Important(kDecays)) decays->Notify(0, nullptr);
}

}  // namespace tervane
