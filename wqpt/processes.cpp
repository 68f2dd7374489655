// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/processes.h"

#include <unordered_map>

#include "platform/item_types.h"
#include "platform/text.h"
#include "simspec/conditions.h"
#include "wqpt/pages.h"

namespace tervane {

namespace {

using Sorption = CProcessesWQ_SorptionItemKvf;

constexpr KeyChoice kIsotherms[] = {
    {Sorption::kLinear, "Linear"}, {Sorption::kFreundlich, "Freundlich"}, {Sorption::kLangmuir, "Langmuir"}};
constexpr KeyChoice kKinetics[] = {{Sorption::kNoHysteresis, "No hysterisis"}, {Sorption::kHysteresis, "Hysterisis"}};

/// Whether another item of the list has the name, in any case.
template <class Item>
bool IsNameTaken(const Item& item) {
  const auto* list = dynamic_cast<const CYbSEKvfAbstractListBase<Item>*>(item.GetParent());
  for (int number = 1; list && number <= list->GetItemCount(); ++number) {
    const Item* other = list->GetItem(number);
    if (other != &item && EqualIgnoringCase(other->GetName(), item.GetName())) return true;
  }
  return false;
}

/// Links an item that was read with what follows it, and tells who listens to the list.
template <class List, class Item>
void LinkReadItem(Item& item) {
  item.SetName(item.GetName());
  auto* list = dynamic_cast<List*>(item.GetParent());
  if (!list) return;
  list->LinkNewItem(&item);
  list->Notify(0, nullptr);
}

}  // namespace

// ---- Decay

CProcessesWQ_DecayItemKvf::CProcessesWQ_DecayItemKvf(CYbSEKvfBase* parent)
    : ProcessItemKvf("CProcessesWQ_Decay", "Decay_%d", parent) {}

void CProcessesWQ_DecayItemKvf::ReadData(KvfNode* section) {
  ProcessItemKvf::ReadData(section);
  LinkReadItem<CProcessesWQ_DecayListKvf>(*this);
}

void CProcessesWQ_DecayItemKvf::ExchangeKeys(KeyExchange& keys) {
  keys("Species", Species);
  keys("IsTemperatureDependant", IsTemperatureDependant);
  keys("IsWaterContentDependant", IsWaterContentDependant);
  keys("Name", name_);
  keys("Temperature", Temperature).Quantity(quantity::kTemperature);
  keys("TemperatureExponent", TemperatureExponent).Quantity(quantity::kExponentOrCoefficient);
  keys("WaterContentExponent", WaterContentExponent).Quantity(quantity::kExponentOrCoefficient);
}

int CProcessesWQ_DecayItemKvf::ValidateData() {
  const auto refuse = [this](const char* text, const char* key) {
    AddError(text, key, GetName());
    return 0;
  };
  if (IsNameTaken(*this)) return refuse("Duplicate Decay Name.", "Name");
  if (!(Temperature >= -100 && Temperature <= 100))
    return refuse("Tempreture value should between -100 and 100", "Temperature");
  constexpr const char* kExponent = "Exponent is invalid, value must be greater than or equal to 0 .";
  if (!(TemperatureExponent >= 0)) return refuse(kExponent, "TemperatureExponent");
  if (!(WaterContentExponent >= 0)) return refuse(kExponent, "WaterContentExponent");
  if (Species.empty()) return refuse("Species can not be empty.", "Species");
  const auto* species = Important(kSpecies);
  if (species && !species->FindByName(Species))
    AddWarning("The process names a species that the setup does not have", "Species", Species);
  return 1;
}

std::vector<Mend> CProcessesWQ_DecayItemKvf::MendsOf(const Finding& finding) const {
  const auto* species = Important(kSpecies);
  if (!species || finding.key != "Species") return {};
  return MendsByNames(finding.key, species->NamesWithoutType(CSpeciesItemKvf::kFixed));
}

void CProcessesWQ_DecayItemKvf::TakeMend(const Mend& mend) {
  Species = mend.value;
  if (auto* list = dynamic_cast<CProcessesWQ_DecayListKvf*>(GetParent())) list->Notify(0, nullptr);
}

CProcessesWQ_DecayListKvf::CProcessesWQ_DecayListKvf(CYbSEKvfBase* parent)
    : CTvnMasterList("CProcessesWQ_DecayListKvf", "Decay_Processes", "Decay_", parent) {
  if (auto* species = Important(kSpecies)) species->AddListener(this);
}

CProcessesWQ_DecayListKvf::~CProcessesWQ_DecayListKvf() {
  if (auto* species = Important(kSpecies)) species->RemoveListener(this);
}

bool CProcessesWQ_DecayListKvf::IsAnyTemperatureDependent() const {
  for (int number = 1; number <= GetItemCount(); ++number)
    if (GetItem(number)->IsTemperatureDependant) return true;
  return false;
}

void CProcessesWQ_DecayListKvf::OnNotify(int /*value*/, void* /*object*/) {
  if (isLoading_) return;
  std::unordered_map<std::string, int> places;
  if (const auto* species = Important(kSpecies))
    for (int number = 1; number <= species->GetItemCount(); ++number)
      places.try_emplace(LowerCase(species->GetItemName(number)), number);
  for (int number = 1; number <= GetItemCount(); ++number) {
    CProcessesWQ_DecayItemKvf* item = GetItem(number);
    const auto place = places.find(LowerCase(item->Species));
    item->OnMasterChanged(this, place == places.end() ? 0 : place->second);
  }
}

void CProcessesWQ_DecayListKvf::Load(KvfNode* parentSection) {
  // One notification for all items: each would walk all of them.
  isLoading_ = true;
  CTvnMasterList::Load(parentSection);
  isLoading_ = false;
  Notify(0, nullptr);
}

// ---- Sorption

CProcessesWQ_SorptionItemKvf::CProcessesWQ_SorptionItemKvf(CYbSEKvfBase* parent)
    : ProcessItemKvf("CProcessesWQ_Sorption", "Sorption_%d", parent) {}

void CProcessesWQ_SorptionItemKvf::ReadData(KvfNode* section) {
  ProcessItemKvf::ReadData(section);
  LinkReadItem<CProcessesWQ_SorptionListKvf>(*this);
}

void CProcessesWQ_SorptionItemKvf::ExchangeKeys(KeyExchange& keys) {
  keys("Name", name_);
  keys("Type", Type).OneOf(kSorptionTypes);
  keys("Species", Species);
  keys("SorbedSpecies", SorbedSpecies);
  keys("IsothermType", IsothermType).OneOf(kIsotherms);
  keys("KineticType", KineticType).OneOf(kKinetics);
  keys("EQSorptionFraction", EQSorptionFraction).Quantity(quantity::kFraction);
  keys("BiasFactor", BiasFactor).Quantity(quantity::kFactor);
}

int CProcessesWQ_SorptionItemKvf::ValidateData() {
  const auto refuse = [this](const char* text, const char* key) {
    AddError(text, key, GetName());
    return 0;
  };
  if (IsNameTaken(*this)) return refuse("Duplicate Sorption Name.", "Name");
  if (Species.empty()) return refuse("Species can not be empty", "Species");
  if (SorbedSpecies.empty()) return refuse("Sorbed Species can not be empty", "SorbedSpecies");
  const auto* species = Important(kSpecies);
  for (const auto& [name, key] : {std::pair{&Species, "Species"}, std::pair{&SorbedSpecies, "SorbedSpecies"}})
    if (species && !species->FindByName(*name))
      AddWarning("The process names a species that the setup does not have", key, *name);
  return 1;
}

std::vector<Mend> CProcessesWQ_SorptionItemKvf::MendsOf(const Finding& finding) const {
  const auto* species = Important(kSpecies);
  if (!species) return {};
  if (finding.key == "Species") return MendsByNames(finding.key, species->NamesOfType(CSpeciesItemKvf::kDissolved));
  if (finding.key == "SorbedSpecies") return MendsByNames(finding.key, species->NamesOfType(CSpeciesItemKvf::kSorbed));
  return {};
}

void CProcessesWQ_SorptionItemKvf::TakeMend(const Mend& mend) {
  (mend.key == "Species" ? Species : SorbedSpecies) = mend.value;
}

CProcessesWQ_SorptionListKvf::CProcessesWQ_SorptionListKvf(CYbSEKvfBase* parent)
    : CTvnMasterList("CProcessesWQ_SorptionListKvf", "Sorption_Processes", "Sorp_", parent) {}

// ---- Both

CProcessesWQKvf::CProcessesWQKvf(CYbSEKvfBase* parent)
    : CYbSEKvfGroupBase("Water Quality Sorption and Decay", "Processes", parent) {
  SetAbbreviatedTitle("WQ Sorption and Decay Processes");
  SetPage(kProcessesPage);
  TakesPartWhen(SorptionAndDecayModelled());
  decays_ = NewImportantChild<CProcessesWQ_DecayListKvf>(kDecays);
  sorptions_ = NewImportantChild<CProcessesWQ_SorptionListKvf>(kSorptions);
}

Condition SorptionAndDecayModelled() {
  return Component(&CModelCompKvf::WQ) && !Method(&CModelCompKvf::ADPTRadio, kParticleTracking) &&
         (WaterQualityProcesses(kSorptionAndDecay) || WaterQualityProcesses(kColloids));
}

namespace {

template <class List>
Condition AnyIn(const char* sentence, ImportantName<List> name) {
  return Condition::Sentence(sentence, [name](const CYbSEKvfBase& node) {
    const auto* list = node.Important(name);
    return list && list->GetItemCount() > 0;
  });
}

}  // namespace

Condition AnyDecay() { return AnyIn("there is a decay process", kDecays); }
Condition AnySorption() { return AnyIn("there is a sorption process", kSorptions); }

}  // namespace tervane
