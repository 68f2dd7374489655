// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/walked_node.h"

#include "core/path.h"

namespace tervane {

const std::string& WalkedNode::Path() {
  if (parent_ && path_.empty()) path_ = JoinPath(parent_->Path(), parent_->steps_.StepOf(node_));
  return path_;
}

}  // namespace tervane
