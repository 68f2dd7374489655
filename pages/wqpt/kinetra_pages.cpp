// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/wqpt/kinetra_pages.h"

#include <fmt/format.h>

#include "forms/table_of.h"
#include "pages/parts/file_controls.h"
#include "platform/units.h"
#include "wqpt/kinetra_parameters.h"
#include "wqpt/kinetra_specification.h"
#include "wqpt/kinetra_values.h"
#include "wqpt/pages.h"

namespace tervane {

namespace {

// ---- The templates

struct CompartmentWords {
  const char *title, *enable, *methodKey, *frequencyKey;
};
constexpr CompartmentWords kCompartmentWords[kKinetraCompartments] = {
    {"Overland flow and Ground surface", "Enable Kinetra for Overland flow and Ground surface", "Method_OL", "Freq_OL"},
    {"Unsaturated zone", "Enable Kinetra for Unsaturated zone", "Method_UZ", "Freq_UZ"},
    {"Saturated zone", "Enable Kinetra for Saturated zone", "Method_SZ", "Freq_SZ"}};

/// How much of each kind a template declares.
std::string CountsOf(const KinetraTemplate& content) {
  const auto ofModel = [](const std::vector<CKinetraSolverItem>& items) {
    return std::ranges::count_if(items, &CKinetraSolverItem::IsModelParameter);
  };
  const auto total = [](const std::vector<CKinetraSolverItem>& items) {
    return static_cast<std::ptrdiff_t>(items.size());
  };
  return fmt::format(
      "State variables: {}\nUser specified constants: {}\nTervane built-in constants: {}\nUser specified forcings: {}\n"
      "Tervane built-in forcings: {}\nAuxiliary variables: {}\nProcesses: {}\nDerived output: {}",
      content.stateVariables.size(), total(content.constants) - ofModel(content.constants), ofModel(content.constants),
      total(content.forcings) - ofModel(content.forcings), ofModel(content.forcings), content.auxiliaries.size(),
      content.processes.size(), content.derivedOutputs.size());
}

class CKinetraSpecDlg : public PageOf<CKinetraSpecKvf> {
 public:
  using PageOf::PageOf;

  void OnRefresh() override {
    Node().RefreshTemplates();
    Node().SetRevalidateAll();
    UpdateDoc(kTreeRebuilt | kDataChanged, "Refresh Templates");
  }

 protected:
  void Describe(PageForm& form) override {
    for (int compartment = 0; compartment < kKinetraCompartments; ++compartment) DescribeTemplate(form, compartment);
  }

 private:
  void DescribeTemplate(PageForm& page, int compartment) {
    const CompartmentWords& words = kCompartmentWords[compartment];
    CKinetraSolver& solver = Node().Solver(compartment);
    const Condition isActive = CompartmentActive(1 << compartment);
    PageForm& form = page.Group(words.title);
    form.Check(words.enable, solver.enabled)
        .EnabledWhen(CompartmentMayHaveTemplate(compartment))
        .Hint(kTreeRebuilt | kDataChanged)
        .Revalidates();
    form.File("Template file", solver.file)
        .Filter("Kinetra template files (*.kinetra) |*.kinetra|All Files (*.*) |*.*||")
        .DefaultExtension("kinetra")
        .EnabledWhen(isActive)
        .Hint(kTreeRebuilt | kDataChanged)
        .Revalidates()
        .Then([this, compartment] {
          // The name stands already: another one is a change in any case.
          CKinetraSolver& changed = Node().Solver(compartment);
          const FileName file = std::exchange(changed.file, FileName());
          Node().SetTemplate(compartment, file, true);
          return 0;
        });
    form.Button("Edit...", [this, compartment] { EditDataFile(Context(), Node(), Node().Solver(compartment).file); })
        .EnabledWhen(isActive);
    form.Choice("Integration method", solver.method).EnabledWhen(isActive);
    form.Integer("Update frequency", solver.frequency).EnabledWhen(isActive);
    const auto isOther = [&solver, isActive, this] {
      return isActive.Holds(Node()) && solver.Content().IsOtherOnDisk();
    };
    constexpr const char* kIsOther = "the template has changed on disk";
    form.Notice([&solver] { return fmt::format("The template {} has changed on disk", solver.file.Text()); })
        .ShownWhen(kIsOther, isOther);
    form.Button("Refresh", [this] { OnRefresh(); })
        .Beside()
        .ToolTip("Reads the templates of all active compartments again, as one step that can be undone")
        .ShownWhen(kIsOther, isOther);
    form.Notice(
        [&solver] { return solver.Content().problem.empty() ? CountsOf(solver.Content()) : solver.Content().problem; });
  }
};

// ---- Bindings

/// The constants or forcings of a template, which come and go with it.
class BindingRows : public RowsOf<KinetraBinding> {
 public:
  explicit BindingRows(CKinetraCompSpecKvf& node) : node_(node) {}

  int Count() const override { return static_cast<int>(node_.Bindings().size()); }
  KinetraBinding& At(int row) const override { return node_.Bindings()[static_cast<std::size_t>(row) - 1]; }
  const void* Identity(int row) const override { return At(row).item; }

