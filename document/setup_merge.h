// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <vector>

#include "document/flow_model_document.h"
#include "document/setup_diff.h"

namespace tervane {

/// The differences from one open setup to another, as both would be written to the folder of the first.
std::vector<SetupDifference> DifferencesBetween(const CFlowModelDoc& from, const CFlowModelDoc& to);

/// Gives a key the value that it has in another setup. The node that has taken it, which is to be told to the
/// document; null, with the reason, for a difference that is no value of a key, and where the setups are others now.
CYbSEKvfBase* TakeValue(CFlowModelDoc& mine, const CFlowModelDoc& theirs, const SetupDifference& difference,
                        std::string& problem);

/// Takes an item of a list, or a zone, that another setup has and this one has not, behind those that are there; or
/// removes one that the other has not. The node that holds the items, which is to be told to the document; null, with
/// the reason, for a difference of another kind, and where the setups are others now.
CYbSEKvfBase* TakeItem(CFlowModelDoc& mine, const CFlowModelDoc& theirs, const SetupDifference& difference,
                       std::string& problem);
/// Whether the difference may be one for `TakeItem`.
bool IsOfItem(const SetupDifference& difference);

}  // namespace tervane
