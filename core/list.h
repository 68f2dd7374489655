// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Nodes that own a variable number of items of one class. All numbers are 1-based; a number out of range does nothing
// and gives null or false. Level 1 means this list; a higher level means the same operation, one level lower, on every
// item that is itself a list.
#pragma once

#include <functional>
#include <string>
#include <vector>

#include "core/node.h"

namespace tervane {

/// Largest item count that a file may ask for.
inline constexpr int kLargestItemCount = 1'000'000;
/// How many items a count may ask for beyond the sections that the file has for them, and how many all counts of a file
/// together: a small file cannot ask for much memory.
inline constexpr int kMostItemsWithoutSection = 1'000;
inline constexpr int kMostItemsWithoutSectionInFile = 100'000;

/// An item count of a section as it is taken, where `items` holds the sections of the items. What differs from the
/// count leaves a note.
int CountToTake(KvfNode* section, std::string_view key, int count, const KvfNode* items);

/// A list without its item class: what resizes and reorders any list.
class CYbSEKvfListBaseInterface : public CYbSEKvfBase {
 public:
  using CYbSEKvfBase::CYbSEKvfBase;
  ~CYbSEKvfListBaseInterface() override;

  virtual void SetItemCount(int count, int level);
  virtual void DeleteItem(int number, int level);
  virtual void InsertItem(int number, int level);
  virtual bool MoveItemUp(int number, int level);
  virtual bool MoveItemDown(int number, int level);

  int GetItemCount() const { return static_cast<int>(children_.size() - plainChildren_); }
  CYbSEKvfBase* GetItemNode(int number) const;
  /// Appends an item of the user's.
  void AddItemNode() {
    SetItemCount(GetItemCount() + 1, 1);
    BeginItem(GetItemCount());
  }
  /// Makes an item with this list as its parent; not added to the list.
  virtual std::unique_ptr<CYbSEKvfBase> NewItemNode() = 0;

  /// Keeps another list the same size and in the same order, at that level of it.
  void RegisterSyncedList(CYbSEKvfListBaseInterface* list, int level) { syncedLists_.push_back({list, level}); }
  /// Removes the first entry of that list.
  void UnregisterSyncedList(const CYbSEKvfListBaseInterface* list);

  /// Resets the items at level 1, their items at level 2; a touched list only when forced.
  void SetItemDefaults(int level, int force);

  CYbSEKvfBase* GetChild(int number) const override { return GetItemNode(number); }
  int GetChildCount() const override { return GetItemCount(); }
  int GetNumberWhatIs(const CYbSEKvfBase* node) const override;

  void Load(KvfNode* parentSection) override;
  void LoadSize(KvfNode* section) override { ReadItemCount(section, kItemCountKey); }
  void SaveSize(KvfFile* file) override { kvfPutParam(file, kItemCountKey, GetItemCount()); }

  /// Resizes the list by a count key of the section, if it has that key, as far as the count is taken.
  void ReadItemCount(KvfNode* section, std::string_view key);

  static constexpr std::string_view kItemCountKey = "YbSEKvfListItemCount";

 protected:
  /// Gives a new item of the user's what it begins with: it was appended or inserted, and stands at its place. An item
  /// for a section of a file, or for a count, is none.
  virtual void BeginItem(int /*number*/) {}

 private:
  struct NodeInListOfSyncedLists {
    CYbSEKvfListBaseInterface* list;
    int level;
  };

  /// Calls the operation on the items that are lists, one level lower.
  void ForwardToItems(int level, const std::function<void(CYbSEKvfListBaseInterface&, int)>& operation);
  bool SwapItems(int number, int other, int level, bool (CYbSEKvfListBaseInterface::*move)(int, int));

  std::vector<NodeInListOfSyncedLists> syncedLists_;
};

/// A list of items of class `Item`.
template <class Item>
class CYbSEKvfAbstractListBase : public CYbSEKvfListBaseInterface {
 public:
  using CYbSEKvfListBaseInterface::CYbSEKvfListBaseInterface;

  virtual std::unique_ptr<Item> NewItem() = 0;
  Item* GetItem(int number) const { return static_cast<Item*>(GetItemNode(number)); }
  /// Appends an item.
  Item* AddItem() {
    this->AddItemNode();
    return GetItem(GetItemCount());
  }

  std::unique_ptr<CYbSEKvfBase> NewItemNode() override { return NewItem(); }
};

/// A list whose items take the list as the only argument of their constructor.
template <class Item>
class CYbSEKvfListBase : public CYbSEKvfAbstractListBase<Item> {
 public:
  using CYbSEKvfAbstractListBase<Item>::CYbSEKvfAbstractListBase;

  std::unique_ptr<Item> NewItem() override { return std::make_unique<Item>(this); }
};

/// A list whose items have names that other lists' tables offer as choices.
class CYbSEItemNameSource {
 public:
  virtual ~CYbSEItemNameSource() = default;
  /// The name of an item; empty when there is no such item.
  virtual std::string GetItemName(int number) const = 0;
};

}  // namespace tervane
