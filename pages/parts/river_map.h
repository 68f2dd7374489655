// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "core/file_name.h"
#include "forms/plots.h"

namespace tervane {

/// The network that a file leads to, as lines of a map; without branches where it leads to none.
LineLayer RiverLines(const FileName& file);
/// The same in a map, where there is anything to draw.
void AddRiver(MapContent& map, const FileName& file);

/// What is wrong with the network that a file leads to, in a few sentences; empty when nothing is, and for a file that
/// is not there, which its node tells.
std::string RiverFaults(const FileName& file);

}  // namespace tervane
