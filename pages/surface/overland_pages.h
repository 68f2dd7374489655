// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <span>

#include "forms/page_rows.h"

namespace tervane {

/// The pages of overland flow, by cells and by zones, and of ponded drainage.
std::span<const PageRow> OverlandPages();

}  // namespace tervane
