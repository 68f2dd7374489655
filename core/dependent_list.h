// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Lists that follow a master: every dependent holds one entry for each entry of its master, in the master's order and
// under its name. A master adds, inserts, deletes, moves or renames an entry, and each dependent does the same to its
// own, without the master knowing the dependent's class. Entries are linked by an identity that is made while the
// program runs and never stored.
//
// The interfaces are second bases of nodes: the way from one to the other is a run-time cast.
#pragma once

#include <algorithm>
#include <string>
#include <unordered_map>
#include <utility>
#include <vector>

#include "core/list.h"
#include "platform/text.h"

namespace tervane {

/// Somebody whose links to other nodes a change may change; undoing puts them back.
class LinkHolder {
 public:
  virtual ~LinkHolder() = default;
  /// The links as addresses, in an order of their own.
  virtual std::vector<void*> Links() const = 0;
  virtual void SetLinks(const std::vector<void*>& links) = 0;
};

/// A list that can be told that something changed.
class CTvnDependentListBase {
 public:
  virtual ~CTvnDependentListBase() = default;

  virtual void AddListener(CTvnDependentListBase* list) { listeners_.push_back(list); }
  /// Removes the first entry of that list.
  virtual void RemoveListener(CTvnDependentListBase* list);
  /// `OnNotify` here, then `Notify` on each listener, in order.
  virtual void Notify(int value, void* object);
  virtual void OnNotify(int value, void* object) = 0;
  /// Cuts all links between a master and this list, which leaves the tree; undoing puts them back.
  virtual void LeaveMaster() {}

 private:
  std::vector<CTvnDependentListBase*> listeners_;
};

/// What a list may ask of an entry.
class CTvnItemInterface : public LinkHolder {
 public:
  /// The master entry's circumstances changed; `number` is the place of what it refers to in `list`, 0 for none.
  virtual void OnMasterChanged(CTvnDependentListBase* /*list*/, int /*number*/) {}
  virtual const std::string& GetName() const = 0;
  virtual void SetName(const std::string& name) = 0;
};

/// An entry with its identity. A master entry also holds the entries that follow it, one for each dependent list.
template <class Item>
class CTvnAbstractItemBase : public CTvnItemInterface {
 public:
  virtual void AddLinkedItem(Item* item) { linkedItems_.push_back(item); }
  /// Removes the first entry that is this item.
  virtual void RemoveLinkedItem(Item* item) {
    const auto found = std::find(linkedItems_.begin(), linkedItems_.end(), item);
    if (found != linkedItems_.end()) linkedItems_.erase(found);
  }
  virtual int GetId() const { return id_; }
  virtual void SetId(int id) { id_ = id; }

  const std::vector<Item*>& LinkedItems() const { return linkedItems_; }
  std::vector<void*> Links() const override { return {linkedItems_.begin(), linkedItems_.end()}; }
  void SetLinks(const std::vector<void*>& links) override {
    linkedItems_.clear();
    for (void* link : links) linkedItems_.push_back(static_cast<Item*>(link));
  }
  /// Passes a master entry's new name on.
  void RenameLinked(const std::string& name) {
    for (Item* item : linkedItems_) item->SetName(name);
  }

 private:
  int id_ = 0;
  std::vector<Item*> linkedItems_;
};

/// A master or a dependent list of entries with the interface `Item`; `List` is the class that derives from this.
template <class List, class Item>
class CTvnAbstractListBase : public CTvnDependentListBase, public LinkHolder {
 public:
  using ItemBase = Item;

  void OnNotify(int /*value*/, void* /*object*/) override {}

  virtual void AddDependentList(List* list) { dependentLists_.push_back(list); }
  /// Removes the first entry of that list.
  virtual void RemoveDependentList(List* list) {
    const auto found = std::find(dependentLists_.begin(), dependentLists_.end(), list);
    if (found != dependentLists_.end()) dependentLists_.erase(found);
  }
  /// Makes a new entry of this list at its end.
  virtual Item* CreateDependentItem(int id, const std::string& name) = 0;
  /// The entry with that identity, or null.
  virtual Item* FindDependentItem(int id) = 0;
  /// Takes the entry out of this list.
  virtual void RemoveDependentItem(Item* item) = 0;
  /// Renews what follows from the kinds of the master's entries.
  virtual void RefreshDependents() {}
  /// Links a master entry that was just made or read.
  virtual void LinkNewItem(Item* /*masterItem*/) {}

