// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <unordered_map>
#include <unordered_set>

#include "core/node.h"

namespace tervane {

/// Which key of which node a member is, for the controls and conditions of one page: its node's own keys and those of
/// the nodes below it, which are described when a member is first asked for that is none of the page's node.
class BoundKeys {
 public:
  struct Place {
    const CYbSEKvfBase* node = nullptr;
    std::string key;
    KeyFacts facts;
  };

  /// Adds the keys of a node; nothing when they are there.
  void Add(const CYbSEKvfBase& node);
  /// Null for what no node stores.
  const Place* Find(const void* member);

 private:
  void AddBelow(const CYbSEKvfBase& node);

  std::unordered_map<const void*, Place> places_;
  std::unordered_set<const CYbSEKvfBase*> known_;
  std::unordered_set<const CYbSEKvfBase*> roots_;  ///< Nodes whose children were not described yet.
};

}  // namespace tervane
