// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/item_owner.h"

namespace tervane {

std::vector<CYbSEKvfBase*> ItemOwner::Items() const {
  std::vector<CYbSEKvfBase*> items;
  if (list_)
    for (int number = 1; number <= list_->GetItemCount(); ++number) items.push_back(list_->GetItemNode(number));
  else if (zones_)
    for (CFMSEKvfGroupBase* zone : ZoneItems(*zones_)) items.push_back(zone);
  return items;
}

CYbSEKvfBase* ItemOwner::Item(int place) const {
  if (list_) return list_->GetItemNode(place);
  const std::vector<CYbSEKvfBase*> items = Items();
  return place >= 1 && place <= static_cast<int>(items.size()) ? items[static_cast<std::size_t>(place) - 1] : nullptr;
}

CYbSEKvfBase* ItemOwner::Add() const {
  if (list_) {
    const int count = list_->GetItemCount();
    list_->AddItemNode();
    return list_->GetItemCount() > count ? list_->GetItemNode(count + 1) : nullptr;
  }
  std::shared_ptr<CFMSEKvfGroupBase> zone = zones_ ? zones_->CreateStationItem() : nullptr;
  if (zone) zones_->AddChild(zone);
  return zone.get();
}

CYbSEKvfBase* ItemOwner::Insert(int place) const {
  if (!list_ || !list_->GetItemNode(place)) return nullptr;
  const int count = list_->GetItemCount();
  list_->InsertItem(place, 1);
  return list_->GetItemCount() > count ? list_->GetItemNode(place) : nullptr;
}

void ItemOwner::Remove(CYbSEKvfBase& item) const {
  if (list_)
    list_->DeleteItem(list_->GetNumberWhatIs(&item), 1);
  else
    zones_->RemoveChild(&item);
}

}  // namespace tervane
