// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "core/node.h"

namespace tervane {

/// Second pass over the saturated zone, when species and processes are known: reads its keys, properties and children
/// once more, and of the two lists of computational layers the items, which the first pass made, without their internal
/// boundaries. `target` is the section that holds the zone's.
void ReloadSaturatedZone(CYbSEKvfBase& saturatedZone, KvfNode* target);

}  // namespace tervane
