// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <span>

#include "forms/page_rows.h"

namespace tervane {

/// The page that lists what a run stored, and hands it to the result viewer.
std::span<const PageRow> ViewerPages();

}  // namespace tervane
