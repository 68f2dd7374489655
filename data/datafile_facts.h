// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What the header of a data file says, read once for all callers while the file is unchanged.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "data/datafile.h"

namespace tervane {

struct DataFileFacts {
  std::string error;  ///< Why the file cannot be read, as `DataFile::Open` says it; then the rest is empty.
  std::vector<DataItem> items;
  TimeAxis time;
  std::vector<std::string> notes;

  /// An item by its number from 1; null when there is none, and then `WhyNoItem` says so.
  const DataItem* Item(int number) const {
    return number >= 1 && static_cast<std::size_t>(number) <= items.size()
               ? &items[static_cast<std::size_t>(number - 1)]
               : nullptr;
  }
  /// "there is no item 3: the file has 2"; empty when there is one.
  std::string WhyNoItem(int number) const;
};
/// Never null. An empty path is no file.
std::shared_ptr<const DataFileFacts> DataFileFactsOf(const std::string& path);

/// The range of an item over all its steps, and why it cannot be had; kept likewise, since without stored statistics
/// all values are read.
struct ItemRange {
  std::string error;
  ItemStatistics statistics;
};
std::shared_ptr<const ItemRange> ItemRangeOf(const std::string& path, int item);

}  // namespace tervane
