// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <span>

#include "forms/page_rows.h"

namespace tervane {

/// The pages of soil profiles and of soils of two layers.
std::span<const PageRow> SoilPages();

}  // namespace tervane
