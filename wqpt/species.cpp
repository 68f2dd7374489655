// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/species.h"

#include <set>

#include <fmt/format.h>

#include "platform/item_types.h"
#include "platform/text.h"
#include "simspec/conditions.h"
#include "wqpt/pages.h"
#include "wqpt/processes.h"

namespace tervane {

namespace {

constexpr KeyChoice kColloidTypes[] = {{0, "Colloid"},
                                       {1, "Dissolved Pesticide"},
                                       {2, "Dissolved Metabolite"},
                                       {3, "Col-sorbed Pesticide"},
                                       {4, "Col-sorbed Metabolite"},
                                       {5, "Sorbed Pesticide"},
                                       {6, "Sorbed Metabolite"}};

/// The first process of a list that names a species names it anew.
template <class List>
void RenameSpeciesIn(List* processes, const std::string& from, const std::string& to) {
  for (int number = 1; processes && number <= processes->GetItemCount(); ++number) {
    if (processes->GetItem(number)->Species != from) continue;
    processes->GetItem(number)->Species = to;
    return;
  }
}

}  // namespace

CSpeciesItemKvf::CSpeciesItemKvf(CYbSEKvfBase* parent) : CYbSEKvfGroupBase("SpeciesItem", "Species_%d", parent) {}

void CSpeciesItemKvf::SetType(int type) {
  Type = type;
  TypeStr = std::to_string(type);
  SetName(GetName());
}

void CSpeciesItemKvf::SetName(const std::string& name) {
  const std::string before = name_;
  name_ = name;
  RenameLinked(name_);
  if (before == name_ || before.empty()) return;
  RenameSpeciesIn(Important(kDecays), before, name_);
  RenameSpeciesIn(Important(kSorptions), before, name_);
}

void CSpeciesItemKvf::ReadData(KvfNode* section) {
  CYbSEKvfGroupBase::ReadData(section);
  RenameLinked(name_);
  if (auto* list = dynamic_cast<CSpeciesListKvf*>(GetParent())) list->LinkNewItem(this);
}

void CSpeciesItemKvf::ExchangeKeys(KeyExchange& keys) {
  constexpr int kVersionOfSolubility = 10;
  keys("Include", Include);
  if (keys.IsReading()) Include = Include == 1;
  keys("Name", name_);
  keys("Type", Type).OneOf(kSpeciesTypeChoices);
  keys("TypeStr", TypeStr);
  // Of one version alone: older ones had no such key.
  float solubility = SolubilityinSurfaceWater;
  if (keys.Until(kVersionOfSolubility, "Solubility", solubility) && keys.DocVersion() == kVersionOfSolubility)
    SolubilityinSurfaceWater = solubility;
  keys.Since(kVersionOfSolubility + 1)("SolubilityinSurfaceWater", SolubilityinSurfaceWater)
      .Quantity(quantity::kConcentration);
  keys("TypeforColloids", TypeforColloids).OneOf(kColloidTypes);
  if (!keys.IsWriting() || PlantUptakeTransFactor != kNoUptakeFactor)
    keys("PlantUptakeTransFactor", PlantUptakeTransFactor).Unit("-");
}

int CSpeciesItemKvf::ValidateData() {
  int isValid = 1;
  if (Trimmed(GetName()).empty())
    AddWarning("The species has no name, by which processes and sources refer to it", "Name");
  const auto refuse = [&](const char* text, const char* key) {
    AddError(text, key);
    isValid = 0;
  };
  if (!(PlantUptakeTransFactor >= 0 && PlantUptakeTransFactor <= 1))
    refuse("The valid range of ET Uptake Factor is:0 to 1.", "PlantUptakeTransFactor");
  if (!(SolubilityinSurfaceWater >= 0))
    refuse("The valid range of Solubility in Surface Water is:greater than 0.", "SolubilityinSurfaceWater");
  return isValid;
}

CSpeciesListKvf::CSpeciesListKvf(CYbSEKvfBase* parent) : CTvnMasterList("Species", "Species", "Species_", parent) {
  SetPage(kSpeciesPage);
  TakesPartWhen(Component(&CModelCompKvf::WQ));
}

bool CSpeciesListKvf::HasSpeciesOfType(int type) const {
  for (int number = 1; number <= GetItemCount(); ++number)
    if (GetItem(number)->Type == type) return true;
  return false;
}

CSpeciesItemKvf* CSpeciesListKvf::FindByName(const std::string& name) const {
  for (int number = 1; number <= GetItemCount(); ++number)
    if (EqualIgnoringCase(GetItem(number)->GetName(), name)) return GetItem(number);
  return nullptr;
}

std::string CSpeciesListKvf::GetItemName(int number) const {
  const CSpeciesItemKvf* item = GetItem(number);
  return item ? item->GetName() : std::string();
}

namespace {

std::vector<std::string> NamesWhere(const CSpeciesListKvf& list, auto isWanted) {
  std::vector<std::string> names;
  for (int number = 1; number <= list.GetItemCount(); ++number)
    if (isWanted(list.GetItem(number)->Type)) names.push_back(list.GetItem(number)->GetName());
  return names;
}

}  // namespace

std::vector<std::string> CSpeciesListKvf::Names() const {
  return NamesWhere(*this, [](int) { return true; });
}
std::vector<std::string> CSpeciesListKvf::NamesOfType(int type) const {
  return NamesWhere(*this, [type](int of) { return of == type; });
}
std::vector<std::string> CSpeciesListKvf::NamesWithoutType(int type) const {
  return NamesWhere(*this, [type](int of) { return of != type; });
}

int CSpeciesListKvf::ValidateData() {
  int isValid = 1;
  std::set<std::string> names;
  for (const std::string& name : Names())
    if (!names.insert(LowerCase(name)).second) {
      AddError("The names of species should be unique!", {}, name);
      isValid = 0;
      break;
    }
  if (Method(&CModelCompKvf::ADPTRadio, kParticleTracking).Holds(*this) && GetItemCount() > 0 &&
      GetItem(1)->Type != CSpeciesItemKvf::kDissolved) {
    AddError("In PT the first specie must be Dissolved.", {}, GetItem(1)->GetName());
    isValid = 0;
  }
  return isValid;
}

std::vector<Mend> MendsByNames(const std::string& key, const std::vector<std::string>& names) {
  std::vector<Mend> mends;
  for (const std::string& name : names) mends.push_back({fmt::format("Change {} to {}", key, name), key, name});
  return mends;
}

CSpeciesItemKvf* SpeciesOf(const CYbSEKvfBase& entry) {
  const auto* item = dynamic_cast<const CSpeciesItemBase*>(&entry);
  auto* species = entry.Important(kSpecies);
  return item && species ? static_cast<CSpeciesItemKvf*>(species->FindDependentItem(item->GetId())) : nullptr;
}

Condition SpeciesTypeIs(std::vector<int> types) {
  return Is<CSpeciesItemKvf>(SpeciesOf, &CSpeciesItemKvf::Type, std::move(types));
}

Condition AnySpecies() {
  return Condition::Sentence("there is a species", [](const CYbSEKvfBase& node) {
    const auto* species = node.Important(kSpecies);
    return species && species->GetItemCount() > 0;
  });
}

}  // namespace tervane