  const std::vector<List*>& DependentLists() const { return dependentLists_; }
  std::vector<void*> Links() const override { return {dependentLists_.begin(), dependentLists_.end()}; }
  void SetLinks(const std::vector<void*>& links) override {
    dependentLists_.clear();
    for (void* link : links) dependentLists_.push_back(static_cast<List*>(link));
  }

 private:
  std::vector<List*> dependentLists_;
};

class CSpeciesItemBase : public CTvnAbstractItemBase<CSpeciesItemBase> {};
class CDencyItemBase : public CTvnAbstractItemBase<CDencyItemBase> {};
class CSorptionProcessesItemBase : public CTvnAbstractItemBase<CSorptionProcessesItemBase> {};

class CSpeciesListBase : public CTvnAbstractListBase<CSpeciesListBase, CSpeciesItemBase> {};
class CDecayListBase : public CTvnAbstractListBase<CDecayListBase, CDencyItemBase> {};
class CSorptionProcessesListBase : public CTvnAbstractListBase<CSorptionProcessesListBase, CSorptionProcessesItemBase> {
};

// ---- What all masters and all dependents share

/// Brings an entry to that place, from 1, among the entries of its node; children of other kinds keep their places.
template <class ItemBase>
void MoveEntryTo(CYbSEKvfBase& dependent, CYbSEKvfBase* entry, std::size_t place) {
  std::vector<CYbSEKvfBase*> entries;
  for (CYbSEKvfBase* child = dependent.GetFirstChild(); child; child = dependent.GetNextChild(child))
    if (dynamic_cast<ItemBase*>(child)) entries.push_back(child);
  const auto found = std::find(entries.begin(), entries.end(), entry);
  if (found == entries.end() || place < 1 || place > entries.size()) return;
  const auto swap = [&](std::size_t a, std::size_t b) {
    dependent.SwapChilds(entries[a], entries[b]);
    std::swap(entries[a], entries[b]);
  };
  auto at = static_cast<std::size_t>(found - entries.begin());
  for (; at + 1 > place; --at) swap(at, at - 1);
  for (; at + 1 < place; ++at) swap(at, at + 1);
}

/// A dependent list: a node of base `NodeBase` whose children are, among others, the entries. `Entry` is the concrete
/// entry, a node whose constructor takes the name and the parent; `ListBase` is one of the list bases above.
template <class NodeBase, class Entry, class ListBase>
class CTvnDependentList : public NodeBase, public ListBase {
 public:
  using ItemBase = typename ListBase::ItemBase;

  /// `masterName` is the name under which the master is registered; it stands before its dependents are made.
  CTvnDependentList(std::string title, std::string sectionName, std::string masterName, CYbSEKvfBase* parent)
      : NodeBase(std::move(title), std::move(sectionName), parent), masterName_(std::move(masterName)) {}

  ~CTvnDependentList() override { CutLinks(); }
  void LeaveMaster() override { CutLinks(); }

  ItemBase* CreateDependentItem(int id, const std::string& name) override {
    Entry* entry = this->template NewChild<Entry>(name);
    entry->SetId(id);
    return entry;
  }
  ItemBase* FindDependentItem(int id) override {
    const auto entryAt = [this](std::size_t place) {
      return place < this->children_.size() ? dynamic_cast<ItemBase*>(this->children_[place].get()) : nullptr;
    };
    if (const auto known = places_.find(id); known != places_.end())
      if (ItemBase* entry = entryAt(known->second); entry && entry->GetId() == id) return entry;
    // The order has changed, here or by undoing.
    places_.clear();
    for (std::size_t place = 0; place < this->children_.size(); ++place)
      if (const ItemBase* entry = entryAt(place)) places_.emplace(entry->GetId(), place);
    const auto found = places_.find(id);
    return found == places_.end() ? nullptr : entryAt(found->second);
  }
  void RemoveDependentItem(ItemBase* item) override { this->RemoveChild(dynamic_cast<CYbSEKvfBase*>(item)); }

