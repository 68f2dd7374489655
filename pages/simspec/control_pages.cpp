// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/simspec/control_pages.h"

#include "simspec/model_components.h"

namespace tervane {

template <>
void CCompControlParaTimeStepDlg::Describe(PageForm& form) {
  CCompControlParaTimeStepKvf& n = Node();
  const CModelCompKvf& components = ModelCompOf(n);
  form.Number("Initial time step", n.InitialTimeStep).Unit("hours");
  form.Number("Max allowed OL time step", n.MaxAllowedOLTimeStep).Unit("hours").EnabledWhen([&components] {
    return components.OL != 0;
  });
  form.Number("Max allowed UZ time step", n.MaxAllowedUZTimeStep).Unit("hours").EnabledWhen([&components] {
    return components.UZ != 0;
  });
  form.Number("Max allowed SZ time step", n.MaxAllowedSZTimeStep).Unit("hours").EnabledWhen([&components] {
    return components.SZ != 0;
  });
  form.Number("Increment rate  (0-1)", n.IncrementRate);
  form.Number("Max precipitation depth per time step", n.MaxPrecDepthPerTimeStep).Unit("mm");
  form.Number("Max infiltration amount per time step", n.MaxInfiltDepthPerTimeStep).Unit("mm");
  form.Number("Input precipitation rate requiring its own time step", n.PrecThresholdRate).Unit("mm/hr");
}

template <>
void CCompControlParaTimeStepWQDlg::Describe(PageForm& form) {
  using Limits = CCompControlParaTimeStepWQKvf::Limits;
  CCompControlParaTimeStepWQKvf& n = Node();
  const auto* waterQuality = dynamic_cast<const CModelCompWQKvf*>(n.GetParent());
  const auto column = [&](const char* title, Limits& limits, int CModelCompWQKvf::*component) {
    const auto takesPart = [waterQuality, component] { return waterQuality && waterQuality->*component; };
    PageForm& group = form.Controls().empty() ? form.Group(title) : form.GroupBeside(title);
    group.Number("Max. Simulation time step:", limits.MaxSimTimeStep, "%.1e").Unit("hours").EnabledWhen(takesPart);
    group.Number("Max. Advective Courant Number:", limits.MaxAdvectiveCourant).EnabledWhen(takesPart);
    group.Number("Max. Dispersive Courant Number:", limits.MaxDispersiveCourant).EnabledWhen(takesPart);
    group.Number("Max. Transport Limit:", limits.MaxTransLimit).EnabledWhen(takesPart);
  };
  column("Saturated Zone (SZ)", n.SZ, &CModelCompWQKvf::SZ);
  column("Unsaturated Zone (UZ)", n.UZ, &CModelCompWQKvf::UZ);
  column("Overland (OL)", n.OL, &CModelCompWQKvf::OL);
  form.Number("Max. Macropore Courant Number :", n.MaxCourantMP);
}

template <>
void CCompControlParaPTDlg::Describe(PageForm& form) {
  CCompControlParaPTKvf& n = Node();
  form.Check("Apply vertical correction when moving between cells with variable thicknesses",
             n.ApplyVerticalCorrection);
  form.Check("Ignore vertical courant criteria", n.IgnoreVerticalCourant);
  form.Number("Max simulation time step", n.MaxSimTimeStepSZ).Unit("hours");
  form.Number("Max advective courant number", n.MaxAdvectiveCourantSZ);
  form.Number("Max dispersive courant number", n.MaxDispersiveCourantSZ);
}

template <>
void CCompControlParaOLDlg::Describe(PageForm& form) {
  CCompControlParaOLKvf& n = Node();
  const CModelCompKvf& components = ModelCompOf(n);
  const auto isSor = [&n] { return n.SolverOption == 0; };
  const auto isExplicit = [&n] { return n.SolverOption == 1; };
  const auto withRiver = [&components] { return components.River != 0; };
  PageForm& solver = form.Group("Solver");
  solver.Radio("", n.SolverOption,
               {"Successive Overrelaxation (SOR)", "Explicit (Recommended when overbank spilling is allowed)"});
  solver.Integer("Maximum number of iterations:", n.MaxNoOfIter).EnabledWhen(isSor);
  solver.Number("Maximum head change per iteration:", n.MaxHeadChange).Unit("[m]").EnabledWhen(isSor);
  solver.Number("Maximum residual error:", n.MaxResidualError).Unit("[m/d]").EnabledWhen(isSor);
  solver.Number("Under-relaxation factor: [0.01 - 1.0]", n.RelaxFactor).EnabledWhen(isSor);
  solver.Number("Maximum courant number: [0.1 - 0.9]", n.MaxCourant_Explicit).EnabledWhen(isExplicit);
  form.Number("Threshold water depth for overland flow:", n.WaterDepthThreshold).Unit("[m]");
  form.Number("Threshold gradient for applying\nlow-gradient flow reduction:", n.OLFlowReductionGradientThreshold);
  PageForm& exchange = form.Group("Overland-River exchange calculation");
  exchange
      .Radio("", n.OLRiverExchangeOption,
             {"Manning equation (using OL flow Manning numbers)", "Weir formula: (Weir data specified in Fluvane)"})
      .EnabledWhen(withRiver);
  exchange
      .Number("Threshold head difference for applying low-gradient flow reduction:", n.WeirFlowReductionDepthThreshold)
      .Unit("[m]")
      .EnabledWhen([&n, withRiver] { return withRiver() && n.OLRiverExchangeOption == 1; });
  form.Check("Sub-divide overland flow cells for multi-cell OL method", n.Multicell).EnabledWhen(isExplicit);
  form.Number("Coarse cell sub-division factor:", n.MulticellFactor).EnabledWhen([&n, isExplicit] {
    return isExplicit() && n.Multicell != 0;
  });
}

template <>
void CCompControlParaUZDlg::Describe(PageForm& form) {
  CCompControlParaUZKvf& n = Node();
  const CModelCompKvf& components = ModelCompOf(n);
  const auto isRichards = [&components] { return components.UZ_ModelType == 0; };
  PageForm& richards = form.Group("Richards equation parameters");
  PageForm& iteration = richards.Group("Iteration Control");
  iteration.Integer("Maximum no. of iterations", n.MaxNoOfIter).EnabledWhen(isRichards);
  iteration.Number("Iteration stop criteria (fraction of Psi)", n.IterStopCriteria).EnabledWhen(isRichards);
  PageForm& restart = richards.Group("Timestep Reduction Control (UZ Restart)");
  restart.Number("Max. water balance error in one node (fraction)", n.MaxWaterBalanceError).EnabledWhen(isRichards);
  form.Group("UZ-SZ Coupling Control").Number("Max. profile water balance error", n.CouplingCriteria);
}

namespace {

std::shared_ptr<PageForm> PcgForm(CCompControlParaSZPCGBase& n, int recommended) {
  auto form = std::make_shared<PageForm>(n);
  PageForm& iteration = form->Group("Iteration control");
  iteration.Integer("Maximum no. of iterations", n.MaxNoOfIter);
  iteration.Number("Maximum head change per iteration", n.MaxHeadChange).Unit("[m]");
  iteration.Number("Maximum residual error", n.MaxResidualError).Unit("[m/d]");
  iteration.Number("Saturated thickness threshold", n.SatThicknessThreshold).Unit("[m]");
  form->Check("Gradual drain-activation (Recommended)", n.GradualDrainActivation);
  form->Check("Horizontal Conductance averaging between iterations (Recommended)", n.HorizontalConductanceAveraging);
  std::vector<std::string> options{"No under-relaxation", "Under-relaxation with dynamic calculation of factor",
                                   "Under-relaxation with constant factor    (0.01-0.99):"};
  options[static_cast<std::size_t>(recommended)] += " (Recommended)";
  form->Radio("", n.UnderRelaxation, std::move(options));
  form->Number("(0.01-0.99)", n.UnderRelaxFactor).EnabledWhen([&n] { return n.UnderRelaxation == 2; });
  return form;
}

std::shared_ptr<PageForm> SorForm(CCompControlParaSZSORKvf& n) {
  auto form = std::make_shared<PageForm>(n);
  form->Integer("Maximum no. of iterations", n.MaxNoOfIter);
  form->Number("Maximum head change per iteration", n.MaxHeadChange).Unit("[m]");
  form->Number("Maximum residual error", n.MaxResidualError).Unit("[m/d]");
  form->Number("Saturated thickness threshold", n.SatThicknessThreshold).Unit("[m]");
  form->Number("Relaxation factor  (1.0-2.0) :", n.OverRelaxFactor);
  return form;
}

std::shared_ptr<PageForm> RiverExchangeForm(CCompControlParaRivExKvf& n) {
  auto form = std::make_shared<PageForm>(n);
  form->Group("Maximum exchange from river during one time step")
      .Number("Max. fraction of H-point volume", n.MaxFractionHPointVolume);
  return form;
}

}  // namespace

template <>
void CCompControlParaSZDlg::Describe(PageForm& form) {
  CCompControlParaSZKvf& n = Node();
  form.Radio("", n.SolverOption,
             {"Preconditioned Conjugate Gradient, Transient", "Preconditioned Conjugate Gradient, Steady State",
              "Successive Overrelaxation Package (SOR)"});
  auto& transient = *n.Child<CCompControlParaSZPCGTransKvf>();
  auto& steady = *n.Child<CCompControlParaSZPCGSteadyKvf>();
  auto& sor = *n.Child<CCompControlParaSZSORKvf>();
  auto& river = *n.Child<CCompControlParaRivExKvf>();
  form.SubForms({PcgForm(transient, 0), PcgForm(steady, 1), SorForm(sor)}, [&n] { return n.SolverOption; });
  // The river exchange stands at a place that depends on the solver.
  for (const int solver : {CCompControlParaSZKvf::kSuccessiveOverrelaxation, CCompControlParaSZKvf::kTransient})
    form.SubForms({RiverExchangeForm(river)},
                  [&n, &river, solver] { return river.IsDlgUsedInSetup() && n.SolverOption == solver ? 0 : -1; });
}

template <>
void CCompControlParaColloidWQDlg::Describe(PageForm& form) {
  CCompControlParaColloidWQKvf& n = Node();
  form.Number("Conversion factor:", n.ConversionFactor).Unit("[g metabolite/ g pesticide]");
  form.Number("Maximum precipitation depth per time step:", n.MaxPrecDepthPerTimeStep).Unit("[mm]");
  form.Number("Precipitation threshold rate:", n.PrecThresholdRate).Unit("[mm/hour]");
  form.Number("Fraction of detached particles that are transported:", n.FractionTransportedParticle).Unit("[-]");
  form.Number("Water Depth Correction:", n.WaterDepthCorr).Unit("[1/mm]");
  form.Choice("Detachment model:", n.DetachmentModel,
              {"Kinetic Energy model", "Rainfall momentum model", "MACRO model"});
  form.Choice("Erosion Model:", n.ErosionModel, {"Parks", "Rose", "Eurosem"});
  form.Check("Include sorption of sprayed pesticides:", n.IncludeSorption);
}

template <>
void CAirFlowModDlg::Describe(PageForm& form) {
  CAirFlowModKvf& n = Node();
  PageForm& constants = form.Group("Physical constants");
  constants.Number("Density of water", n.DensityWater);
  constants.Number("Density of air at reference pressure", n.DensityAir);
  constants.Number("Viscosity of water", n.ViscosityWater);
  constants.Number("Viscosity of air", n.ViscosityAir);
  constants.Number("Compressibility of water", n.CompressibilityWater);
  constants.Number("Compressibility of air", n.CompressibilityAir);
  constants.Number("Standard atmospheric pressure", n.StdAtmPressure);
  constants.Number("Gravitational acceleration", n.GravityAcceleration);
}

}  // namespace tervane
