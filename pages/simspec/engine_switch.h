// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <vector>

#include "simspec/basic_parameters.h"

namespace tervane {

/// What a setup holds that another engine would not know, a line each: parts with values of their own that would take
/// no part any more, and choices that the engine does not have. The setup stays as it is.
std::vector<std::string> UnknownToEngine(CBasicParaKvf& basics, int engine);

}  // namespace tervane
