// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/list.h"

#include <algorithm>

#include <fmt/format.h>

#include "core/dependent_list.h"

namespace tervane {

namespace {

int SectionsIn(const KvfNode* node) {
  const KvfSection* section = AsSection(node);
  int count = 0;
  for (const KvfNode* child = section ? section->firstChild : nullptr; child; child = child->next)
    count += !child->IsKeyword();
  return count;
}

/// Nothing follows a master any more at an item that is given up; a step of undo may keep it alive.
void LeaveMasters(CYbSEKvfBase& item) {
  if (auto* list = dynamic_cast<CTvnDependentListBase*>(&item)) list->LeaveMaster();
  for (CYbSEKvfBase* child = item.GetFirstChild(); child; child = item.GetNextChild(child)) LeaveMasters(*child);
}

}  // namespace

int CountToTake(KvfNode* section, std::string_view key, int count, const KvfNode* items) {
  if (count <= 0) {
    if (count < 0) kvfAddNote(section, key, fmt::format("a count of {} reads as 0", count));
    return 0;
  }
  const int sections = std::min(SectionsIn(items), kLargestItemCount);
  int& spent = AsSection(section)->file->itemsWithoutSection;
  const int spare = std::min({kMostItemsWithoutSection, kMostItemsWithoutSectionInFile - spent,  //
                              kLargestItemCount - sections});
  const int taken = std::min(count, sections + spare);
  spent += std::max(taken - sections, 0);
  if (taken < count)
    kvfAddNote(
        section, key,
        fmt::format("a count of {} is cut to {}: the file has {} sections for the items", count, taken, sections));
  return taken;
}

CYbSEKvfListBaseInterface::~CYbSEKvfListBaseInterface() {
  while (GetItemCount() > 0) children_.pop_back();
}

CYbSEKvfBase* CYbSEKvfListBaseInterface::GetItemNode(int number) const {
  return number >= 1 && number <= GetItemCount()
             ? children_[plainChildren_ + static_cast<std::size_t>(number - 1)].get()
             : nullptr;
}

int CYbSEKvfListBaseInterface::GetNumberWhatIs(const CYbSEKvfBase* node) const {
  const std::ptrdiff_t place = IndexOfChild(node) - static_cast<std::ptrdiff_t>(plainChildren_);
  return place < 0 ? -1 : static_cast<int>(place) + 1;
}

void CYbSEKvfListBaseInterface::ForwardToItems(int level,
                                               const std::function<void(CYbSEKvfListBaseInterface&, int)>& operation) {
  for (int number = 1; number <= GetItemCount(); ++number)
    if (auto* list = dynamic_cast<CYbSEKvfListBaseInterface*>(GetItemNode(number))) operation(*list, level - 1);
}

void CYbSEKvfListBaseInterface::SetItemCount(int count, int level) {
  if (level != 1) return ForwardToItems(level, [count](auto& list, int below) { list.SetItemCount(count, below); });
  while (GetItemCount() > std::max(count, 0)) {
    LeaveMasters(*children_.back());
    children_.pop_back();
  }
  const bool grows = GetItemCount() < count;
  while (GetItemCount() < count) children_.push_back(NewItemNode());
  if (grows && GetHasBeenTouched() == 1) TouchAllChildren();
  for (const auto& [list, listLevel] : syncedLists_) list->SetItemCount(count, listLevel);
}

void CYbSEKvfListBaseInterface::DeleteItem(int number, int level) {
  if (level != 1) return ForwardToItems(level, [number](auto& list, int below) { list.DeleteItem(number, below); });
  if (CYbSEKvfBase* item = GetItemNode(number)) {
    LeaveMasters(*item);
    RemoveChild(item);
  }
  for (const auto& [list, listLevel] : syncedLists_) list->DeleteItem(number, listLevel);
}

void CYbSEKvfListBaseInterface::InsertItem(int number, int level) {
  if (level != 1) return ForwardToItems(level, [number](auto& list, int below) { list.InsertItem(number, below); });
  const bool inserts = GetItemNode(number) != nullptr;
  if (inserts) {
    const auto place = static_cast<std::ptrdiff_t>(plainChildren_) + number - 1;
    children_.insert(children_.begin() + place, NewItemNode());
    if (GetHasBeenTouched() == level) TouchAllChildren();
  }
  for (const auto& [list, listLevel] : syncedLists_) list->InsertItem(number, listLevel);
  if (inserts) BeginItem(number);
}

bool CYbSEKvfListBaseInterface::SwapItems(int number, int other, int level,
                                          bool (CYbSEKvfListBaseInterface::*move)(int, int)) {
  if (level != 1 || !GetItemNode(number) || !GetItemNode(other)) return false;
  std::swap(children_[plainChildren_ + static_cast<std::size_t>(number - 1)],
            children_[plainChildren_ + static_cast<std::size_t>(other - 1)]);
  for (const auto& [list, listLevel] : syncedLists_) (list->*move)(number, listLevel);
  return true;
}

bool CYbSEKvfListBaseInterface::MoveItemUp(int number, int level) {
  return SwapItems(number, number - 1, level, &CYbSEKvfListBaseInterface::MoveItemUp);
}

bool CYbSEKvfListBaseInterface::MoveItemDown(int number, int level) {
  return SwapItems(number, number + 1, level, &CYbSEKvfListBaseInterface::MoveItemDown);
}

void CYbSEKvfListBaseInterface::UnregisterSyncedList(const CYbSEKvfListBaseInterface* list) {
  const auto found = std::find_if(syncedLists_.begin(), syncedLists_.end(),
                                  [list](const NodeInListOfSyncedLists& entry) { return entry.list == list; });
  if (found != syncedLists_.end()) syncedLists_.erase(found);
}

void CYbSEKvfListBaseInterface::SetItemDefaults(int level, int force) {
  if (GetHasBeenTouched() && !force) return;
  for (int number = 1; number <= GetItemCount(); ++number) {
    CYbSEKvfBase* item = GetItemNode(number);
    if (level == 1)
      item->SetDefault();
    else if (auto* list = level == 2 ? dynamic_cast<CYbSEKvfListBaseInterface*>(item) : nullptr)
      list->SetItemDefaults(1, 1);
  }
}

void CYbSEKvfListBaseInterface::ReadItemCount(KvfNode* section, std::string_view key) {
  int count = 0;
  if (!kvfGetParam(section, key, &count, 1, 1)) return;
  // The count may stand in the section of the list or in that of its owner.
  const KvfNode* own = GetSectionName().empty() ? nullptr : FindSection(section);
  SetItemCount(CountToTake(section, key, count, own ? own : section), 1);
}

void CYbSEKvfListBaseInterface::Load(KvfNode* parentSection) {
  CYbSEKvfBase::Load(parentSection);
  KvfNode* section = GetSectionUsed() && !GetSectionName().empty() ? FindSection(parentSection) : nullptr;
  if (!section) return;
  int missing = 0;
  for (int number = 1; number <= GetItemCount(); ++number) missing += MissedSection(*GetItemNode(number));
  if (missing > 0)
    kvfAddNote(section, kItemCountKey,
               fmt::format("{} of {} items have no section: they are at their defaults", missing, GetItemCount()));
}

}  // namespace tervane
