// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "core/node.h"
#include "forms/plots.h"

namespace tervane {

/// The model domain of the node's setup, by its grid file or with the polygons that it is made of: what other things
/// are shown on.
MapContent DomainMap(const CYbSEKvfBase& node);

}  // namespace tervane
