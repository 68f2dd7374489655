// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The pages of what is below the ground, by the names and resource numbers under which a shell knows them.
#pragma once

#include "core/page_class.h"

namespace tervane {

inline constexpr PageClass kUnsaturatedZonePage{"CUnsatzoneDlg", 0};
inline constexpr PageClass kSaturatedZonePage{"CSatZoneDlg", 0};

}  // namespace tervane
