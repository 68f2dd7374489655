// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/wqpt/process_pages.h"

#include "forms/table_of.h"
#include "simspec/conditions.h"
#include "wqpt/pages.h"
#include "wqpt/processes.h"

namespace tervane {

namespace {

/// The choices of a species by name; the first, empty one clears the cell. A name that is gone shows as an empty cell.
CellChoices SpeciesChoices(std::vector<std::string> names) {
  names.insert(names.begin(), std::string());
  return CellChoices::Texts(std::move(names));
}

/// The name of a species that is there.
template <class Item>
std::string PresentSpecies(const Item& item, const std::string& name) {
  const auto* species = item.Important(kSpecies);
  return species && species->FindByName(name) ? name : std::string();
}

template <class Item>
void NameColumn(TableOf<Item>& table) {
  table
      .Value(
          "Name", [](const Item& item) { return item.GetName(); },
          [](Item& item, const std::string& name) { item.SetName(name); })
      .Key("Name")
      .Width(110)
      .Hint(kTreeRebuilt | kDataChanged);
}

void DescribeDecays(PageForm& form, CProcessesWQ_DecayListKvf& list) {
  using Decay = CProcessesWQ_DecayItemKvf;
  auto table = std::make_shared<TableOf<Decay>>(list);
  table->ItemName("Decay");
  NameColumn(*table);
  table
      ->Choice("Species", &Decay::Species,
               [&list](Decay&) {
                 const auto* species = list.Important(kSpecies);
                 return CellChoices::Texts(species ? species->NamesWithoutType(CSpeciesItemKvf::kFixed)
                                                   : std::vector<std::string>());
               })
      .Width(120)
      .ShownAs([](const Decay& decay) { return PresentSpecies(decay, decay.Species); })
      .Hint(kTreeRebuilt | kDataChanged);
  const auto temperatureCounts = [](Decay& decay) { return !decay.IsTemperatureDependant; };
  table->Check("Temperature\nDependant Decay", &Decay::IsTemperatureDependant).Key("IsTemperatureDependant").Width(115);
  table->Value("Reference \n temperature", &Decay::Temperature).Width(90).Format("%.6g").GreyWhen(temperatureCounts);
  table->Value("Temp-decay\n exponent", &Decay::TemperatureExponent)
      .Width(90)
      .Format("%.6g")
      .GreyWhen(temperatureCounts);
  table->Check("Water Content\nDependant Decay", &Decay::IsWaterContentDependant)
      .Key("IsWaterContentDependant")
      .Width(115);
  table->Value("Water content\ndecay exponent", &Decay::WaterContentExponent)
      .Width(110)
      .Format("%.6g")
      .GreyWhen([](Decay& decay) { return !decay.IsWaterContentDependant; });
  form.Group("Decay").Table(table);
}

void DescribeSorptions(PageForm& form, CProcessesWQ_SorptionListKvf& list) {
  using Sorption = CProcessesWQ_SorptionItemKvf;
  auto table = std::make_shared<TableOf<Sorption>>(list);
  table->ItemName("Sorption");
  NameColumn(*table);
  const auto ofType = [&list](int type) {
    return [&list, type](Sorption&) {
      const auto* species = list.Important(kSpecies);
      return SpeciesChoices(species ? species->NamesOfType(type) : std::vector<std::string>());
    };
  };
  table
      ->Choice("Sorption Type", &Sorption::Type,
               [&list, colloids = WaterQualityProcesses(kColloids)](Sorption&) {
                 const KeyChoices all = kSorptionTypes;
                 return CellChoices::Of(colloids.Holds(list) ? all : all.first(kSorptionTypesWithoutColloids));
               })
      .Width(130)
      .Hint(kTreeRebuilt | kDataChanged);
  table->Choice("Species", &Sorption::Species, ofType(CSpeciesItemKvf::kDissolved))
      .Width(110)
      .ShownAs([](const Sorption& sorption) { return PresentSpecies(sorption, sorption.Species); });
  table->Choice("Sorbed Species", &Sorption::SorbedSpecies, ofType(CSpeciesItemKvf::kSorbed))
      .Width(110)
      .ShownAs([](const Sorption& sorption) { return PresentSpecies(sorption, sorption.SorbedSpecies); });
  const auto hasNoIsotherm = [](Sorption& sorption) {
    return sorption.Type == Sorption::kFiltration || sorption.Type == Sorption::kColloidSource;
  };
  table->Choice("Equilibrium Isotherm", &Sorption::IsothermType)
      .Width(130)
      .GreyWhen(hasNoIsotherm)
      .Hint(kTreeRebuilt | kDataChanged);
  table->Choice("Kinetic Type", &Sorption::KineticType)
      .Width(110)
      .GreyWhen(hasNoIsotherm)
      .Hint(kTreeRebuilt | kDataChanged);
  table->Value("Equilibrium\nSorption Fraction", &Sorption::EQSorptionFraction)
      .Width(115)
      .Format("%.6g")
      .GreyWhen([](Sorption& sorption) { return sorption.Type != Sorption::kEquilibriumKinetic; });
  table->Value("Sorption Bias Factor\nfor Dual Porosity", &Sorption::BiasFactor).Width(130).Format("%.6g");
  form.Group("Sorption").Table(table);
}

void DescribeProcesses(PageForm& form, CProcessesWQKvf& n) {
  DescribeDecays(form, n.Decays());
  DescribeSorptions(form, n.Sorptions());
}

}  // namespace

std::span<const PageRow> ProcessPages() {
  static constexpr PageRow kRows[] = {DescribedBy<DescribeProcesses>(kProcessesPage)};
  return kRows;
}

}  // namespace tervane
