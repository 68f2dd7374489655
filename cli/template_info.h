// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "cli/command_line.h"
#include "cli/commands.h"

namespace tervane {

/// Tells what a process template declares, and on the error stream what is odd with it. A status of the commands.
int PrintTemplate(const std::string& path, bool json, Streams streams);

}  // namespace tervane
