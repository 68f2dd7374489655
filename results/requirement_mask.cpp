// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/requirement_mask.h"

namespace tervane {

std::string RequirementMask::Text() const {
  std::string text;
  for (const ModelFeature& row : kModelFeatures)
    if (Contains(row.bit)) text.append(text.empty() ? "" : "+").append(row.name);
  return text;
}

}  // namespace tervane
