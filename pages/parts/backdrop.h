// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <vector>

#include "forms/plots.h"
#include "overlays/overlays.h"

namespace tervane {

/// The layers of a list that are shown and have data, in its order; what cannot be read is left out.
std::vector<BackdropLayer> BuildPlotOverlays(const COverlayListKvf& list, Awaited& awaited);

}  // namespace tervane
