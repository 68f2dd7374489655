// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "access/setup_keys.h"
#include "core/fixes.h"

namespace tervane {

/// Of a file in another coordinate system than the domain: a copy in that of the domain beside it, with "_converted"
/// behind its name. Grids are put on the cells of the model.
FixKind ConvertedFiles(SetupKeys& keys);

}  // namespace tervane
