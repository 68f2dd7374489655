// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "cli/command_line.h"
#include "cli/commands.h"
#include "libraries/library_kind.h"

namespace tervane {

/// Tells the entries of a library, and on the error stream what is wrong with them. A status of the commands.
int PrintLibrary(const LibraryKind& kind, const std::string& path, bool json, Streams streams);

}  // namespace tervane
