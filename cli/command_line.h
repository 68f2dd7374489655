// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <ostream>
#include <string>
#include <vector>

namespace tervane {

/// Exit statuses of the command line.
enum ExitStatus : int {
  kDone = 0,
  kFindings = 1,  ///< Done, and there are findings or differences.
  kCouldNot = 2,  ///< Not done; the reason went to the error stream.
  /// Somebody asked the program to end, and what had to be brought to an end first is: to be followed by
  /// `os::EndAsRequested`.
  kInterrupted = 130,
};

/// Runs `tervane` with these arguments, the program's name not among them.
int RunCommandLine(const std::vector<std::string>& arguments, std::ostream& out, std::ostream& err);

}  // namespace tervane
