// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "forms/bound_keys.h"

#include <vector>

#include "platform/text.h"

namespace tervane {

namespace {

/// No page binds controls to the members of items, of which there may be very many.
constexpr int kMostChildren = 40;

}  // namespace

void BoundKeys::Add(const CYbSEKvfBase& node) {
  if (!known_.insert(&node).second) return;
  std::vector<KeyInfo> described;
  // Describing changes nothing; the declaration serves reading, too, and so cannot promise it.
  const_cast<CYbSEKvfBase&>(node).DescribeKeys(described);
  for (KeyInfo& key : described)
    if (key.member) places_.try_emplace(key.member, Place{&node, std::string(Trimmed(key.key)), key.facts});
  roots_.insert(&node);
}

void BoundKeys::AddBelow(const CYbSEKvfBase& node) {
  int number = 0;
  for (const CYbSEKvfBase* child = node.GetFirstChild(); child && ++number <= kMostChildren;
       child = node.GetNextChild(child)) {
    Add(*child);
    roots_.erase(child);
    AddBelow(*child);
  }
}

const BoundKeys::Place* BoundKeys::Find(const void* member) {
  auto found = places_.find(member);
  while (found == places_.end() && !roots_.empty()) {
    const CYbSEKvfBase* root = *roots_.begin();
    roots_.erase(roots_.begin());
    AddBelow(*root);
    found = places_.find(member);
  }
  return found == places_.end() ? nullptr : &found->second;
}

}  // namespace tervane
