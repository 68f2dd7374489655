// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string_view>

namespace tervane {

/// The name and resource number of a page. A node answers one for the tree that shows it; `pages/` knows how to make
/// it.
struct PageClass {
  std::string_view name;
  int resource;

  /// The topic of the page in the help.
  int HelpTopic() const { return 0x20000 + resource; }
};

/// The trees of a document's window.
enum TreeId : int {
  kProcessedDataTree = 16787,
  kResultsTree = 16796,
  kSetupDataTree = 16803,
};

}  // namespace tervane
