// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/datafile_facts.h"

#include <fmt/format.h>

#include "platform/file_cache.h"

namespace tervane {

std::string DataFileFacts::WhyNoItem(int number) const {
  return Item(number) ? std::string() : fmt::format("there is no item {}: the file has {}", number, items.size());
}

std::shared_ptr<const DataFileFacts> DataFileFactsOf(const std::string& path) {
  static FileCache<DataFileFacts> cache(kMostFacts);
  return cache.Get(path, "header", [&] {
    DataFileFacts facts;
    DataFile file;
    facts.error = path.empty() ? "no file is chosen" : file.Open(path);
    if (!facts.error.empty()) return facts;
    facts.items = file.Items();
    facts.time = file.Time();
    facts.notes = file.Notes();
    return facts;
  });
}

std::shared_ptr<const ItemRange> ItemRangeOf(const std::string& path, int item) {
  static FileCache<ItemRange> cache(kMostFacts);
  return cache.Get(path, fmt::format("range {}", item), [&] {
    ItemRange range;
    DataFile file;
    range.error = file.Open(path);
    if (range.error.empty()) range.error = file.Statistics(item, range.statistics);
    return range;
  });
}

}  // namespace tervane
