// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <span>

#include "forms/page_rows.h"

namespace tervane {

/// The pages of series at points: both lists, and what a run tells of them.
std::span<const PageRow> DetailedSeriesPages();

}  // namespace tervane