 protected:
  /// To be called at the end of the concrete constructor, when the node is whole: registers with the master and makes
  /// one entry for each that the master has.
  void FollowMaster() {
    auto* master = Master();
    if (!master) return;
    master->AddDependentList(this);
    ForEachEntry(*dynamic_cast<CYbSEKvfBase*>(master), [this](ItemBase& masterItem) {
      masterItem.AddLinkedItem(CreateDependentItem(masterItem.GetId(), masterItem.GetName()));
    });
  }

 private:
  ListBase* Master() const { return dynamic_cast<ListBase*>(this->ImportantNode(masterName_)); }

  template <class Visit>
  static void ForEachEntry(const CYbSEKvfBase& node, const Visit& visit) {
    for (CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child))
      if (auto* entry = dynamic_cast<ItemBase*>(child)) visit(*entry);
  }

  void CutLinks() {
    // No node can be found any more while the whole tree is being destroyed.
    auto* master = Master();
    if (!master) return;
    master->RemoveDependentList(this);
    ForEachEntry(*dynamic_cast<CYbSEKvfBase*>(master), [this](ItemBase& masterItem) {
      if (ItemBase* entry = FindDependentItem(masterItem.GetId())) masterItem.RemoveLinkedItem(entry);
    });
  }

  std::string masterName_;
  std::unordered_map<int, std::size_t> places_;  ///< Of the entries among the children by identity; checked before use.
};

/// A new identity for a master entry, unique in the process.
int NewEntryId();

/// A master list. `Item` is a node whose constructor takes the list and which derives from the item base too; its
/// `SetName` passes a new name on with `RenameLinked`, and its `ReadData` ends in `LinkNewItem` of its parent, when its
/// name is known.
template <class Item, class ListBase>
class CTvnMasterList : public CYbSEKvfListBase<Item>, public ListBase {
 public:
  using ItemBase = typename ListBase::ItemBase;
  using Nodes = CYbSEKvfListBase<Item>;

  /// New items are named `baseName` and a number.
  CTvnMasterList(std::string title, std::string sectionName, std::string baseName, CYbSEKvfBase* parent)
      : Nodes(std::move(title), std::move(sectionName), parent), baseName_(std::move(baseName)) {}

  /// An item of the list, which a sample of one is not.
  std::unique_ptr<CYbSEKvfBase> NewItemNode() override {
    auto item = this->NewItem();
    item->SetId(NewEntryId());
    ++nameCounter_;
    return item;
  }

  void DeleteItem(int number, int level) override {
    if (Item* item = level == 1 ? this->GetItem(number) : nullptr) {
      UnlinkItem(*item);
      ++nameOffset_;
    }
    Nodes::DeleteItem(number, level);
  }

  void SetItemCount(int count, int level) override {
    if (level == 1)
      for (int number = this->GetItemCount(); number > std::max(count, 0); --number) UnlinkItem(*this->GetItem(number));
    Nodes::SetItemCount(count, level);
  }

  bool MoveItemUp(int number, int level) override {
    Item* item = this->GetItem(number);
    if (!Nodes::MoveItemUp(number, level)) return false;
    BringDependentsTo(*item, number - 1);
    return true;
  }
  bool MoveItemDown(int number, int level) override {
    Item* item = this->GetItem(number);
    if (!Nodes::MoveItemDown(number, level)) return false;
    BringDependentsTo(*item, number + 1);
    return true;
  }

  /// Items whose section is missing are named and linked like added ones.
  void Load(KvfNode* parentSection) override {
    Nodes::Load(parentSection);
    int lastRead = this->GetItemCount();
    while (lastRead > 0 && this->MissedSection(*this->GetItem(lastRead))) --lastRead;
    for (int number = 1; number <= this->GetItemCount(); ++number) {
      Item* item = this->GetItem(number);
      if (!this->MissedSection(*item)) continue;
      if (item->GetName().empty()) item->SetName(NewName(*item));
      LinkNewItem(item);
      // Behind all others its entries stand at their end anyway.
      if (number < lastRead) BringDependentsTo(*item, number);
    }
  }

