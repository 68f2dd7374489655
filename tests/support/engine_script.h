// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <string_view>

#include "tests/support/temp_folder.h"

namespace tervane::test {

/// Writes a shell script that may be executed, and gives its path.
std::string WriteEngine(const TempFolder& folder, std::string_view name, std::string_view commands);
/// The same of any bytes.
std::string WriteProgram(const TempFolder& folder, std::string_view name, std::string_view bytes);

}  // namespace tervane::test
