// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/species_pages.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "forms/table_of.h"
#include "pages/why.h"
#include "platform/text.h"
#include "simspec/conditions.h"
#include "wqpt/pages.h"
#include "wqpt/processes.h"
#include "wqpt/sources.h"
#include "wqpt/species.h"
#include "wqpt/species_matrix.h"

namespace tervane {

namespace {

/// The species, and below them where each takes part.
class CSpeciesDlg : public PageOf<CSpeciesListKvf> {
 public:
  using PageOf::PageOf;

  void SetData() override { isCurrent_ = false; }
  /// Computed when it is asked for: a page may be made for its labels alone.
  SpeciesMatrix& Matrix() {
    if (!std::exchange(isCurrent_, true)) matrix_ = MatrixOfSpecies(*Node().GetRoot());
    return matrix_;
  }

 protected:
  void Describe(PageForm& form) override {
    DescribeSpecies(form);
    DescribeMatrix(form);
  }

 private:
  void DescribeSpecies(PageForm& form);
  void DescribeMatrix(PageForm& form);
  void AddMetabolite(const CSpeciesItemKvf& parent);
  void DeleteWithAllThatNamesIt(const CSpeciesItemKvf& species);

  std::shared_ptr<TableOf<CSpeciesItemKvf>> table_;
  SpeciesMatrix matrix_;
  bool isCurrent_ = false;
};

/// The name, with a number behind it where it is taken.
std::string FreeName(const std::vector<std::string>& taken, const std::string& name) {
  const auto isTaken = [&](const std::string& wanted) {
    return std::ranges::any_of(taken, [&](const std::string& other) { return EqualIgnoringCase(other, wanted); });
  };
  std::string free = name;
  for (int number = 2; isTaken(free); ++number) free = fmt::format("{} {}", name, number);
  return free;
}

/// Rows that nobody changes.
class MatrixRows : public RowsOf<SpeciesRow> {
 public:
  explicit MatrixRows(CSpeciesDlg& page) : page_(page) {}

  int Count() const override { return static_cast<int>(page_.Matrix().rows.size()); }
  SpeciesRow& At(int row) const override { return page_.Matrix().rows[static_cast<std::size_t>(row) - 1]; }

