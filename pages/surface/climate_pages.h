// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <span>

#include "forms/page_rows.h"

namespace tervane {

/// The pages of the climate. The forcings themselves have the pages of `pages/spatial/station_pages.h`.
std::span<const PageRow> ClimatePages();

}  // namespace tervane
