// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <span>

#include "forms/page_rows.h"

namespace tervane {

/// The page that holds a run's series against what was observed.
std::span<const PageRow> StatisticsPages();

}  // namespace tervane
