// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

namespace tervane {

/// Of all programs.
inline constexpr const char* kProgramVersion = "0.1.0";

}  // namespace tervane
