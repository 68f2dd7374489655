// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/water_quality_conditions.h"

#include <fmt/format.h>

namespace tervane {

namespace {

/// Water quality with processes is modelled in the compartment.
Condition ProcessesIn(SoilCompartment compartment) {
  const bool isUnsaturated = compartment == SoilCompartment::Unsaturated;
  return Component(isUnsaturated ? &CModelCompKvf::UZ : &CModelCompKvf::SZ) &&
         WaterQualityComponent(isUnsaturated ? &CModelCompWQKvf::UZ : &CModelCompWQKvf::SZ);
}

Condition DependsOnTemperature() {
  return Condition::Sentence("a decay process depends on temperature", [](const CYbSEKvfBase& node) {
    const auto* decays = node.Important(kDecayProcesses);
    return decays && decays->IsAnyTemperatureDependent();
  });
}

Condition TemplateIn(SoilCompartment compartment) {
  const bool isUnsaturated = compartment == SoilCompartment::Unsaturated;
  const int code = isUnsaturated ? ProcessTemplates::kUnsaturated : ProcessTemplates::kSaturated;
  return Condition::Sentence(
      fmt::format("the {} zone has a process template", isUnsaturated ? "unsaturated" : "saturated"),
      [code](const CYbSEKvfBase& node) {
        const auto* templates = node.Important(kProcessTemplates);
        return templates && templates->IsTemplateUsed(code);
      });
}

}  // namespace

Condition TakenByTemplates(const char* input, int code) {
  return WaterQualityProcesses(kKinetra) &&
         Condition::Sentence(fmt::format("a process template takes the {}", input), [code](const CYbSEKvfBase& node) {
           const auto* templates = node.Important(kProcessTemplates);
           return templates && templates->IsBuiltInUsed(code);
         });
}

Condition AnyDecayDependsOnTemperature() { return WaterQualityProcesses(kSorptionAndDecay) && DependsOnTemperature(); }

Condition SoilTemperatureNeeded(SoilCompartment compartment) {
  Condition decay = AnyDecayDependsOnTemperature();
  if (compartment == SoilCompartment::Saturated)
    decay = decay || (WaterQualityProcesses(kColloids) && DependsOnTemperature());
  const Condition templates = TakenByTemplates("temperature of the soil", ProcessTemplates::kSoilTemperature);
  Condition needed = ProcessesIn(compartment) && decay;
  for (const SoilCompartment other : {SoilCompartment::Unsaturated, SoilCompartment::Saturated})
    needed = needed || (ProcessesIn(other) && TemplateIn(other) && templates);
  return needed;
}

}  // namespace tervane
