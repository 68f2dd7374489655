// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string_view>

#include "core/kvf.h"
#include "core/kvf_parser.h"

namespace tervane::fuzz {

inline bool IsCountKey(std::string_view name) {
  return name.find("Count") != std::string_view::npos || name.starts_with("No") || name.starts_with("Num");
}

/// Sum of the item counts that a file asks for.
inline double AskedItems(const KvfSection& section) {
  double sum = 0;
  for (const KvfNode* node = section.firstChild; node; node = node->next) {
    if (const KvfSection* child = AsSection(node)) {
      sum += AskedItems(*child);
    } else if (IsCountKey(node->Name()) && node->count > 0) {
      const KvfParam& count = node->params[0];
      const double number = count.type == KvfType::Int     ? count.asInt
                            : count.type == KvfType::Float ? static_cast<double>(count.asFloat)
                                                           : kvfGetDouble(&count);
      if (number > 0) sum += number;
    }
  }
  return sum;
}

/// A count of up to a million items is legal in a file of a few bytes, and costs a second and hundreds of megabytes:
/// the fuzzer would find nothing but these. Above this number it learns nothing new.
inline bool AsksForTooMuch(std::string_view setup) {
  constexpr double kMostItems = 2000;
  KvfFile file;
  return ParseKvf(FileContent::Of(setup), file) && AskedItems(file.top) > kMostItems;
}

}  // namespace tervane::fuzz
