// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/period_fixes.h"

#include <algorithm>

#include "simspec/periods.h"

namespace tervane {

namespace {

CYbDateTime* DateOnFlow(const FoundAt& found) {
  auto* period = dynamic_cast<CSimPeriodOnFlowBase*>(found.node);
  if (!period) return nullptr;
  struct Date {
    std::string_view key;
    CYbDateTime CSimPeriodOnFlowBase::*member;
  };
  constexpr Date kDates[] = {{"SimStart", &CSimPeriodOnFlowBase::SimStart},
                             {"SimEnd", &CSimPeriodOnFlowBase::SimEnd},
                             {"CycleRestartDate", &CSimPeriodOnFlowBase::CycleRestartDate},
                             {"CycleEndDate", &CSimPeriodOnFlowBase::CycleEndDate},
                             {"FlowFieldSolutionDate", &CSimPeriodOnFlowBase::FlowFieldSolutionDate}};
  const auto* date = std::ranges::find(kDates, found.key, &Date::key);
  return date != std::end(kDates) ? &(period->*date->member) : nullptr;
}

void PlanDates(std::span<const FoundAt> found, const FixContext&, FixPlan& plan) {
  constexpr std::string_view kFormat = "%Y-%m-%d %H:%M";
  for (const FoundAt& finding : found) {
    CYbDateTime* date = DateOnFlow(finding);
    const auto* flow = finding.node->Important(kSimulationPeriod);
    if (!date || !flow) continue;
    const CYbDateTime start = flow->GetSimStartDate(), end = flow->SIMEND;
    if (!start.IsValid() || !end.IsValid() || end < start) {
      plan.left.push_back({finding.node, finding.key, "the period of the simulation of flow is to be mended first"});
      continue;
    }
    const CYbDateTime nearest = *date < start ? start : end < *date ? end : *date;
    if (nearest == *date) continue;
    plan.values.push_back({finding.node, finding.key, date->Format(kFormat), nearest.Format(kFormat), [date, nearest] {
                             *date = nearest;
                             return std::string();
                           }});
  }
}

}  // namespace

const FixKind kDateWithinSimulation{"date-within-simulation", "Set the Date Within the Simulation of Flow",
                                    [](const FoundAt& found) { return DateOnFlow(found) != nullptr; }, PlanDates};

}  // namespace tervane
