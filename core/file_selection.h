// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <vector>

#include "core/node.h"

namespace tervane {

/// A node that holds a data file's name and what was chosen in it, one `Item` each.
template <class Item>
class YbSESelection : public CTvnKvfBase {
 public:
  using CTvnKvfBase::CTvnKvfBase;

  FileName File;
  std::vector<Item> Items;

 protected:
  void ExchangeKeys(KeyExchange& keys) override {
    keys("FILE_NAME", File);
    int count = static_cast<int>(Items.size());
    keys("ITEM_COUNT", count).HeldIn(nullptr);
    keys.Several("ITEM_NUMBERS", Items);
    // A file with fewer values than it counts has what it has.
    if (keys.IsReading() && count >= 0 && static_cast<std::size_t>(count) < Items.size())
      Items.resize(static_cast<std::size_t>(count));
  }
};

/// A grid or time series file and the numbers of the items that were chosen in it, from 1.
class YbSENdsSelection : public YbSESelection<int> {
 public:
  using YbSESelection::YbSESelection;

  /// One selected item, by its place from 0; 0 when there is none.
  int ItemNumber(std::size_t place) const { return place < Items.size() ? Items[place] : 0; }
};

/// A shape file and the names of the attributes that were chosen in it.
class YbSEShpSelection : public YbSESelection<std::string> {
 public:
  using YbSESelection::YbSESelection;

  /// One selected attribute, by its place from 0; empty when there is none.
  std::string ItemDescr(std::size_t place) const { return place < Items.size() ? Items[place] : std::string(); }
};

}  // namespace tervane
