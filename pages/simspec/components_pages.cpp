// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/simspec/components_pages.h"

#include <utility>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "pages/simspec/engine_switch.h"
#include "simspec/basic_parameters.h"
#include "simspec/conditions.h"
#include "simspec/pages.h"

namespace tervane {

namespace {

/// The components with the own engine.
std::shared_ptr<PageForm> ModelCompForm(PageForm& page, CModelCompKvf& n) {
  auto form = page.NewSubForm(n);
  const Condition withWaterMovement = On(n.WM), withWaterQuality = On(n.WQ);
  form->Check("Overland Flow (OL)", n.OL).EnabledWhen(withWaterMovement).Revalidates();
  form->Choice("", n.OL_ModelType).Beside().EnabledWhen(On(n.OL));
  form->Check("Rivers and Lakes (OC)", n.River).EnabledWhen(withWaterMovement).Revalidates();
  form->Check("Unsaturated Flow (UZ)", n.UZ).EnabledWhen(withWaterMovement).Revalidates();
  form->Choice("", n.UZ_ModelType).Beside().EnabledWhen(On(n.UZ)).Revalidates();
  form->Check("Evapotranspiration (ET)", n.ET).EnabledWhen(withWaterMovement).Revalidates();
  form->Check("Saturated Flow (SZ)", n.SZ).EnabledWhen(withWaterMovement).Revalidates();
  form->Choice("", n.SZ_ModelType).Beside().EnabledWhen(On(n.SZ));
  form->Check("Include Advection-Dispersion (AD) Water Quality", n.WQ).Revalidates();
  form->Radio("", n.ADPTRadio).ShownWhen(withWaterQuality).Revalidates();
  form->Check("Use current WM simulation for Water Quality", n.UseCurrentWmSimulation).ShownWhen(withWaterQuality);
  form->File("Flow result catalogue file:", n.FilenameTvdRes)
      .Filter("Flow result catalogue file(*.tvdres) |*.tvdres|All Files (*.*) |*.*||")
      .DefaultExtension("tvdres")
      .ShownWhen(withWaterQuality && !On(n.UseCurrentWmSimulation));
  return form;
}

/// The components with one of the Modflow engines.
std::shared_ptr<PageForm> ModModelCompForm(PageForm& page, CModModelCompKvf& n, int engine) {
  auto form = page.NewSubForm(n);
  const Condition isVariablySaturated = Sentence("the flow is variably saturated", [&n, engine] {
    n.GetSubsurfaceModelType();
    return engine == kEngineModflowSurfact && n.VariablySaturated;
  });
  const Condition withSubsurface = On(n.Subsurface);
  form->Check("Subsurface", n.Subsurface);
  switch (engine) {
    case kEngineModflowSurfact:
      form->Choice(
              "", [&n] { return n.GetSubsurfaceModelType(), n.VariablySaturated; },
              [&n](int choice) { n.ChooseVariablySaturated(choice); },
              {"Block Centered Flow (BCF)", "Variably Saturated Flow"})
          .Key("Subsurface_ModelType")
          .Beside()
          .EnabledWhen(withSubsurface);
      break;
    case kEngineModflow96:
      form->Choice(
              "", [] { return 0; }, [](int) {}, {"Block Centered Flow (BCF)"})
          .Key("Subsurface_ModelType")
          .Beside()
          .EnabledWhen(withSubsurface);
      break;
    default:
      form->Choice("", n.Modflow2000_BCFType).Beside().EnabledWhen(withSubsurface);
  }
  form->Check("With cell rewetting", n.WithCellRewetting).Key("Subsurface_ModelType").EnabledWhen(!isVariablySaturated);
  form->Check("With air flow", n.WithAirFlow).Key("Subsurface_ModelType").ShownWhen(isVariablySaturated);
  form->Check("Evapotranspiration (ET)", n.ET);
  form->Check("Rivers and Lakes", n.River);
  form->Check("Recharge", n.Recharge);
  form->Choice("", n.Recharge_ModelType).Beside().EnabledWhen(WithEngine({kEngineModflowSurfact}) && On(n.Recharge));
  return form;
}

/// The engine, and the components that it knows.
class CBasicParaDlg : public PageOf<CBasicParaKvf> {
 public:
  using PageOf::PageOf;
  void SetData() override;

 protected:
  void Describe(PageForm& form) override;

 private:
  /// Tells the user what another engine does not know; gives why the engine stays.
  std::string WhyNotSwitch(int engine) const;

