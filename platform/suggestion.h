// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <vector>

namespace tervane {

/// "; did you mean X?" for the name that comes nearest to what was typed, or nothing.
std::string Suggestion(const std::string& typed, const std::vector<std::string>& names);

}  // namespace tervane
