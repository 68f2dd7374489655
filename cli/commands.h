// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <ostream>
#include <string>
#include <string_view>
#include <vector>

namespace tervane {

class KeyReference;
struct KvfNode;

/// Where a command writes: results to one, messages to the other.
struct Streams {
  std::ostream& out;
  std::ostream& err;
};

/// Tells why a command could not do its work; gives its exit status.
int Refuse(Streams streams, const std::string& reason);

/// True, with a message, when the file exists and is not to be replaced.
bool RefuseToReplace(const std::string& file, bool force, Streams streams);

/// "; did you mean X?" for the name that comes nearest to what was typed, or nothing.
std::string Suggestion(const std::string& typed, const std::vector<std::string>& names);

/// The value of a key; gives an `ExitStatus`.
int GetCommand(const std::string& file, const std::string& path, bool json, Streams streams);
/// A key as it would be saved, in JSON: its values, what they mean, and its default.
std::string JsonKey(const KvfNode& keyword, std::string_view sectionPath, const KeyReference& reference);
/// Whether the data cover the simulation and the domain, and what the forcings come to; gives an `ExitStatus`.
int CoverageCommand(const std::string& file, bool json, Streams streams);

}  // namespace tervane
