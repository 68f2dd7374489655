// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <vector>

#include "core/list.h"
#include "spatial/zone_sync.h"

namespace tervane {

/// A node that holds items, or zones, and what can be done with them. Places count from 1.
class ItemOwner {
 public:
  explicit ItemOwner(CYbSEKvfBase* owner)
      : list_(dynamic_cast<CYbSEKvfListBaseInterface*>(owner)), zones_(dynamic_cast<CFMSEKvfBase*>(owner)) {}

  /// Null where the node holds none.
  CYbSEKvfBase* Node() const { return list_ ? static_cast<CYbSEKvfBase*>(list_) : zones_; }
  bool Holds(const CYbSEKvfBase& node) const {
    return list_ ? list_->GetNumberWhatIs(&node) > 0 : zones_ && dynamic_cast<const CFMSEKvfGroupBase*>(&node);
  }
  std::vector<CYbSEKvfBase*> Items() const;
  int Count() const { return list_ ? list_->GetItemCount() : static_cast<int>(Items().size()); }
  /// Null where there is none.
  CYbSEKvfBase* Item(int place) const;
  /// A new one behind all others; null where none can be made.
  CYbSEKvfBase* Add() const;
  /// A new one of a list at a place that has one; null where none can be made, as in front of a zone.
  CYbSEKvfBase* Insert(int place) const;
  void Remove(CYbSEKvfBase& item) const;
  /// Changes places with the item in front; false where there is none.
  bool MoveUp(int place) const { return list_ && list_->MoveItemUp(place, 1); }

 private:
  CYbSEKvfListBaseInterface* list_;
  CFMSEKvfBase* zones_;
};

}  // namespace tervane
