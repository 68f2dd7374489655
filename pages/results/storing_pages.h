// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <span>

#include "forms/page_rows.h"

namespace tervane {

/// The pages of what is stored: the storing itself, and the types on grids.
std::span<const PageRow> StoringPages();

}  // namespace tervane
