// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <ostream>
#include <string>

namespace tervane {

/// Where a command writes: results to one, messages to the other.
struct Streams {
  std::ostream& out;
  std::ostream& err;
};

/// Tells why a command could not do its work; gives its exit status.
int Refuse(Streams streams, const std::string& reason);

/// True, with a message, when the file exists and is not to be replaced.
bool RefuseToReplace(const std::string& file, bool force, Streams streams);

/// The value of a key; gives an `ExitStatus`.
int GetCommand(const std::string& file, const std::string& path, Streams streams);
/// Whether the data cover the simulation and the domain, and what the forcings come to; gives an `ExitStatus`.
int CoverageCommand(const std::string& file, bool json, Streams streams);

}  // namespace tervane
