// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "core/host.h"
#include "document/flow_model_document.h"

namespace tervane {

/// Asks where to, and writes the setup as it is now as a model of MODFLOW 6, while the user may wait or cancel. What
/// became of each input is offered to be read; a setup that is no such model is told why.
void ExportToModflow6(const CFlowModelDoc& document, Host& host);

}  // namespace tervane
