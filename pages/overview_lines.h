// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <vector>

#include "core/document.h"

namespace tervane {

/// The values of a setup as its pages show them, in base units: for each page that takes part a line for each value,
/// "Initial time step: 6 hours".
std::vector<OverviewLine> OverviewInWords(CYbSEDocument& document);

}  // namespace tervane
