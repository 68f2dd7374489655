// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <sstream>
#include <string>
#include <vector>

#include "cli/command_line.h"

namespace tervane::test {

/// What a command of `tervane` leaves to who called it.
struct CommandOutcome {
  int status;
  std::string out, err;
};

inline CommandOutcome Tervane(const std::vector<std::string>& arguments) {
  std::ostringstream out, err;
  const int status = RunCommandLine(arguments, out, err);
  return {status, out.str(), err.str()};
}

}  // namespace tervane::test
