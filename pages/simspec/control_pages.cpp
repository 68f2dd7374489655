// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/simspec/control_pages.h"

#include "simspec/air_flow.h"
#include "simspec/conditions.h"
#include "simspec/control_parameters.h"
#include "simspec/time_step_control.h"

namespace tervane {

namespace {

void DescribeTimeSteps(PageForm& form, CCompControlParaTimeStepKvf& n) {
  form.Number("Initial time step", n.InitialTimeStep);
  form.Number("Max allowed OL time step", n.MaxAllowedOLTimeStep).EnabledWhen(Component(&CModelCompKvf::OL));
  form.Number("Max allowed UZ time step", n.MaxAllowedUZTimeStep).EnabledWhen(Component(&CModelCompKvf::UZ));
  form.Number("Max allowed SZ time step", n.MaxAllowedSZTimeStep).EnabledWhen(Component(&CModelCompKvf::SZ));
  form.Number("Increment rate  (0-1)", n.IncrementRate);
  form.Number("Max precipitation depth per time step", n.MaxPrecDepthPerTimeStep);
  form.Number("Max infiltration amount per time step", n.MaxInfiltDepthPerTimeStep);
  form.Number("Input precipitation rate requiring its own time step", n.PrecThresholdRate);
}

void DescribeTransportTimeSteps(PageForm& form, CCompControlParaTimeStepWQKvf& n) {
  using Limits = CCompControlParaTimeStepWQKvf::Limits;
  const auto column = [&](const char* title, Limits& limits, int CModelCompWQKvf::*component) {
    const Condition takesPart = OnInParent(component);
    PageForm& group = form.Controls().empty() ? form.Group(title) : form.GroupBeside(title);
    group.Number("Max. Simulation time step:", limits.MaxSimTimeStep, "%.1e").EnabledWhen(takesPart);
    group.Number("Max. Advective Courant Number:", limits.MaxAdvectiveCourant).EnabledWhen(takesPart);
    group.Number("Max. Dispersive Courant Number:", limits.MaxDispersiveCourant).EnabledWhen(takesPart);
    group.Number("Max. Transport Limit:", limits.MaxTransLimit).EnabledWhen(takesPart);
  };
  column("Saturated Zone (SZ)", n.SZ, &CModelCompWQKvf::SZ);
  column("Unsaturated Zone (UZ)", n.UZ, &CModelCompWQKvf::UZ);
  column("Overland (OL)", n.OL, &CModelCompWQKvf::OL);
  form.Number("Max. Macropore Courant Number :", n.MaxCourantMP);
}

void DescribeParticleControl(PageForm& form, CCompControlParaPTKvf& n) {
  form.Check("Apply vertical correction when moving between cells with variable thicknesses",
             n.ApplyVerticalCorrection);
  form.Check("Ignore vertical courant criteria", n.IgnoreVerticalCourant);
  form.Number("Max simulation time step", n.MaxSimTimeStepSZ);
  form.Number("Max advective courant number", n.MaxAdvectiveCourantSZ);
  form.Number("Max dispersive courant number", n.MaxDispersiveCourantSZ);
}

void DescribeOverlandControl(PageForm& form, CCompControlParaOLKvf& n) {
  const Condition isSor = Is(n.SolverOption, CCompControlParaOLKvf::kSuccessiveOverrelaxation);
  const Condition isExplicit = Is(n.SolverOption, CCompControlParaOLKvf::kExplicit);
  const Condition withRiver = Component(&CModelCompKvf::River);
  PageForm& solver = form.Group("Solver");
  solver.Radio("", n.SolverOption);
  solver.Integer("Maximum number of iterations:", n.MaxNoOfIter).EnabledWhen(isSor);
  solver.Number("Maximum head change per iteration:", n.MaxHeadChange).EnabledWhen(isSor);
  solver.Number("Maximum residual error:", n.MaxResidualError).EnabledWhen(isSor);
  solver.Number("Under-relaxation factor: [0.01 - 1.0]", n.RelaxFactor).EnabledWhen(isSor);
  solver.Number("Maximum courant number: [0.1 - 0.9]", n.MaxCourant_Explicit).EnabledWhen(isExplicit);
  form.Number("Threshold water depth for overland flow:", n.WaterDepthThreshold);
  form.Number("Threshold gradient for applying\nlow-gradient flow reduction:", n.OLFlowReductionGradientThreshold);
  PageForm& exchange = form.Group("Overland-River exchange calculation");
  exchange.Radio("", n.OLRiverExchangeOption).EnabledWhen(withRiver);
  exchange
      .Number("Threshold head difference for applying low-gradient flow reduction:", n.WeirFlowReductionDepthThreshold)

      .EnabledWhen(withRiver && Is(n.OLRiverExchangeOption, CCompControlParaOLKvf::kWeir));
  form.Check("Sub-divide overland flow cells for multi-cell OL method", n.Multicell).EnabledWhen(isExplicit);
  form.Number("Coarse cell sub-division factor:", n.MulticellFactor).EnabledWhen(isExplicit && On(n.Multicell));
}

void DescribeUnsaturatedControl(PageForm& form, CCompControlParaUZKvf& n) {
  const Condition isRichards = Method(&CModelCompKvf::UZ_ModelType, kRichardsEquation);
  PageForm& richards = form.Group("Richards equation parameters");
  PageForm& iteration = richards.Group("Iteration Control");
  iteration.Integer("Maximum no. of iterations", n.MaxNoOfIter).EnabledWhen(isRichards);
  iteration.Number("Iteration stop criteria (fraction of Psi)", n.IterStopCriteria).EnabledWhen(isRichards);
  PageForm& restart = richards.Group("Timestep Reduction Control (UZ Restart)");
  restart.Number("Max. water balance error in one node (fraction)", n.MaxWaterBalanceError).EnabledWhen(isRichards);
  form.Group("UZ-SZ Coupling Control").Number("Max. profile water balance error", n.CouplingCriteria);
}

std::shared_ptr<PageForm> PcgForm(CCompControlParaSZPCGBase& n, int recommended) {
  auto form = std::make_shared<PageForm>(n);
  PageForm& iteration = form->Group("Iteration control");
  iteration.Integer("Maximum no. of iterations", n.MaxNoOfIter);
  iteration.Number("Maximum head change per iteration", n.MaxHeadChange);
  iteration.Number("Maximum residual error", n.MaxResidualError);
  iteration.Number("Saturated thickness threshold", n.SatThicknessThreshold);
  form->Check("Gradual drain-activation (Recommended)", n.GradualDrainActivation);
  form->Check("Horizontal Conductance averaging between iterations (Recommended)", n.HorizontalConductanceAveraging);
  Control& underRelaxation = form->Radio("", n.UnderRelaxation);
  std::vector<std::string> options = underRelaxation.Options();
  options[static_cast<std::size_t>(recommended)] += " (Recommended)";
  underRelaxation.options = [options = std::move(options)] { return options; };
  form->Number("(0.01-0.99)", n.UnderRelaxFactor)
      .EnabledWhen(Is(n.UnderRelaxation, CCompControlParaSZPCGBase::kConstantFactor));
  return form;
}

std::shared_ptr<PageForm> SorForm(CCompControlParaSZSORKvf& n) {
  auto form = std::make_shared<PageForm>(n);
  form->Integer("Maximum no. of iterations", n.MaxNoOfIter);
  form->Number("Maximum head change per iteration", n.MaxHeadChange);
  form->Number("Maximum residual error", n.MaxResidualError);
  form->Number("Saturated thickness threshold", n.SatThicknessThreshold);
  form->Number("Relaxation factor  (1.0-2.0) :", n.OverRelaxFactor);
  return form;
}

std::shared_ptr<PageForm> RiverExchangeForm(CCompControlParaRivExKvf& n) {
  auto form = std::make_shared<PageForm>(n);
  form->Group("Maximum exchange from river during one time step")
      .Number("Max. fraction of H-point volume", n.MaxFractionHPointVolume);
  return form;
}

void DescribeSaturatedControl(PageForm& form, CCompControlParaSZKvf& n) {
  form.Radio("", n.SolverOption);
  auto& sor = *n.Child<CCompControlParaSZSORKvf>();
  auto& river = *n.Child<CCompControlParaRivExKvf>();
  form.SubForms({PcgForm(n.Transient(), 0), PcgForm(n.SteadyState(), 1), SorForm(sor)},
                [&n] { return n.SolverOption; });
  // The river exchange stands at a place that depends on the solver.
  for (const int solver : {CCompControlParaSZKvf::kSuccessiveOverrelaxation, CCompControlParaSZKvf::kTransient})
    form.SubForms({RiverExchangeForm(river)},
                  [&n, &river, solver] { return river.IsDlgUsedInSetup() && n.SolverOption == solver ? 0 : -1; });
}

void DescribeColloidControl(PageForm& form, CCompControlParaColloidWQKvf& n) {
  form.Number("Conversion factor:", n.ConversionFactor);
  form.Number("Maximum precipitation depth per time step:", n.MaxPrecDepthPerTimeStep);
  form.Number("Precipitation threshold rate:", n.PrecThresholdRate);
  form.Number("Fraction of detached particles that are transported:", n.FractionTransportedParticle);
  form.Number("Water Depth Correction:", n.WaterDepthCorr);
  form.Choice("Detachment model:", n.DetachmentModel);
  form.Choice("Erosion Model:", n.ErosionModel);
  form.Check("Include sorption of sprayed pesticides:", n.IncludeSorption);
}

void DescribeAirFlow(PageForm& form, CAirFlowModKvf& n) {
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

}  // namespace

std::span<const PageRow> ControlPages() {
  static constexpr PageRow kRows[] = {
      DescribedBy<DescribeTimeSteps>(kTimeStepPage),           DescribedBy<DescribeTransportTimeSteps>(kTimeStepWQPage),
      DescribedBy<DescribeParticleControl>(kControlPTPage),    DescribedBy<DescribeOverlandControl>(kControlOLPage),
      DescribedBy<DescribeUnsaturatedControl>(kControlUZPage), DescribedBy<DescribeSaturatedControl>(kControlSZPage),
      DescribedBy<DescribeColloidControl>(kColloidWQPage),     DescribedBy<DescribeAirFlow>(kAirFlowModPage),
  };
  return kRows;
}

}  // namespace tervane
