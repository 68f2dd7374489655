// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <span>

#include "forms/page_rows.h"

namespace tervane {

/// The page of quantities that are read anew for spans of stress periods.
std::span<const PageRow> StressPeriodGridPages();

}  // namespace tervane
