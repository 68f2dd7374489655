// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <span>

#include "forms/page_rows.h"

namespace tervane {

/// The pages of scenes for GeoScene3D.
std::span<const PageRow> GeoScenePages();

}  // namespace tervane
