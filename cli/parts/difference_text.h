// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "document/setup_diff.h"

namespace tervane {

/// "SimSpec:ModelType: 0 -> 2"
std::string DifferenceLine(const SetupDifference& difference);
std::string DifferenceJson(const SetupDifference& difference);

}  // namespace tervane
