// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>

namespace tervane {

/// How many nodes have been destroyed in the process: while it stays the same, every node that was there still is.
std::uint64_t NodeDeaths();

}  // namespace tervane