  int shown_ = 0;  ///< An engine that the list does not have keeps the form that was shown.
};

void CBasicParaDlg::SetData() {
  const int engine = Node().ModelType;
  if (engine >= kEngineTervane && engine <= kEngineModflow2000) shown_ = engine;
}

std::string CBasicParaDlg::WhyNotSwitch(int engine) const {
  std::vector<std::string> unknown = UnknownToEngine(Node(), engine);
  if (unknown.empty()) return {};
  const std::string_view before = TextOf(kEngines, Node().ModelType);
  constexpr std::size_t kMostLines = 12;
  if (unknown.size() > kMostLines) {
    const std::size_t more = unknown.size() - kMostLines;
    unknown.resize(kMostLines);
    unknown.push_back(fmt::format("and {} more", more));
  }
  const std::string question = fmt::format(
      "{} does not know:\n\n  {}\n\nThese values stay in the setup and count again with {}. Switch the engine?",
      TextOf(kEngines, engine), fmt::join(unknown, "\n  "), before);
  if (Outside().Ask(question, Host::Icon::Question, Host::Buttons::YesNo) == Host::Answer::Yes) return {};
  return fmt::format("the engine stays {}", before);
}

void CBasicParaDlg::Describe(PageForm& form) {
  CBasicParaKvf& n = Node();
  Control& engines = form.Choice("Numeric Engine", n.ModelType).Hint(kTreeRebuilt).Revalidates();
  engines.enter = [this, enter = engines.enter](const std::string& typed) {
    CBasicParaKvf& basics = Node();
    const int before = basics.ModelType;
    std::string expected = enter(typed);
    if (!expected.empty() || basics.ModelType == before) return expected;
    const int engine = std::exchange(basics.ModelType, before);
    expected = WhyNotSwitch(engine);
    if (expected.empty()) basics.ModelType = engine;
    return expected;
  };
  std::vector<std::shared_ptr<PageForm>> forms{ModelCompForm(form, *n.Important(kModelComponents))};
  for (const int engine : {kEngineModflowSurfact, kEngineModflow96, kEngineModflow2000})
    forms.push_back(ModModelCompForm(form, *n.Important(kModflowComponents), engine));
  form.SubForms(std::move(forms), [this] {
    SetData();  // also of a page that is only read
    return shown_;
  });
}

void DescribeWaterQualityComponents(PageForm& form, CModelCompWQKvf& n) {
  const CModelCompKvf& water = ModelCompOf(n);
  const auto add = [&](const char* label, int& flag, int CModelCompKvf::*component, bool needsOwnEngine) {
    form.Check(label, flag)
        .EnabledWhen(needsOwnEngine ? Component(component) && OwnEngine() : Component(component))
        .Revalidates();
    // What the water movement has stands beside it, and is changed on its own page.
    form.Shown("WM", [&water, component] { return std::string(water.*component ? "on" : "off"); }).Beside();
  };
  add("Overland Flow (OL)", n.OL, &CModelCompKvf::OL, true);
  add("Rivers and Lakes (OC), Requires WQ in Overland Flow", n.River, &CModelCompKvf::River, true);
  add("Unsaturated Flow (UZ), Richards Eq and Gravity methods only", n.UZ, &CModelCompKvf::UZ, true);
  add("Plant uptake", n.PlantUptake, &CModelCompKvf::ET, false);
  add("Saturated Flow (SZ)", n.SZ, &CModelCompKvf::SZ, true);
  form.Check("Include Water Quality Processes", n.IncludeProcesses).Revalidates();
  form.Radio("", n.ProcessType).EnabledWhen(On(n.IncludeProcesses)).Revalidates();
}

void DescribeParticleComponents(PageForm& form, CModelCompPTKvf& n) {
  form.Radio("", n.InitDensityRadio);
  form.Number("Particle mass for concentration calculations", n.ParticleMass);
  form.Radio("", n.InitLocationRadio);
  form.Number("Cell fraction from the bottom", n.DistanceFracFromBottom)
      .EnabledWhen(Is(n.InitLocationRadio, CModelCompPTKvf::kOnPlane));
  form.Check(
      "Avoid initial placement of particles in cells with fixed head and fixed concentration boundary conditions",
      n.AvoidInitParticlesInFixedCells);
  form.Check("Avoid initial placement of particles above the water table", n.AvoidInitParticlesAboveWaterTable);
  form.Radio("", n.RegistrationZoneRadio).Revalidates();
  form.Check("Automatically register particles at pumping wells", n.AutomaticWellRegistration);
}

}  // namespace

std::span<const PageRow> ComponentsPages() {
  static constexpr PageRow kRows[] = {
      PageIs<CBasicParaDlg, CBasicParaKvf>(kBasicParaPage),
      DescribedBy<DescribeWaterQualityComponents>(kModelCompWQPage),
      DescribedBy<DescribeParticleComponents>(kModelCompPTPage),
  };
  return kRows;
}

}  // namespace tervane
