// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/version.h"

namespace tervane {

std::string ProgramBuild() { return std::string(kProgramVersion) + " (" TERVANE_BUILD ")"; }

}  // namespace tervane