 private:
  CSpeciesDlg& page_;
};

void CSpeciesDlg::DescribeMatrix(PageForm& form) {
  auto table = std::make_shared<TableOf<SpeciesRow>>(std::make_shared<MatrixRows>(*this));
  table->Value("Species", [](const SpeciesRow& row) { return row.name; }).Key("Name").Width(110);
  const std::vector<std::string> places = PlacesOfSpecies();
  for (std::size_t place = 0; place < places.size(); ++place) {
    // Two words, one above the other.
    std::string head = places[place];
    std::ranges::replace(head, ' ', '\n');
    table->Value(head, [place](const SpeciesRow& row) { return SpeciesUseText(row.uses[place]); })
        .Key("Include")
        .Width(head.find("concentration") == std::string::npos ? 90 : 106)
        .ToolTipOf([this, place](SpeciesRow& row) {
          CYbSEKvfBase* node = row.uses[place].node;
          return node ? WhyTakesPart(Context().document, *node).Text("takes part", "takes no part") : std::string();
        })
        .Link([this, place](SpeciesRow& row) {
          if (row.uses[place].node && Context().selectNode) Context().selectNode(*row.uses[place].node);
        });
  }
  PageForm& group = form.Group("Where the species take part");
  group.Table(table);
  group
      .Notice([this] {
        std::vector<std::string> names;
        for (const auto& [name, node] : Matrix().withoutSpecies) names.push_back(name);
        return fmt::format("No species of the setup is named by {}", fmt::join(names, "; "));
      })
      .ShownWhen("a process or source names no species of the setup",
                 [this] { return !Matrix().withoutSpecies.empty(); });
}

void CSpeciesDlg::AddMetabolite(const CSpeciesItemKvf& parent) {
  const std::string name = parent.GetName();
  CSpeciesItemKvf* metabolite = Node().AddItem();
  metabolite->SetName(FreeName(Node().Names(), name + " metabolite"));
  if (auto* decays = Node().Important(kDecays)) {
    std::vector<std::string> names;
    bool decaysAlready = false;
    for (int number = 1; number <= decays->GetItemCount(); ++number) {
      names.push_back(decays->GetItem(number)->GetName());
      decaysAlready = decaysAlready || EqualIgnoringCase(decays->GetItem(number)->Species, name);
    }
    if (!decaysAlready) {
      CProcessesWQ_DecayItemKvf* decay = decays->AddItem();
      decay->SetName(FreeName(names, fmt::format("{} to {}", name, metabolite->GetName())));
      decay->Species = name;
    }
  }
  Node().RefreshDependents();
  Node().SetRevalidateAll();
  UpdateDoc(kTreeRebuilt | kDataChanged, fmt::format("Add Metabolite of {}", name));
}

void CSpeciesDlg::DeleteWithAllThatNamesIt(const CSpeciesItemKvf& species) {
  const std::string name = species.GetName();
  auto* processes = Node().Important(kProcesses);
  auto* sources = Node().Important(kSources);
  const auto isIt = [&name](const std::string& other) { return EqualIgnoringCase(other, name); };
  std::vector<std::string> told;
  // From the last to the first, so that the numbers in front stay.
  const auto forEach = [&](auto* list, const auto& names, const auto& title, const auto& take) {
    for (int number = list ? list->GetItemCount() : 0; number >= 1; --number)
      if (names(*list->GetItem(number))) take(*list, number, title(*list->GetItem(number)));
  };
  const auto all = [&](const auto& take) {
    const auto named = [](const auto& item) { return item.GetName(); };
    forEach(
        processes ? &processes->Decays() : nullptr, [&](const auto& item) { return isIt(item.Species); }, named, take);
    forEach(
        processes ? &processes->Sorptions() : nullptr,
        [&](const auto& item) { return isIt(item.Species) || isIt(item.SorbedSpecies); }, named, take);
    forEach(
        sources, [&](const auto& item) { return isIt(item.Species); }, [](const auto& item) { return item.SourceName; },
        take);
  };
  all([&](auto&, int, const std::string& title) { told.push_back(title); });
  if (!told.empty() &&
      Outside().Ask(fmt::format("{} is named by\n\n{}\n\nDelete these too?", name, fmt::join(told, "\n")),
                    Host::Icon::Question, Host::Buttons::YesNo) != Host::Answer::Yes)
    return;
  all([](auto& list, int number, const std::string&) { list.DeleteItem(number, 1); });
  Node().DeleteItem(Node().GetNumberWhatIs(&species), 1);
  Node().SetRevalidateAll();
  UpdateDoc(kTreeRebuilt | kItemDeleted | kDataChanged, fmt::format("Delete {} and What Names It", name));
}

void CSpeciesDlg::DescribeSpecies(PageForm& form) {
  using Species = CSpeciesItemKvf;
  CSpeciesListKvf& n = Node();
  table_ = std::make_shared<TableOf<Species>>(n);
  table_->ReportCurrentRow();
  const auto& table = table_;
  table->ItemName("Species");
  const auto when = [&n](Condition rule) { return [&n, rule = std::move(rule)] { return rule.Holds(n); }; };
  // Particles are of one species.
  const auto isNeverTracked = [&n, tracked = Method(&CModelCompKvf::ADPTRadio, kParticleTracking)](Species& species) {
    return tracked.Holds(n) && &species != n.GetItem(1);
  };
  const auto isNotOfType = [isNeverTracked](std::initializer_list<const char*> types) {
    return [isNeverTracked, of = std::vector<std::string>(types.begin(), types.end())](Species& species) {
      return isNeverTracked(species) ||
             !(species.TypeStr.empty() || std::ranges::find(of, species.TypeStr) != of.end());
    };
  };

  table->Check("Include", &Species::Include).Key("Include").Width(60).GreyWhen(isNeverTracked);
  table
      ->Value(
          "Name", [](const Species& species) { return species.GetName(); },
          [](Species& species, const std::string& name) { species.SetName(name); })
      .Key("Name")
      .Width(150)
      .Hint(kTreeRebuilt | kDataChanged)
      .GreyWhen(isNeverTracked);
  table
      ->Choice(
          "Type", [](const Species& species) { return species.Type; },
          [&n](Species& species, int type) {
            species.SetType(type);
            n.RefreshDependents();
          },
          CellChoices::Of(kSpeciesTypeChoices))
      .Key("Type")
      .Width(130)
      .Hint(kTreeRebuilt | kDataChanged)
      .GreyWhen(isNeverTracked);
  table->Value("ET Uptake Factor", &Species::PlantUptakeTransFactor)
      .Width(110)
      .Format("%.6g")
      .ShownWhen(
          when(OwnEngine() && Component(&CModelCompKvf::ET) && WaterQualityComponent(&CModelCompWQKvf::PlantUptake)))
      .GreyWhen(isNotOfType({"0"}));
  table->Value("Solubility in Surface Water", &Species::SolubilityinSurfaceWater)
      .Width(160)
      .Format("%.6g")
      .ShownWhen(when(OwnEngine() && Component(&CModelCompKvf::OL) && WaterQualityComponent(&CModelCompWQKvf::OL)))
      .GreyWhen(isNotOfType({"0", "2"}));
  table->Choice("Type for Collids", &Species::TypeforColloids)
      .Width(150)
      .ShownWhen(when(OwnEngine() && WaterQualityProcesses(kColloids)))
      .GreyWhen(isNeverTracked);
  form.Table(table);
  form.Button("Add Metabolite",
              [this] {
                if (const Species* species = table_->Current()) AddMetabolite(*species);
              })
      .ToolTip("Adds a species that the current one becomes, and the decay of that one where it has none")
      .EnabledWhen("there is a current species", [this] { return table_->Current() != nullptr; });
  form.Button("Delete Species and What Names It",
              [this] {
                if (const Species* species = table_->Current()) DeleteWithAllThatNamesIt(*species);
              })
      .Beside()
      .ToolTip("Deletes the current species with the processes and sources that name it, after a question")
      .EnabledWhen("there is a current species", [this] { return table_->Current() != nullptr; });
}

}  // namespace

std::span<const PageRow> SpeciesPages() {
  static constexpr PageRow kRows[] = {PageIs<CSpeciesDlg, CSpeciesListKvf>(kSpeciesPage)};
  return kRows;
}

}  // namespace tervane
