// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What the report of a setup with a Modflow engine tells of its stress periods, packages and spans.
#pragma once

#include <string>

#include "simspec/modflow_output.h"
#include "simspec/stress_periods.h"
#include "surface/stress_period_grids.h"

namespace tervane {

/// Each period with its end, its length and its time steps, a line each.
std::string StressPeriodsText(const CStressPeriodsKvf& periods);
/// When output is written, and by which packages in which form.
std::string PackagesText(const COutputModKvf& output);
/// Each span with its dates and where its values come from.
std::string SpansText(const CRechargeAndPondingModListKvf& spans);

}  // namespace tervane
