// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <span>

#include "forms/page_rows.h"

namespace tervane {

/// The pages of registration lenses and of what is extracted from particle tracking.
std::span<const PageRow> ParticlePages();

}  // namespace tervane
