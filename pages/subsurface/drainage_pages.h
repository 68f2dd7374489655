// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <span>

#include "forms/page_rows.h"

namespace tervane {

/// The pages of drains, for both kinds of engines.
std::span<const PageRow> DrainagePages();

}  // namespace tervane
