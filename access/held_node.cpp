// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "access/held_node.h"

#include <utility>

#include "core/node_deaths.h"

namespace tervane {

HeldNode::HeldNode(CYbSEKvfBase& node, std::shared_ptr<HeldNode> parent)
    : node_(&node), parent_(std::move(parent)), serial_(node.Serial()), deaths_(NodeDeaths()) {
  if (parent_) number_ = node.GetParent()->GetNumberWhatIs(&node);
}

CYbSEKvfBase* HeldNode::Get() {
  // A root goes with its document, which tells it.
  if (!node_ || !parent_) return node_;
  const std::uint64_t deaths = NodeDeaths();
  if (deaths != deaths_ && !IsStillThere()) node_ = nullptr;
  deaths_ = deaths;
  return node_;
}

bool HeldNode::IsStillThere() {
  const CYbSEKvfBase* parent = parent_->Get();
  if (!parent) return false;
  // Its address is compared and not followed: another node may have it by now.
  if (const CYbSEKvfBase* child = parent->GetChild(number_); child == node_) return child->Serial() == serial_;
  for (const CYbSEKvfBase* child = parent->GetFirstChild(); child; child = parent->GetNextChild(child)) {
    if (child != node_) continue;
    number_ = parent->GetNumberWhatIs(child);
    return child->Serial() == serial_;
  }
  return false;
}

}  // namespace tervane
