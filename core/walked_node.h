// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "core/node.h"

namespace tervane {

/// A node on a walk in order that begins at the root. Its path is made when it is first asked for, from the steps that
/// the walk has behind it: `PathOf` would count all siblings in front of the node each time.
class WalkedNode {
 public:
  explicit WalkedNode(const CYbSEKvfBase& root) : node_(root), steps_(root) {}
  WalkedNode(WalkedNode& parent, const CYbSEKvfBase& node) : node_(node), parent_(&parent), steps_(node) {}

  const std::string& Path();

 private:
  const CYbSEKvfBase& node_;
  WalkedNode* parent_ = nullptr;
  ChildSteps steps_;
  std::string path_;
};

}  // namespace tervane
