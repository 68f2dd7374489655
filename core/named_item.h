// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "core/list.h"

namespace tervane {

/// An item that a user names: a layer, a lens, a drain. The name is its title, wherever it has one.
class NamedItemKvf : public CYbSEKvfGroupBase {
 public:
  /// `name` is what a new one is called.
  NamedItemKvf(std::string title, std::string section, std::string name, CYbSEKvfBase* parent)
      : CYbSEKvfGroupBase(std::move(title), std::move(section), parent), Name(std::move(name)) {}

  std::string Name;

  const std::string& GetTitle() const override { return Name.empty() ? CYbSEKvfGroupBase::GetTitle() : Name; }
  const std::string& GetAbbreviatedTitle() const override { return Name; }
  void SetAbbreviatedTitle(std::string title) override { Name = std::move(title); }

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys("Name", Name); }
};

/// A list of items with names, which other lists take them from.
template <class Item>
class NamedListKvf : public CYbSEKvfListBase<Item>, public CYbSEItemNameSource {
 public:
  using CYbSEKvfListBase<Item>::CYbSEKvfListBase;

  std::string GetItemName(int number) const override {
    const Item* item = this->GetItem(number);
    return item ? item->Name : std::string();
  }

 protected:
  /// A new list of layers has one.
  void BeginWithAquifer() {
    this->SetItemCount(1, 1);
    this->GetItem(1)->Name = "Aquifer";
  }
};

}  // namespace tervane
