// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

namespace tervane {

/// Of all programs.
inline constexpr const char* kProgramVersion = "0.1.0";

/// The version with what it was built of: "0.1.0 (commit 1a2b3c4, Release, GNU 12.2.0)".
std::string ProgramBuild();

}  // namespace tervane
