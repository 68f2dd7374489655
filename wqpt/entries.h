// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What follows a master list in a compartment: a group with one entry for each species or process. A new dependent is a
// row, an entry on `NamedEntry`, and one line where its owner makes it.
#pragma once

#include <string>
#include <string_view>
#include <utility>

#include "core/dependent_list.h"
#include "simspec/pages.h"

namespace tervane {

/// An entry: bears the name of its master's entry, which is its title and stands first in its section. The name of a
/// file counts in the master's section alone.
template <class Node, class ItemBase>
class NamedEntry : public Node, public ItemBase {
 public:
  /// `arguments` are the node's.
  template <class... Arguments>
  explicit NamedEntry(std::string name, Arguments&&... arguments)
      : Node(std::forward<Arguments>(arguments)...), name_(std::move(name)) {}

  const std::string& GetName() const override { return name_; }
  void SetName(const std::string& name) override { name_ = name; }
  const std::string& GetTitle() const override { return name_; }
  const std::string& GetAbbreviatedTitle() const override { return name_; }

 protected:
  void ExchangeKeys(KeyExchange& keys) override {
    std::string fromFile = name_;
    keys("Name", keys.Section() ? fromFile : name_);
    Node::ExchangeKeys(keys);
  }

 private:
  std::string name_;
};

/// What makes one group of entries differ from the next.
struct EntriesKind {
  const char* section;
  const char* title;
  const char* shortTitle;
  const char* helpPage;
  std::string_view master;  ///< The important name.
};

/// The group. The concrete class calls `FollowMaster` last in its constructor.
template <class Entry, class ListBase>
class EntriesKvf : public CTvnDependentList<CYbSEKvfGroupBase, Entry, ListBase> {
 public:
  EntriesKvf(const EntriesKind& kind, Condition takesPart, CYbSEKvfBase* parent)
      : CTvnDependentList<CYbSEKvfGroupBase, Entry, ListBase>(kind.title, kind.section, std::string(kind.master),
                                                              parent) {
    this->SetAbbreviatedTitle(kind.shortTitle);
    this->SetHelp("Top.chm", kind.helpPage);
    this->SetPage(kHelpPage);
    this->TakesPartWhen(std::move(takesPart));
  }
};

}  // namespace tervane
