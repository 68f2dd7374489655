// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>

#include "forms/plots.h"
#include "spatial/data2d.h"

namespace tervane {

/// The level that a quantity tells, in the setup's way: by elevations, above or below ground. What still has to be
/// computed goes into `awaited`; nothing where there is no level, and then `problem` says why.
std::optional<Level> LevelOf(CData2DKvf& quantity, Awaited& awaited, std::string& problem);

}  // namespace tervane
