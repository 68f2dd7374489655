// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/simspec/components_pages.h"

namespace tervane {

namespace {

/// The components with the own engine.
std::shared_ptr<PageForm> ModelCompForm(CModelCompKvf& n) {
  auto form = std::make_shared<PageForm>(n);
  const auto withWaterMovement = [&n] { return n.WM != 0; };
  const auto withWaterQuality = [&n] { return n.WQ != 0; };
  form->Check("Overland Flow (OL)", n.OL).EnabledWhen(withWaterMovement).Revalidates();
  form->Choice("", n.OL_ModelType, {"Finite Difference", "Subcatchment based"}).Beside().EnabledWhen([&n] {
    return n.OL != 0;
  });
  form->Check("Rivers and Lakes (OC)", n.River).EnabledWhen(withWaterMovement).Revalidates();
  form->Check("Unsaturated Flow (UZ)", n.UZ).EnabledWhen(withWaterMovement).Revalidates();
  form->Choice("", n.UZ_ModelType, {"Richards equation", "Gravity Flow", "2 Layer UZ"})
      .Beside()
      .EnabledWhen([&n] { return n.UZ != 0; })
      .Revalidates();
  form->Check("Evapotranspiration (ET)", n.ET).EnabledWhen(withWaterMovement).Revalidates();
  form->Check("Saturated Flow (SZ)", n.SZ).EnabledWhen(withWaterMovement).Revalidates();
  form->Choice("", n.SZ_ModelType, {"Finite Difference", "Linear Reservoir"}).Beside().EnabledWhen([&n] {
    return n.SZ != 0;
  });
  form->Check("Include Advection-Dispersion (AD) Water Quality", n.WQ).Revalidates();
  form->Radio("", n.ADPTRadio,
              {"Calculate WQ using the finite difference, Advection-Dispersion (AD) method",
               "Calculate WQ using random walk particle tracking (SZ only)"})
      .ShownWhen(withWaterQuality)
      .Revalidates();
  form->Check("Use current WM simulation for Water Quality", n.UseCurrentWmSimulation).ShownWhen(withWaterQuality);
  form->File("Flow result catalogue file:", n.FilenameTvdRes)
      .Filter("Flow result catalogue file(*.tvdres) |*.tvdres|All Files (*.*) |*.*||")
      .DefaultExtension("tvdres")
      .ShownWhen([&n] { return n.WQ && !n.UseCurrentWmSimulation; });
  return form;
}

/// The components with one of the Modflow engines.
std::shared_ptr<PageForm> ModModelCompForm(CModModelCompKvf& n, int engine) {
  auto form = std::make_shared<PageForm>(n);
  const auto isVariablySaturated = [&n, engine] {
    n.GetSubsurfaceModelType();
    return engine == kEngineModflowSurfact && n.VariablySaturated;
  };
  const auto withSubsurface = [&n] { return n.Subsurface != 0; };
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
          .Beside()
          .EnabledWhen(withSubsurface);
      break;
    default:
      form->Choice("", n.Modflow2000_BCFType, {"Block Centered Flow (BCF)", "Layer Property Flow (LPF)"})
          .Beside()
          .EnabledWhen(withSubsurface);
  }
  form->Check("With cell rewetting", n.WithCellRewetting).EnabledWhen([isVariablySaturated] {
    return !isVariablySaturated();
  });
  form->Check("With air flow", n.WithAirFlow).ShownWhen(isVariablySaturated);
  form->Check("Evapotranspiration (ET)", n.ET);
  form->Check("Rivers and Lakes", n.River);
  form->Check("Recharge", n.Recharge);
  form->Choice("", n.Recharge_ModelType, {"MODFLOW Recharge", "Recharge-Seepage Face"})
      .Key("Recharge_ModelType")
      .Beside()
      .EnabledWhen([&n, engine] { return engine == kEngineModflowSurfact && n.Recharge != 0; });
  return form;
}

}  // namespace

void CBasicParaDlg::SetData() {
  const int engine = Node().ModelType;
  if (engine >= kEngineTervane && engine <= kEngineModflow2000) shown_ = engine;
}

void CBasicParaDlg::Describe(PageForm& form) {
  CBasicParaKvf& n = Node();
  form.Choice("Numeric Engine", n.ModelType, {"Tervane", "MODFLOW Surfact", "MODFLOW 96", "MODFLOW 2000"})
      .Hint(kTreeRebuilt)
      .Revalidates();
  std::vector<std::shared_ptr<PageForm>> forms{ModelCompForm(*n.Important<CModelCompKvf>("MODELCOMP"))};
  for (const int engine : {kEngineModflowSurfact, kEngineModflow96, kEngineModflow2000})
    forms.push_back(ModModelCompForm(*n.Important<CModModelCompKvf>("MODMODELCOMP"), engine));
  form.SubForms(std::move(forms), [this] { return shown_; });
}

void CModelCompWQDlg::Describe(PageForm& form) {
  CModelCompWQKvf& n = Node();
  const CModelCompKvf& water = ModelCompOf(n);
  const auto add = [&](const char* label, int& flag, int CModelCompKvf::*component, bool needsOwnEngine) {
    form.Check(label, flag)
        .EnabledWhen([&n, &water, component, needsOwnEngine] {
          return water.*component && (!needsOwnEngine || EngineOf(n) == kEngineTervane);
        })
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
  form.Radio("", n.ProcessType, {"Sorption and Decay", "Kinetra"})
      .EnabledWhen([&n] { return n.IncludeProcesses != 0; })
      .Revalidates();
}

void CModelCompPTDlg::Describe(PageForm& form) {
  CModelCompPTKvf& n = Node();
  form.Radio("", n.InitDensityRadio,
             {"Define initial particle density using initial concentration",
              "Define initial particle density as number of particles"});
  form.Number("Particle mass for concentration calculations", n.ParticleMass);
  form.Radio(
      "", n.InitLocationRadio,
      {"Distribute particles randomly in the cell",
       "Distribute particles evenly on a plane above the bottom of the cell", "Place particles uniformly in the cell"});
  form.Number("Cell fraction from the bottom", n.DistanceFracFromBottom).EnabledWhen([&n] {
    return n.InitLocationRadio == 1;
  });
  form.Check(
      "Avoid initial placement of particles in cells with fixed head and fixed concentration boundary conditions",
      n.AvoidInitParticlesInFixedCells);
  form.Check("Avoid initial placement of particles above the water table", n.AvoidInitParticlesAboveWaterTable);
  form.Radio("", n.RegistrationZoneRadio,
             {"No registration zones", "Define registration zones by layers",
              "Define registration zones by lenses (slower)"})
      .Revalidates();
  form.Check("Automatically register particles at pumping wells", n.AutomaticWellRegistration);
}

}  // namespace tervane
