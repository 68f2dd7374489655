// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <vector>

#include "document/flow_model_document.h"
#include "execution/setup_run.h"

namespace tervane {

/// The files that a run of the setup reads: the setup's own and all that it names where it takes part, with those that
/// belong to a shape file, and what libraries and river networks among them name in turn. Absolute, each once, the
/// setup first; what lies in the folder of the results is none.
std::vector<std::string> InputsOf(const CFlowModelDoc& document);

/// Whether a run with that argument makes results that a passport is for: it does more than preprocess.
bool MakesResults(const CFlowModelDoc& document, const std::string& argument);

/// Gives a request its inputs, and puts the setup as it is now beside the results, so that it can be opened when the
/// setup has long been another. Does nothing for a run that makes no results.
void PreparePassport(const CFlowModelDoc& document, RunRequest& request);

}  // namespace tervane
