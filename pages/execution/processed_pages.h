// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <span>

#include "forms/page_rows.h"

namespace tervane {

/// The pages of processed data: what the preprocessor made of the setup. Nothing is changed on them; files are read
/// when a page is shown.
std::span<const PageRow> ProcessedPages();

}  // namespace tervane
