// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "cli/commands.h"

namespace tervane {

/// `tervane run --verify`: tells what of the latest run's setup and inputs is no longer as it was, by their content.
/// Status 1 when something is.
int VerifyRun(const std::string& setup, bool json, Streams streams);

}  // namespace tervane
