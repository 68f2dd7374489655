// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What every command gives: a status, results and messages.
#pragma once

#include <ostream>
#include <string>

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

/// Where a command writes: results to one, messages to the other.
struct Streams {
  std::ostream& out;
  std::ostream& err;
};

/// Tells why a command could not do its work; gives its exit status.
int Refuse(Streams streams, const std::string& reason);

/// True, with a message, when the file exists and is not to be replaced.
bool RefuseToReplace(const std::string& file, bool force, Streams streams);

}  // namespace tervane
