// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "core/node.h"

namespace tervane {

/// Lets a node read its keys anew from a section as it would be written now, whatever version of file its setup was
/// read from. Its items, zones and stations stay, so that a count of them is not taken.
void ReadKeysAnew(CYbSEKvfBase& node, KvfSection& section);
/// Loads a node with all below it from such a section, whatever name and number that has in another setup or place.
void LoadAnew(CYbSEKvfBase& node, KvfSection& section);

}  // namespace tervane
