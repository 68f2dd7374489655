// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "engine/modflow_report.h"

#include <fmt/format.h>

#include "platform/paths.h"
#include "platform/text.h"
#include "simspec/model_components.h"

namespace tervane {

namespace {

constexpr int kMostPeriods = 1000;

std::string SourceText(const CData2DKvf& quantity) {
  const GridSource source = quantity.CurrentSource();
  if (source.type == CData2DKvf::kUniform)
    return fmt::format("{} everywhere", FormatNumber(static_cast<double>(quantity.FixedValue), "%.6g"));
  return std::string(FileNameOf(source.file));
}

std::string OutputControlText(const COutputModKvf& output) {
  const bool isSurfact = EngineOf(output) == kEngineModflowSurfact;
  switch (output.OutputControlOption) {
    case COutputModKvf::kEquidistant:
      return fmt::format("Output every {} hours.\n", output.StoringTimeStepHours);
    case COutputModKvf::kEveryNthTimeStep:
      return fmt::format("Output every {} time steps.\n", output.StoringTimeStep);
    default:
      return isSurfact ? fmt::format("Output at {} dates.\n", output.Dates().GetItemCount())
                       : fmt::format("Output at {} time steps.\n", output.TimeSteps().GetItemCount());
  }
}

}  // namespace

std::string StressPeriodsText(const CStressPeriodsKvf& periods) {
  if (periods.MfSteadyState) return "A steady-state simulation.";
  const bool isAdaptive = EngineOf(periods) == kEngineModflowSurfact;
  std::string text = fmt::format("{} stress periods from {} on.\n", periods.GetItemCount(), periods.GetDateText(0));
  for (int number = 1; number <= periods.GetItemCount(); ++number) {
    if (number > kMostPeriods)
      return text + fmt::format("and {} periods more\n", periods.GetItemCount() - kMostPeriods);
    const CStressPeriodsItemKvf& period = *periods.GetItem(number);
    const double days = periods.LengthOf(number).InDays();
    text += fmt::format("{} to {}: {} days", number, periods.GetDateText(number), FormatNumber(days, "%.6g"));
    const TimeStepRange steps = TimeStepsOf(days, period);
    if (isAdaptive)
      text += fmt::format(", steps from {} days on\n", FormatNumber(period.DELT, "%.6g"));
    else if (period.SSTR != 0 && EngineOf(periods) == kEngineModflow2000)
      text += ", steady state\n";
    else
      text += fmt::format(", {} time steps of {} to {} days\n", FormatNumber(period.NSTP, "%.6g"),
                          FormatNumber(steps.first, "%.4g"), FormatNumber(steps.last, "%.4g"));
  }
  return text;
}

std::string PackagesText(const COutputModKvf& output) {
  std::string text = OutputControlText(output);
  for (int number = 1; number <= output.Packages().GetItemCount(); ++number) {
    COutputModPackageItemKvf& package = *output.Packages().GetItem(number);
    if (!package.IsDlgUsedInSetup() || (!package.ASCII && !package.Binary)) continue;
    text += fmt::format("{} as {}\n", package.DataTypeID,
                        package.ASCII && package.Binary ? "text and binary"
                        : package.ASCII                 ? "text"
                                                        : "binary");
  }
  return text;
}

std::string SpansText(const CRechargeAndPondingModListKvf& spans) {
  std::string text;
  for (int number = 1; number <= spans.GetItemCount(); ++number) {
    if (number > kMostPeriods) return text + fmt::format("and {} spans more\n", spans.GetItemCount() - kMostPeriods);
    const CRechargeAndPondingModItemKvf& span = *spans.GetItem(number);
    text += fmt::format("Stress periods {} to {}, {}: {}\n", span.StressPeriodFrom(), span.StressPeriodTo,
                        span.DatesText(), SourceText(span));
  }
  return text.empty() ? "No span of stress periods has values." : text;
}

}  // namespace tervane
