// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <span>

#include "forms/page_rows.h"

namespace tervane {

/// The page of the species, which also tells why each takes part or not.
std::span<const PageRow> SpeciesPages();

}  // namespace tervane