 private:
  CKinetraCompSpecKvf& node_;
};

CellChoices ParameterChoices(const CKinetraCompSpecKvf& node) {
  CellChoices choices;
  for (const KinetraParameter& parameter :
       node.IsOfForcings() ? KinetraForcingsFor(node.Mask()) : KinetraConstantsFor(node.Mask()))
    choices.emplace_back(parameter.idCode, fmt::format("{}\t{}", parameter.idCode, parameter.name));
  return choices;
}

CellChoices UnitChoicesOf(int dataType) {
  CellChoices choices;
  const KinetraParameter* parameter = FindKinetraParameter(dataType);
  const ItemType* quantity = parameter ? FindItemType(parameter->quantity) : nullptr;
  if (!quantity) return choices;
  for (const int key : quantity->unitKeys)
    if (const Unit* unit = FindUnit(key)) choices.emplace_back(key, fmt::format("{}\t{}", key, unit->abbreviation));
  return choices;
}

/// What is shown of a code: nothing while it is unbound, the number where no entry has it.
std::string ShownOf(const CellChoices& choices, int code) {
  const int place = choices.IndexOf(std::to_string(code));
  if (place >= 0) return choices[static_cast<std::size_t>(place)].text;
  return code == -1 ? std::string() : std::to_string(code);
}

void DescribeBindings(PageForm& form, CKinetraCompSpecKvf& n) {
  auto table = std::make_shared<TableOf<KinetraBinding>>(std::make_shared<BindingRows>(n));
  const auto isOfUser = [](KinetraBinding& binding) { return !binding.item->IsModelParameter(); };
  const char* key = n.IsOfForcings() ? "Forcing" : "Constant";
  table
      ->Value(n.IsOfForcings() ? "Forcing Name" : "Constant Name",
              [](const KinetraBinding& binding) { return binding.item->symbol; })
      .Key(key)
      .Width(160)
      .ToolTipOf([](KinetraBinding& binding) { return binding.item->description; });
  table->Value("Tervane\nparamater", [](const KinetraBinding& binding) { return binding.item->IsModelParameter(); })
      .Key(key)
      .Width(80);
  table
      ->Choice(
          "Tervane Parameter\nData Type", [](const KinetraBinding& binding) { return binding.dataType; },
          [](KinetraBinding& binding, int code) {
            binding.dataType = code;
            binding.unit = -1;
          },
          [&n](KinetraBinding&) { return ParameterChoices(n); })
      .Key(key)
      .Width(230)
      .ShownAs([&n](KinetraBinding& binding) { return ShownOf(ParameterChoices(n), binding.dataType); })
      .GreyWhen(isOfUser);
  table
      ->Choice(
          "Unit used in\nKinetra template", [](const KinetraBinding& binding) { return binding.unit; },
          [](KinetraBinding& binding, int unit) { binding.unit = unit; },
          [](KinetraBinding& binding) { return UnitChoicesOf(binding.dataType); })
      .Key(key)
      .Width(150)
      .ShownAs([](KinetraBinding& binding) { return ShownOf(UnitChoicesOf(binding.dataType), binding.unit); })
      .GreyWhen(isOfUser);
  form.Table(table);
}

// ---- Values in the soil

template <class Layers, class Layer>
void DescribeTemplateLayers(PageForm& form, Layers& n) {
  form.Choice("Spatial Distribution:", n.DistributionType).Hint(kTreeRebuilt | kDataChanged).Revalidates();
  form.Number("Static", n.Distribution_UniformValue).ShownWhen(Is(n.DistributionType, kKinetraUniform));
  auto table = std::make_shared<TableOf<Layer>>(n);
  table->ItemName("Layer");
  table->Value("Name", &Layer::Name).Width(180).Hint(kTreeRebuilt | kDataChanged);
  form.Group("Layers", Is(n.DistributionType, kKinetraByLayers)).Table(table);
}

void DescribeConstantLayers(PageForm& form, CKinetraConstantsUZWQLayerListKvf& n) {
  DescribeTemplateLayers<CKinetraConstantsUZWQLayerListKvf, CKinetraConstantsUZWQLayerItemKvf>(form, n);
}
void DescribeForcingLayers(PageForm& form, CKinetraForcingsUZWQLayerListKvf& n) {
  DescribeTemplateLayers<CKinetraForcingsUZWQLayerListKvf, CKinetraForcingsUZWQLayerItemKvf>(form, n);
}

}  // namespace

std::span<const PageRow> KinetraPages() {
  static constexpr PageRow kRows[] = {
      PageIs<CKinetraSpecDlg, CKinetraSpecKvf>(kKinetraSpecificationPage),
      DescribedBy<DescribeBindings>(kKinetraBindingPage),
      DescribedBy<DescribeConstantLayers>(kKinetraConstantLayersPage),
      DescribedBy<DescribeForcingLayers>(kKinetraForcingLayersPage),
  };
  return kRows;
}

}  // namespace tervane
