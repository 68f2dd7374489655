// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Which features of a model go together.
#pragma once

#include "results/catalogue_answer.h"
#include "results/requirement_mask.h"

namespace tervane {

/// The features with what follows from them, on top of those to start from; or the first rule that they break.
CatalogueAnswer<RequirementMask> MaskOfLogicals(RequirementMask start, RequirementMask logicals);

}  // namespace tervane
