// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <span>

#include "forms/page_rows.h"

namespace tervane {

/// The page of any quantity with one value for each cell of the model.
std::span<const PageRow> Data2DPages();

}  // namespace tervane
