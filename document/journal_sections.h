// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string_view>
#include <vector>

#include "core/kvf_tree.h"
#include "core/path.h"

namespace tervane {

/// The section at these steps below the target of that name; null where there is none.
inline KvfSection* FindSection(KvfFile& file, std::string_view target, const std::vector<PathStep>& steps) {
  KvfSection* section = AsSection(FindKvfNode(file.top, false, target));
  for (const PathStep& step : steps)
    section =
        section ? AsSection(FindKvfNode(*section, false, step.name, static_cast<std::size_t>(step.instance))) : nullptr;
  return section;
}

}  // namespace tervane
