// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

namespace tervane {

/// The rate of a first-order decay with that half life, which is in the base unit of half lives: ln 2 / half life, with
/// its unit. Empty where the half life is none.
std::string DecayRateText(double halfLife);

}  // namespace tervane
