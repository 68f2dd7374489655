// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Places in a setup as a person or a program names them. What is not there is told with the name that comes near.
#pragma once

#include <string>

#include "core/node.h"

namespace tervane {

/// The node that a path leads to, whatever key it names; null with the problem, which begins with what was typed.
CYbSEKvfBase* FindNodeOrTell(CYbSEKvfBase& root, const SetupPath& path, const std::string& typed, std::string& problem);
/// The key that a path names in its section; null with the problem, likewise.
KvfNode* FindKeyOrTell(KvfSection& section, const PathStep& key, const std::string& typed, std::string& problem);

}  // namespace tervane
