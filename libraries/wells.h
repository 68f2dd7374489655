// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "geometry/grid.h"
#include "platform/files.h"

namespace tervane {

/// Writes a well parameter file (.WEL) without wells over that area, in one step.
FileResult WriteEmptyWellFile(const std::string& path, const Envelope& area);

}  // namespace tervane
