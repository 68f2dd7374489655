// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/species_matrix.h"

#include <algorithm>
#include <map>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "platform/text.h"
#include "wqpt/decay_entries.h"
#include "wqpt/sorption_entries.h"
#include "wqpt/sources.h"
#include "wqpt/species_entries.h"

namespace tervane {

namespace {

using State = SpeciesUse::State;

/// Whether all values at and below an entry are as a new entry has them.
bool IsAtDefault(const CYbSEKvfBase& entry) {
  if (const auto* area = dynamic_cast<const CData2DKvf*>(&entry))
    return area->Type == CData2DKvf::kUniform && SameNumber(area->FixedValue, area->Kind().fixedValue);
  if (const auto* soil = dynamic_cast<const SoilValuesKvf*>(&entry))
    return soil->DistributionType == SoilValuesKvf::kUniform &&
           SameNumber(soil->Distribution_UniformValue, soil->Kind().uniformValue);
  if (const auto* forcing = dynamic_cast<const C2DStationBasedDataKvf*>(&entry))
    return forcing->DistributionType == StationOwnerKvf::kUniform && forcing->Global().TYPE == CGlobalKvf::kConstant &&
           SameNumber(forcing->Global().FIXED_VALUE, 0);
  for (CYbSEKvfBase* child = entry.GetFirstChild(); child; child = entry.GetNextChild(child))
    if (child->IsDlgUsedInSetup() && !IsAtDefault(*child)) return false;
  return true;
}

/// Adds an entry of a list to what a species has at a place: the most that any of its entries is counts.
void Add(SpeciesUse& use, CYbSEKvfBase& entry, bool isListUsed) {
  if (use.state == State::Set) return;
  const bool isUsed = isListUsed && entry.IsDlgUsedInSetup();
  const State state = !isUsed ? State::Off : IsAtDefault(entry) ? State::Default : State::Set;
  // Of two that are off, the one in a list that takes part tells more.
  const bool tellsMore = state > use.state || (state == use.state && isListUsed && !use.isOfUsedList);
  if (use.node && !tellsMore) return;
  use.state = state;
  use.isOfUsedList = isListUsed;
  use.node = &entry;
}

void AddName(SpeciesUse& use, const std::string& name) {
  if (std::ranges::find(use.names, name) == use.names.end()) use.names.push_back(name);
}

/// What a place is called, by the class of the lists whose entries stand there.
struct Place {
  const char* title;
  bool (*isThere)(const CYbSEKvfBase& list);
};
template <class List>
constexpr Place At(const char* title) {
  return {title, [](const CYbSEKvfBase& list) { return dynamic_cast<const List*>(&list) != nullptr; }};
}
constexpr Place kPlaces[] = {
    At<COverlandSpeciesKvf>("Overland mass"),
    At<CDecayProcessesKvf>("Overland decay"),
    At<CUnSatInitConcenKvf>("Soil concentration"),
    At<CMacroporeTransferCoeff>("Macropore transfer"),
    At<CDecayProcessListKvf>("Soil decay"),
    At<CSorptionProcessesKvf>("Soil sorption"),
    At<CSatCompLayersInitConcentrationKvf>("Ground concentration"),
    At<CSatCompLayersInitImmobileConcentrationKvf>("Secondary concentration"),
    At<CDualPorosityTransferCoeffListKvf>("Secondary transfer"),
    At<CWQLayerDecayProcessesKvf>("Ground decay"),
    At<CWQLayerSorptionProcesses>("Ground sorption"),
    At<CSourcesWQListKvf>("Sources"),
};

/// The rows of the species that a name, an entry or a source stands for.
class Rows {
 public:
  Rows(SpeciesMatrix& matrix, const CYbSEKvfBase& root) : matrix_(matrix), root_(root) {
    if (const auto* species = root.Important(kSpecies))
      for (int number = 1; number <= species->GetItemCount(); ++number)
        places_.try_emplace(LowerCase(species->GetItemName(number)), static_cast<std::size_t>(number) - 1);
  }

