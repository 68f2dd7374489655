// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/periods.h"

#include <algorithm>
#include <cmath>

#include <fmt/format.h>

#include "data/datafile_request.h"
#include "modflow6/building.h"
#include "simspec/basic_parameters.h"
#include "simspec/model_components.h"
#include "simspec/modflow_output.h"
#include "simspec/stress_periods.h"

namespace tervane::modflow6 {

namespace {

int EngineOf(const CYbSEKvfGlobalBase& root) { return root.Important(kBasicParameters)->ModelType; }

/// The steps of the engine that finds its steps itself; ATS asks for more than it does.
AdaptiveSteps AdaptiveOf(const StressPeriodSteps& steps, bool& isChanged) {
  constexpr double kLeast = 1e-5;  // Days; ATS takes no 0.
  AdaptiveSteps adaptive;
  adaptive.least = std::max(steps.TMIN, kLeast);
  adaptive.most = std::max(steps.TMAX, adaptive.least * 2);
  adaptive.first = std::clamp(steps.DELT, adaptive.least, adaptive.most);
  adaptive.growth = steps.TSMULT > 1 ? steps.TSMULT : 1;
  adaptive.cut = steps.TSDIV > 1 ? steps.TSDIV : 0;
  isChanged |= adaptive.least != steps.TMIN || adaptive.most != steps.TMAX || adaptive.first != steps.DELT ||
               adaptive.growth != steps.TSMULT || adaptive.cut != steps.TSDIV;
  return adaptive;
}

/// Whole steps and a multiplier above 0.
void TakeSteps(const StressPeriodSteps& steps, Period& period, bool& isChanged) {
  period.steps = std::isfinite(steps.NSTP) ? static_cast<int>(std::clamp(std::ceil(steps.NSTP), 1.0, 1e6)) : 1;
  period.multiplier = steps.TSMULT > 0 ? steps.TSMULT : 1;
  isChanged |= period.steps != steps.NSTP || period.multiplier != steps.TSMULT;
}

}  // namespace

bool BuildPeriods(Building& building) {
  const auto& list = *building.root.Important(kStressPeriods);
  const auto& simulation = *building.root.Important(kSimulationPeriod);
  const int engine = EngineOf(building.root);
  if (list.GetItemCount() == 0)
    return building.Fail(list, "there are no stress periods: add one, or make them with the wizard");
  CYbDateTime start = simulation.GetSimStartDate();
  bool isChanged = false;
  for (int number = 1; number <= list.GetItemCount(); ++number) {
    const CStressPeriodsItemKvf& item = *list.GetItem(number);
    Period period;
    period.start = start;
    // Validation ends the last one with the simulation.
    period.end = number == list.GetItemCount() ? simulation.SIMEND : item.EndDate();
    if (!period.start.IsValid() || !period.end.IsValid() || period.end <= period.start)
      return building.Fail(list, fmt::format("stress period {} ends {} and begins {}: dates must increase", number,
                                             DateInWords(period.end), DateInWords(period.start)));
    period.days =
        static_cast<double>(period.end.SecondsSinceEpoch() - period.start.SecondsSinceEpoch()) / kSecondsOfDay;
    period.isSteady = list.MfSteadyState != 0 || (engine == kEngineModflow2000 && item.SSTR != 0);
    if (list.MfSteadyState == 0 && engine == kEngineModflowSurfact)
      period.adaptive = AdaptiveOf(item, isChanged);
    else if (list.MfSteadyState == 0)
      TakeSteps(item, period, isChanged);
    building.model.periods.push_back(std::move(period));
    start = building.model.periods.back().end;
  }
  building.model.hasStorage = std::ranges::any_of(building.model.periods, [](const Period& p) { return !p.isSteady; });
  building.Tell(Fate::Carried, simulation,
                fmt::format("TDIS begins {}", DateInWords(building.model.periods.front().start)));
  const bool isAdaptive = building.model.periods.front().adaptive.has_value();
  building.Tell(
      isChanged ? Fate::Changed : Fate::Carried, list,
      fmt::format("{} periods in TDIS{}{}", building.model.periods.size(), isAdaptive ? ", their steps in ATS" : "",
                  isChanged ? "; values that it does not take are the nearest that it does" : ""));
  return true;
}

// ---- Output

namespace {

/// Saves each period in which one of the dates lies: the last step where all dates are its end, else all steps.
bool SaveAtDates(const COutputModDatesListKvf& dates, std::vector<Period>& periods) {
  bool isExact = true;
  for (Period& period : periods) {
    period.saving.clear();
    for (int number = 1; number <= dates.GetItemCount(); ++number) {
      const CYbDateTime& date = dates.GetItem(number)->Date;
      if (date <= period.start || date > period.end) continue;
      const bool isEnd = date == period.end;
      isExact &= isEnd;
      if (period.saving != "ALL") period.saving = isEnd ? "LAST" : "ALL";
    }
  }
  return isExact;
}

bool SaveAtSteps(const COutputModTimestepListKvf& steps, std::vector<Period>& periods) {
  bool isExact = true;
  for (Period& period : periods) period.saving.clear();
  for (int number = 1; number <= steps.GetItemCount(); ++number) {
    const COutputModTimestepItemKvf& item = *steps.GetItem(number);
    const auto place = static_cast<std::size_t>(item.StressPeriod - 1);
    const int step = static_cast<int>(std::lround(item.Timestep));
    if (item.StressPeriod < 1 || place >= periods.size() || step < 1 || step > periods[place].steps) {
      isExact = false;
      continue;
    }
    std::string& saving = periods[place].saving;
    saving += (saving.empty() ? "STEPS " : " ") + std::to_string(step);
  }
  return isExact;
}

}  // namespace

bool BuildOutput(Building& building) {
  const auto* output = [&]() -> const COutputModKvf* {
    for (CYbSEKvfBase* child = building.root.GetFirstChild(); child; child = building.root.GetNextChild(child))
      if (const auto* found = dynamic_cast<const COutputModKvf*>(child)) return found;
    return nullptr;
  }();
  if (!output) return true;
  const bool isSurfact = EngineOf(building.root) == kEngineModflowSurfact;
  std::vector<Period>& periods = building.model.periods;
  switch (output->OutputControlOption) {
    case COutputModKvf::kEveryNthTimeStep: {
      const int every = std::max(1, output->StoringTimeStep);
      for (Period& period : periods) period.saving = fmt::format("FREQUENCY {}", every);
      building.Tell(Fate::Carried, *output, fmt::format("OC saves with the frequency {}", every));
      break;
    }
    case COutputModKvf::kSpecified: {
      const bool isExact =
          isSurfact ? SaveAtDates(output->Dates(), periods) : SaveAtSteps(output->TimeSteps(), periods);
      building.Tell(isExact ? Fate::Carried : Fate::Changed, *output,
                    isExact     ? "OC saves what is named"
                    : isSurfact ? "dates within a period have no counterpart: OC saves all steps of their periods"
                                : "steps that the periods do not have are not saved");
      break;
    }
    default:
      for (Period& period : periods) period.saving = "ALL";
      building.Tell(Fate::Changed, *output, "output at equal intervals has no counterpart: OC saves all steps");
  }
  OutputControl& control = building.model.output;
  const COutputModPackageListKvf& packages = output->Packages();
  control.savesHead = false;
  for (int number = 1; number <= packages.GetItemCount(); ++number) {
    const COutputModPackageItemKvf& item = *packages.GetItem(number);
    const bool isText = item.ASCII != 0, isBinary = item.Binary != 0;
    if (item.DataTypeID == "HEAD") {
      control.savesHead = isBinary;
      control.printsHead = isText;
    } else if (item.DataTypeID == "BUDGET") {
      control.printsBudget = isText;
    } else if (item.DataTypeID == "BCF") {
      control.savesCellFlows = isBinary || isText;
    } else if (item.DataTypeID == "DRAWDOWN" && (isText || isBinary)) {
      building.Tell(Fate::LeftOut, item, "drawdown is not written: take it from the heads");
    }
    const auto saveFlowsOf = [&](std::string_view kind) {
      for (StressPackage& package : building.model.stresses)
        if (package.kind == kind) package.savesFlows |= isBinary || isText;
    };
    if (item.DataTypeID == "WELL") saveFlowsOf("WEL");
    if (item.DataTypeID == "DRAIN") saveFlowsOf("DRN");
    if (item.DataTypeID == "RECHARGE" && building.model.recharge) building.model.recharge->savesFlows = isBinary;
    if (item.DataTypeID == "EVAPOTRANSPIRATION" && building.model.evapotranspiration)
      building.model.evapotranspiration->savesFlows = isBinary;
  }
  if (output->ModPath != 0) {
    control.savesHead = control.savesCellFlows = true;
    for (StressPackage& package : building.model.stresses) package.savesFlows = true;
    for (auto* area : {&building.model.recharge, &building.model.evapotranspiration})
      if (*area) (*area)->savesFlows = true;
    building.Tell(Fate::Carried, *output, "heads and all flows are saved for tracking particles", "ModPath");
  }
  control.savesBudget =
      control.savesCellFlows || (building.model.recharge && building.model.recharge->savesFlows) ||
      (building.model.evapotranspiration && building.model.evapotranspiration->savesFlows) ||
      std::ranges::any_of(building.model.stresses, [](const StressPackage& package) { return package.savesFlows; });
  return true;
}

}  // namespace tervane::modflow6
