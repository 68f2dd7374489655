// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The runner: a small program between the one that a user works with and the engine. It outlives the first and waits
// for the second. A program of its own, since it stays in memory for the length of a run, and since what a user types
// is no place for it.
#pragma once

#include <string>
#include <vector>

namespace tervane {

/// Path of the runner program, which lies beside the others.
std::string RunnerProgram();

/// How the runner ends: done when it has written the state.
enum RunnerStatus : int { kRunnerDone = 0, kRunnerMisused = 2, kRunnerOvertaken = 3, kRunnerCannotWrite = 4 };

/// The runner. Its arguments are the state file of a run that is to begin and the run's id.
int RunEngineAndWait(const std::vector<std::string>& arguments);

}  // namespace tervane
