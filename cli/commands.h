// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <string_view>

#include "cli/parts/outcome.h"

namespace tervane {

class KeyReference;
struct KvfNode;

/// The value of a key; gives an `ExitStatus`.
int GetCommand(const std::string& file, const std::string& path, bool json, Streams streams);
/// A key as it would be saved, in JSON: its values, what they mean, and its default.
std::string JsonKey(const KvfNode& keyword, std::string_view sectionPath, const KeyReference& reference);
/// Whether the data cover the simulation and the domain, and what the forcings come to; gives an `ExitStatus`.
int CoverageCommand(const std::string& file, bool json, Streams streams);

}  // namespace tervane