  SpeciesRow* OfName(const std::string& name) {
    const auto found = places_.find(LowerCase(name));
    return found == places_.end() ? nullptr : &matrix_.rows[found->second];
  }
  /// Visits the rows of an entry, with the name of what brings it there; empty for the species itself.
  void ForEach(const CYbSEKvfBase& entry, const std::function<void(SpeciesRow&, const std::string&)>& visit) {
    const auto named = [&](const std::string& species, const std::string& by) {
      if (SpeciesRow* row = OfName(species)) visit(*row, by);
    };
    if (const auto* source = dynamic_cast<const CSourceWQItemKvf*>(&entry))
      return named(source->Species, source->SourceName);
    if (const CSpeciesItemKvf* species = SpeciesOf(entry)) return named(species->GetName(), {});
    if (const auto* decay = dynamic_cast<const CDencyItemBase*>(&entry)) {
      auto* list = root_.Important(kDecays);
      const auto* process =
          list ? static_cast<CProcessesWQ_DecayItemKvf*>(list->FindDependentItem(decay->GetId())) : nullptr;
      if (process) named(process->Species, process->GetName());
    }
    if (const auto* sorption = dynamic_cast<const CSorptionProcessesItemBase*>(&entry)) {
      auto* list = root_.Important(kSorptions);
      const auto* process =
          list ? static_cast<CProcessesWQ_SorptionItemKvf*>(list->FindDependentItem(sorption->GetId())) : nullptr;
      if (!process) return;
      named(process->Species, process->GetName());
      named(process->SorbedSpecies, process->GetName());
    }
  }

 private:
  SpeciesMatrix& matrix_;
  const CYbSEKvfBase& root_;
  std::map<std::string, std::size_t> places_;
};

}  // namespace

std::string SpeciesUseText(const SpeciesUse& use) {
  constexpr const char* kStates[] = {"", "off", "default", "set"};
  const char* state = kStates[static_cast<std::size_t>(use.state)];
  return use.names.empty() ? std::string(state) : fmt::format("{}: {}", state, fmt::join(use.names, ", "));
}

std::vector<std::string> PlacesOfSpecies() {
  std::vector<std::string> places;
  for (const Place& place : kPlaces) places.emplace_back(place.title);
  return places;
}

SpeciesMatrix MatrixOfSpecies(CYbSEKvfBase& root) {
  SpeciesMatrix matrix;
  matrix.places = PlacesOfSpecies();
  auto* species = root.Important(kSpecies);
  for (int number = 1; species && number <= species->GetItemCount(); ++number)
    matrix.rows.push_back({species->GetItemName(number), std::vector<SpeciesUse>(std::size(kPlaces))});
  Rows rows(matrix, root);

  const auto look = [&](auto&& self, CYbSEKvfBase& node) -> void {
    if (!node.HoldsSetup()) return;
    for (std::size_t place = 0; place < std::size(kPlaces); ++place) {
      if (!kPlaces[place].isThere(node)) continue;
      const bool isUsed = node.IsDataUsedInSetup() != 0;
      for (CYbSEKvfBase* entry = node.GetFirstChild(); entry; entry = node.GetNextChild(entry))
        rows.ForEach(*entry, [&](SpeciesRow& row, const std::string& by) {
          Add(row.uses[place], *entry, isUsed);
          if (!by.empty()) AddName(row.uses[place], by);
        });
      return;
    }
    for (CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child)) self(self, *child);
  };
  look(look, root);

  const auto check = [&](CYbSEKvfBase* node, const std::string& title, const std::string& name) {
    if (!rows.OfName(name)) matrix.withoutSpecies.emplace_back(fmt::format("{}: {}", title, name), node);
  };
  if (auto* processes = root.Important(kProcesses)) {
    for (int number = 1; number <= processes->Decays().GetItemCount(); ++number)
      check(processes, processes->Decays().GetItem(number)->GetName(), processes->Decays().GetItem(number)->Species);
    for (int number = 1; number <= processes->Sorptions().GetItemCount(); ++number) {
      const auto& item = *processes->Sorptions().GetItem(number);
      for (const std::string* name : {&item.Species, &item.SorbedSpecies}) check(processes, item.GetName(), *name);
    }
  }
  if (auto* sources = root.Important(kSources))
    for (int number = 1; number <= sources->GetItemCount(); ++number)
      check(sources->GetItem(number), sources->GetItem(number)->SourceName, sources->GetItem(number)->Species);
  return matrix;
}

}  // namespace tervane
