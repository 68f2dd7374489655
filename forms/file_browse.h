// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "core/host.h"

namespace tervane {

class DataFileNode;

/// Asks for a data file and one of its items that the node has a use for; false when the user gave up or nothing in the
/// file will do, which is told.
bool BrowseDataFile(DataFileNode& node, Host::FileQuestion question, Host& host);

}  // namespace tervane
