// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <vector>

#include "pages/tree_entries.h"
#include "tests/shell/opened_setup.h"
#include "tests/support/rich_setups.h"

namespace tervane::test {

/// The paths of the pages that a tree of the setup offers.
inline std::vector<std::string> PagesOf(OpenedSetup& setup, int tree) {
  std::vector<std::string> paths;
  for (const TreeEntry& entry : TreeEntries(setup.Session().Document().Root(), tree)) paths.push_back(entry.path);
  return paths;
}

}  // namespace tervane::test
