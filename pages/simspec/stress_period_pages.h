// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <span>

#include "forms/page_rows.h"

namespace tervane {

/// The pages of stress periods: where they end, and how an engine steps through them.
std::span<const PageRow> StressPeriodPages();

}  // namespace tervane
