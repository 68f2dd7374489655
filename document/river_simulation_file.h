// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <string_view>

namespace tervane {

/// Gives a river simulation file the result location of the setup, in its target `SYSTEM` (whatever its case); all else
/// stays. A file that has it already is left alone. 0 when done, -1 when the file cannot be read or written; it then
/// stands as it was, and `error` says why.
int RewriteRiverSimulationFile(const std::string& path, std::string_view resultRoot, int useCustomFolder,
                               std::string_view customFolder, std::string& error);

}  // namespace tervane
