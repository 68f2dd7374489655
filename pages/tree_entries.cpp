// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/tree_entries.h"

namespace tervane {

namespace {

/// A node on the way down. Its path is made when an entry at or below it needs it: most lists' items have none.
class Place {
 public:
  Place(CYbSEKvfBase& node, Place* above) : node_(node), above_(above), steps_(node) {}

  CYbSEKvfBase& Node() const { return node_; }
  const std::string& Path() {
    if (above_ && path_.empty()) path_ = JoinPath(above_->Path(), above_->steps_.StepOf(node_));
    return path_;
  }

 private:
  CYbSEKvfBase& node_;
  Place* above_;
  ChildSteps steps_;
  std::string path_;
};

void AddEntriesBelow(Place& place, int treeId, int depth, std::vector<TreeEntry>& entries) {
  for (CYbSEKvfBase* child = place.Node().GetFirstChild(); child; child = place.Node().GetNextChild(child)) {
    const PageClass* page = child->GetDlgRuntimeClass(treeId);
    if ((!page && !child->GetFirstChild()) || !child->IsDlgUsedInSetup()) continue;
    // What others wrote stands in one tree alone.
    if (!page && !child->HoldsSetup()) continue;
    Place below(*child, &place);
    if (page) {
      const std::string& path = below.Path();
      entries.push_back({child, path, ShortTitle(*child), depth, page});
    }
    AddEntriesBelow(below, treeId, page ? depth + 1 : depth, entries);
  }
}

}  // namespace

std::string ShortTitle(const CYbSEKvfBase& node) {
  if (!node.GetAbbreviatedTitle().empty()) return node.GetAbbreviatedTitle();
  return node.GetTitle().empty() ? StepName(node) : node.GetTitle();
}

std::vector<TreeEntry> TreeEntries(CYbSEKvfBase& root, int treeId) {
  std::vector<TreeEntry> entries;
  Place place(root, nullptr);
  if (root.IsDataUsedInSetup()) AddEntriesBelow(place, treeId, 0, entries);
  return entries;
}

const PageClass* PageClassOf(const CYbSEKvfBase& node) {
  for (const int tree : {kSetupDataTree, kProcessedDataTree, kResultsTree})
    if (const PageClass* page = node.GetDlgRuntimeClass(tree)) return page;
  return nullptr;
}

}  // namespace tervane