  /// Gives each dependent an entry for a master entry that has none yet, and tells the new entry of its circumstances.
  void LinkNewItem(ItemBase* masterItem) override {
    if (!masterItem->LinkedItems().empty()) return;
    const int number = this->GetNumberWhatIs(dynamic_cast<CYbSEKvfBase*>(masterItem));
    for (auto* dependent : this->DependentLists()) {
      ItemBase* entry = dependent->CreateDependentItem(masterItem->GetId(), masterItem->GetName());
      if (!entry) continue;
      masterItem->AddLinkedItem(entry);
      entry->OnMasterChanged(this, number);
    }
  }

  // A master list depends on no other list.
  ItemBase* CreateDependentItem(int /*id*/, const std::string& /*name*/) override { return nullptr; }
  ItemBase* FindDependentItem(int id) override {
    if (const auto known = numbers_.find(id); known != numbers_.end())
      if (Item* item = this->GetItem(known->second); item && item->GetId() == id) return item;
    // The order has changed, here or by undoing.
    numbers_.clear();
    for (int number = 1; number <= this->GetItemCount(); ++number)
      numbers_.emplace(this->GetItem(number)->GetId(), number);
    const auto found = numbers_.find(id);
    return found == numbers_.end() ? nullptr : this->GetItem(found->second);
  }
  void RemoveDependentItem(ItemBase* /*item*/) override {}

  /// All dependents renew what follows from the items' kinds; then the listeners are notified.
  void RefreshDependents() override {
    for (auto* dependent : this->DependentLists()) dependent->RefreshDependents();
    this->Notify(0, nullptr);
  }

 protected:
  void BeginItem(int number) override {
    Item* item = this->GetItem(number);
    item->SetName(NewName(*item));
    LinkNewItem(item);
    if (number < this->GetItemCount()) BringDependentsTo(*item, number);
  }

 private:
  /// A name that no other item has and that does not come back after a delete.
  std::string NewName(const Item& newItem) {
    for (int number = 1; number <= this->GetItemCount(); ++number) {
      Item* other = this->GetItem(number);
      if (other == &newItem || other->GetName() != baseName_ + std::to_string(nameCounter_)) continue;
      ++nameCounter_;
      ++nameOffset_;
    }
    const auto name = [this] { return baseName_ + std::to_string(nameOffset_ + this->GetItemCount()); };
    // The names of a file come in any order and any case.
    while (IsTaken(name(), newItem)) {
      ++nameCounter_;
      ++nameOffset_;
    }
    return name();
  }
  bool IsTaken(const std::string& name, const Item& exceptBy) {
    for (int number = 1; number <= this->GetItemCount(); ++number)
      if (const Item* other = this->GetItem(number); other != &exceptBy && EqualIgnoringCase(other->GetName(), name))
        return true;
    return false;
  }

  void UnlinkItem(Item& item) {
    for (auto* dependent : this->DependentLists()) {
      ItemBase* entry = dependent->FindDependentItem(item.GetId());
      if (!entry) continue;
      item.RemoveLinkedItem(entry);
      dependent->RemoveDependentItem(entry);
    }
  }

  void BringDependentsTo(Item& item, int number) {
    for (auto* dependent : this->DependentLists())
      if (ItemBase* entry = dependent->FindDependentItem(item.GetId()))
        MoveEntryTo<ItemBase>(*dynamic_cast<CYbSEKvfBase*>(dependent), dynamic_cast<CYbSEKvfBase*>(entry),
                              static_cast<std::size_t>(number));
  }

  std::string baseName_;
  std::unordered_map<int, int> numbers_;  ///< Of the items by identity; checked before use.
  int nameCounter_ = 0;
  int nameOffset_ = 0;
};

}  // namespace tervane
