// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <span>

#include "forms/page_rows.h"

namespace tervane {

/// The pages of the backdrop: its two lists, and a page for each kind of layer.
std::span<const PageRow> OverlayPages();

}  // namespace tervane
