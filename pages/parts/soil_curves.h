// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>

#include "forms/page.h"
#include "forms/plots.h"
#include "libraries/library.h"

namespace tervane {

/// Retention, and below it conductivity, of a soil over suction.
SeriesContent SoilChart(const Library& library, const LibraryEntry& soil);
/// The button that gives the current soil the values of a texture class, in one step.
void DescribeTextures(PageForm& form, CYbSEDlgBase& page, std::function<LibraryEntry*()> current);

}  // namespace tervane
