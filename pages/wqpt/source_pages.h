// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <span>

#include "forms/page_rows.h"

namespace tervane {

/// The pages of sources and of the extent of what lies in a part of the model.
std::span<const PageRow> SourcePages();

}  // namespace tervane
