// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <ostream>
#include <string>
#include <vector>

namespace tervane {

/// Statuses of the engine's process.
enum EngineStatus : int { kEngineDone = 0, kEngineFailed = 1, kEngineCouldNot = 2 };

/// Runs a setup: `SETUP.tvd` and at most one of `/PP`, `/WM`, `/WQ`; without one the setup says itself what is run. All
/// messages go to `out`. This engine preprocesses alone: a run that asks for more ends as failed, behind the
/// preprocessing where that was asked.
EngineStatus RunEngineProgram(const std::vector<std::string>& arguments, std::ostream& out);

}  // namespace tervane
