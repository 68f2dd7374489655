// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "cli/commands.h"

namespace tervane {

/// Whether the path leads to a river network: .fvnwk, .fvproj, .fvsim.
bool LeadsToRiver(const std::string& path);
/// What a network holds, and what is wrong with it.
int PrintRiver(const std::string& path, bool json, Streams streams);

}  // namespace tervane
