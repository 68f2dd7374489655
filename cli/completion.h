// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

namespace CLI {
class App;
}

namespace tervane {

/// A bash script that completes the commands and options of the program, file names, and places of a setup.
std::string BashCompletion(const CLI::App& app);

}  // namespace tervane
