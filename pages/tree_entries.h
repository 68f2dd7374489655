// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <vector>

#include "core/node.h"

namespace tervane {

/// A line of a tree of a document's window.
struct TreeEntry {
  CYbSEKvfBase* node;
  std::string path;   ///< As `NodePlace` has it.
  std::string title;  ///< As `ShortTitle` gives it.
  int depth;          ///< Number of entries above it.
  const PageClass* page;
};

/// The abbreviated title of a node, where it has none its title, or else its name in the path.
std::string ShortTitle(const CYbSEKvfBase& node);

/// The entries of a tree, parents first: the nodes below the root that have a page there and take part. What lies below
/// a node without an entry hangs at the nearest entry above.
std::vector<TreeEntry> TreeEntries(CYbSEKvfBase& root, int treeId);

/// The page of a node in the first tree that shows it, or null.
const PageClass* PageClassOf(const CYbSEKvfBase& node);

}  // namespace tervane
