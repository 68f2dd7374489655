// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/tree_entries.h"

#include <map>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "document/flow_model_document.h"
#include "tests/support/setup.h"

namespace tervane::tree_entries_test {
namespace {

constexpr PageClass kSomePage{"CSomeDlg", 1};

/// A node that has a page or none, and takes part or not.
class Branch : public CTvnKvfBase {
 public:
  Branch(const char* name, bool hasPage, CYbSEKvfBase* parent) : CTvnKvfBase("", name, parent) {
    if (hasPage) SetPage(kSomePage);
  }
  int IsDlgUsedInSetup() override { return takesPart; }
  int takesPart = 1;
};

TEST(TreeEntries, WhatLiesBelowANodeWithoutAnEntryHangsAtTheNearestEntryAbove) {
  CYbSEKvfGlobalBase root("T");
  Branch* plain = root.NewChild<Branch>("plain", false);
  Branch* page = plain->NewChild<Branch>("page", true);
  page->NewChild<Branch>("same", false)->NewChild<Branch>("deep", true);
  page->NewChild<Branch>("same", true);
  Branch* out = root.NewChild<Branch>("out", true);
  out->NewChild<Branch>("below", true);
  const auto entries = [&root] {
    std::vector<std::string> lines;
    for (const TreeEntry& entry : TreeEntries(root, kSetupDataTree))
      lines.push_back(fmt::format("{} {} {}", entry.depth, entry.path, entry.title));
    return lines;
  };
  using testing::ElementsAre;
  EXPECT_THAT(entries(), ElementsAre("0 plain/page page", "1 plain/page/same/deep deep", "1 plain/page/same#2 same",
                                     "0 out out", "1 out/below below"));
  out->takesPart = 0;
  EXPECT_THAT(entries(), ElementsAre("0 plain/page page", "1 plain/page/same/deep deep", "1 plain/page/same#2 same"));
  plain->takesPart = 0;
  EXPECT_THAT(entries(), testing::IsEmpty());
  EXPECT_THAT(TreeEntries(root, kResultsTree), testing::IsEmpty());
}

TEST(TreeEntries, AreTheNodesOfASetupThatTakePartAndHaveAPageUnderTheirPaths) {
  CFlowModelDoc document;
  ASSERT_TRUE(document.OpenText(test::SetupText(14, "section SimSpec {\nsection ModelComp {\nWQ = 1\n}\n}"), "a.tvd"));
  std::map<const CYbSEKvfBase*, std::string> paths;
  WalkNodes(document.Root(), [&](const NodePlace& place) {
    EXPECT_EQ(PathOf(place.node), place.path);
    if (place.takesPart && place.node.GetDlgRuntimeClass(kSetupDataTree)) paths[&place.node] = place.path;
  });
  for (const TreeEntry& entry : TreeEntries(document.Root(), kSetupDataTree)) {
    EXPECT_EQ(paths[entry.node], entry.path);
    EXPECT_EQ(entry.page, PageClassOf(*entry.node));
    paths.erase(entry.node);
  }
  EXPECT_THAT(paths, testing::IsEmpty());
  EXPECT_EQ(PathOf(document.Root()), "");
}

}  // namespace
}  // namespace tervane::tree_entries_test
