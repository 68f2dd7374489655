// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "access/held_node.h"

#include <utility>

#include "core/node_deaths.h"

namespace tervane {

HeldNode::HeldNode(CYbSEKvfBase& node, std::shared_ptr<HeldNode> parent)
    : node_(&node), parent_(std::move(parent)), serial_(node.Serial()), deaths_(NodeDeaths()) {}

CYbSEKvfBase* HeldNode::Get() {
  // A root goes with its document, which tells it.
  if (!node_ || !parent_) return node_;
  const std::uint64_t deaths = NodeDeaths();
  if (deaths != deaths_ && !IsStillThere()) node_ = nullptr;
  deaths_ = deaths;
  return node_;
}

bool HeldNode::IsStillThere() const {
  const CYbSEKvfBase* parent = parent_->Get();
  // Its address is compared and not followed: another node may have it by now.
  for (const CYbSEKvfBase* child = parent ? parent->GetFirstChild() : nullptr; child;
       child = parent->GetNextChild(child))
    if (child == node_) return child->Serial() == serial_;
  return false;
}

}  // namespace tervane
