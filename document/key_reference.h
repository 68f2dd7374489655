// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "core/key_exchange.h"

namespace tervane {

/// The keys of one node class at one place of the tree.
struct KeySection {
  std::string path;  ///< Sections joined by `/`, with `%d` where items are numbered.
  std::string className;
  std::string title;
  bool isList = false;  ///< The section begins with the item count.
  std::vector<KeyInfo> keys;
};

/// The path with `%d` for the number that each step ends in: "A/Item_12/B" gives "A/Item_%d/B".
std::string NumberlessPath(std::string_view path);

/// All keys of all sections, with their types and defaults, as the nodes declare them.
class KeyReference {
 public:
  KeyReference();
  /// One that is made when it is first asked for.
  static const KeyReference& Get();

  const std::vector<KeySection>& Sections() const { return sections_; }
  /// What is declared of a key; null when it is unknown. The path as below.
  const KeyInfo* Find(std::string_view sectionPath, std::string_view key) const;
  /// The default of a key as the file holds it; empty when the key is unknown or has none. The path is that of a
  /// section in a file, with the items' numbers.
  std::string_view DefaultOf(std::string_view sectionPath, std::string_view key) const;
  /// What a value in a file means, for people: the text of the choice, or the unit of the number; empty when nothing is
  /// known of it.
  std::string_view MeaningOf(std::string_view sectionPath, std::string_view key, std::string_view value) const;

 private:
  /// The path of the kind of a section: "A/Item_12/B#2" gives "A/Item_%d/B".
  std::string PathOfKind(std::string_view sectionPath) const;

  std::vector<KeySection> sections_;
  std::unordered_map<std::string, std::size_t> byPath_;
};

}  // namespace tervane
