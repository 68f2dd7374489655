// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <span>

#include "forms/page_rows.h"

namespace tervane {

/// The pages of geological units, layers and lenses.
std::span<const PageRow> GeologyPages();

}  // namespace tervane
