// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/simspec/modflow_pages.h"

#include <algorithm>

#include "forms/table_of.h"
#include "simspec/conditions.h"
#include "simspec/modflow_output.h"
#include "simspec/modflow_solvers.h"
#include "simspec/pages.h"

namespace tervane {

namespace {

Condition WithTimeStepOutput() { return WithEngine({kEngineModflow96, kEngineModflow2000}); }
bool HasTimeStepOutput(const CYbSEKvfBase& node) { return WithTimeStepOutput().Holds(node); }

// ---- Solvers

Control& AddField(PageForm& form, const SolverField& field) {
  const std::string label(field.label);
  if (float* const* number = std::get_if<float*>(&field.value)) return form.Number(label, **number);
  int& value = *std::get<int*>(field.value);
  if (field.kind == SolverField::Kind::Check) return form.Check(label, value);
  if (field.kind == SolverField::Kind::Number) return form.Integer(label, value);
  std::vector<std::string> options;
  for (const KeyChoice& choice : field.choices) options.emplace_back(choice.text);
  return form.Radio(label, value, options);
}

std::shared_ptr<PageForm> SolverForm(CCompControlParaModBase& solver) {
  auto form = std::make_shared<PageForm>(solver);
  std::string_view frame;
  PageForm* place = form.get();
  for (const SolverField& field : solver.Fields()) {
    if (field.frame != frame) place = field.frame.empty() ? form.get() : &form->Group(std::string(field.frame));
    frame = field.frame;
    Control& control = AddField(*place, field);
    if (!field.enabled.IsAlways()) control.EnabledWhen(field.enabled);
    if (!field.key.empty()) control.Key(std::string(field.key));
    if (field.then) control.Then([then = field.then] { return then(), 0; });
  }
  return form;
}

void DescribeSolvers(PageForm& form, CCompControlParaModKvf& n) {
  const auto place = [&n] {
    const std::vector<int> solvers = SolversOfEngine(EngineOf(n));
    const auto found = std::ranges::find(solvers, n.SolverOption);
    return found == solvers.end() ? -1 : static_cast<int>(found - solvers.begin());
  };
  form.Choice(
          "Solver", place,
          [&n](int chosen) {
            const std::vector<int> solvers = SolversOfEngine(EngineOf(n));
            if (chosen >= 0 && chosen < static_cast<int>(solvers.size()))
              n.SolverOption = solvers[static_cast<std::size_t>(chosen)];
          },
          [&n] {
            std::vector<std::string> texts;
            for (const int solver : SolversOfEngine(EngineOf(n))) texts.emplace_back(TextOf(kModflowSolvers, solver));
            return texts;
          })
      .Key("SolverOption");
  // In the order of the values of the option.
  form.SubForms({SolverForm(*n.Child<CCompControlParaModSORKvf>()), SolverForm(*n.Child<CCompControlParaModSIPKvf>()),
                 SolverForm(*n.Child<CCompControlParaModPCG4Kvf>()), SolverForm(*n.Child<CCompControlParaModPCG2Kvf>()),
                 SolverForm(*n.Child<CCompControlParaModLMGKvf>())},
                [&n] { return n.SolverOption; });
  form.MendWhenShown("Choose a Solver of the Engine", [&n, place] {
    if (SolversOfEngine(EngineOf(n)).empty() || place() >= 0) return false;
    n.SolverOption = kSolverSOR;
    return true;
  });
}

// ---- Packages

void DescribePackages(PageForm& form, CCompControlParaModPackageKvf& n) {
  const Condition flows = ModflowComponent(&CModModelCompKvf::Subsurface);
  form.Group("Relative permeability")
      .Radio("", n.WeightingRelPermOption)
      .EnabledWhen(flows && SubsurfaceIs({kVariablySaturated, kVariablySaturatedWithAir}));
  PageForm& rewetting = form.Group("Rewetting");
  const Condition rewets = flows && SubsurfaceIs({kWithRewetting});
  rewetting.Check("Use wetting threshold for re-wetting cells", n.WettingThreshold).EnabledWhen(rewets);
  rewetting.Number("Head assigned to cells that turns dry (HDRY)", n.HDRY).EnabledWhen(rewets);
  rewetting.Number("Wetting factor (WETFCT)", n.HDRY2).EnabledWhen(rewets);
}

// ---- Output

std::shared_ptr<TableForm> OutputDateGrid(COutputModDatesListKvf& dates) {
  using Item = COutputModDateItemKvf;
  auto table = std::make_shared<TableOf<Item>>(dates);
  table->ItemName("Output Date");
  table->Value("Output dates", &Item::Date).Width(145).Format("%Y-%m-%d %H:%M");
  return table;
}

std::shared_ptr<TableForm> OutputTimestepGrid(COutputModTimestepListKvf& steps) {
  using Item = COutputModTimestepItemKvf;
  auto table = std::make_shared<TableOf<Item>>(steps);
  table->ItemName("Output Time Step");
  table
      ->Value(
          "Stress period", [](Item& item) { return item.StressPeriod; },
          [](Item& item, int period) -> std::string {
            if (period < 0) return "a whole number of at least 0 was expected";
            item.StressPeriod = period;
            return {};
          })
      .Key("StressPeriod")
      .Width(80);
  table->Value("Time step", &Item::Timestep).Width(65);
  return table;
}

std::shared_ptr<TableForm> OutputPackageGrid(COutputModPackageListKvf& packages) {
  using Item = COutputModPackageItemKvf;
  auto table = std::make_shared<TableOf<Item>>(
      std::make_shared<RowsThatHold<Item>>(packages, [](Item& item) { return item.IsDlgUsedInSetup() != 0; }));
  table->RowHeads([](Item& item) { return std::string(item.DisplayName()); });
  const NoCell none{"the package does not write in this format"};
  table
      ->Value("ASCII",
              [none](Item& item) -> CellPlace {
                if (item.OffersAscii()) return CheckOf{&item.ASCII};
                return none;
              })
      .Key("ASCII")
      .Width(50);
  table
      ->Value("Binary",
              [none](Item& item) -> CellPlace {
                if (item.OffersBinary()) return CheckOf{&item.Binary};
                return none;
              })
      .Key("Binary")
      .Width(50);
  return table;
}

void DescribeOutput(PageForm& form, COutputModKvf& n) {
  PageForm& control = form.Group("Output Control options");
  const Condition isEquidistant = WithEngine({kEngineModflowSurfact}) && Is(n.OutputControlOption, n.kEquidistant);
  Control& options = control.Radio("", n.OutputControlOption);
  // Time steps stand in the place of dates: the table behind the option tells them.
  options.options = [&n, texts = options.Options()] {
    std::vector<std::string> shown = texts;
    if (HasTimeStepOutput(n)) shown[COutputModKvf::kSpecified].clear();
    return shown;
  };
  options.OptionEnabledWhen(n.kEquidistant, !WithTimeStepOutput());
  control.Number("dt =", n.StoringTimeStepHours).EnabledWhen(isEquidistant);
  control.Integer("n =", n.StoringTimeStep).EnabledWhen(Is(n.OutputControlOption, n.kEveryNthTimeStep));
  form.Table(OutputDateGrid(n.Dates()))
      .ShownWhen(!WithTimeStepOutput())
      .EnabledWhen(Is(n.OutputControlOption, n.kSpecified));
  form.Table(OutputTimestepGrid(n.TimeSteps())).ShownWhen(WithTimeStepOutput());
  form.Table(OutputPackageGrid(n.Packages()));
  form.Check("Output for particle tracking (MODPATH)", n.ModPath);
  form.MendWhenShown("Choose Output of the Engine", [&n] {
    if (!HasTimeStepOutput(n) || n.OutputControlOption != n.kEquidistant) return false;
    n.OutputControlOption = n.kEveryNthTimeStep;
    return true;
  });
}

}  // namespace

std::span<const PageRow> ModflowPages() {
  static constexpr PageRow kRows[] = {
      DescribedBy<DescribeSolvers>(kControlModflowPage),
      DescribedBy<DescribePackages>(kModflowPackagePage),
      DescribedBy<DescribeOutput>(kModflowOutputPage),
  };
  return kRows;
}

}  // namespace tervane
