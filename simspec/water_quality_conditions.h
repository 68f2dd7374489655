// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The conditions under which processes of water quality take an input from the rest of the setup.
#pragma once

#include "simspec/conditions.h"
#include "simspec/water_quality_processes.h"

namespace tervane {

/// Process templates take that input, a code of `ProcessTemplates`; `input` names it in words.
Condition TakenByTemplates(const char* input, int code);

/// Processes of sorption and decay are modelled and one of them depends on temperature.
Condition AnyDecayDependsOnTemperature();

/// The two compartments that a temperature of the soil can be given in.
enum class SoilCompartment { Unsaturated, Saturated };

/// Processes below ground depend on the temperature of the soil: decay in that compartment, or templates in either.
/// Decay with colloids counts in the saturated zone alone.
Condition SoilTemperatureNeeded(SoilCompartment compartment);

}  // namespace tervane
