// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <vector>

#include "document/editor_exchange.h"
#include "forms/plots.h"

namespace tervane {

/// What a setup has answered to an editor of one of its files, as layers below a map: the ground and the layers of the
/// geology, from the bottom up, and over them the border of the model's grid. The answer lives as long as they do.
std::vector<BackdropLayer> ExchangeBackdrop(const CTvnFlowModelData& answer);

}  // namespace tervane
