// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What a node is called where its place in the tree is not seen.
#pragma once

#include <string>

#include "core/node.h"

namespace tervane {

/// The names of the items of lists, and of the entries of species and processes, that a node is a part of, the
/// outermost first: "Layer 2, Decay_1". Of an entry itself its group's title, where its own is but the name. Empty for
/// a node that is a part of none.
std::string OwnersOf(const CYbSEKvfBase& node);

/// "Layer 2, Decay_1: Half life"; the title alone without owners.
std::string WithOwners(const std::string& owners, const std::string& title);

}  // namespace tervane
