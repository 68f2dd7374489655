// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>

#include "core/host.h"
#include "overlays/overlays.h"

namespace tervane {

/// Writes the grid state file beside a grid (same name, extension `gsf`): what an editor of the grid shows as its
/// backdrop. Asks before it replaces one. Gives its path; empty when the user gave up, when there is no grid file, or
/// when it cannot be written.
std::string PrepareGridState(const COverlaysKvf& overlays, const FileName& grid, std::optional<int> item, Host& host);

}  // namespace tervane
