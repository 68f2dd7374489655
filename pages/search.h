// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "core/document.h"

namespace tervane {

/// Something that a search found.
struct SearchHit {
  /// In the order in which hits are listed.
  enum class Kind { Title, Label, Option, Key, Section };

  std::uint64_t serial = 0;  ///< Of the node whose page shows it.
  std::string path;          ///< Of the node that holds it, which may be one below without a page.
  std::string title;         ///< Of the node with the page.
  int tree = 0;              ///< The tree in which that stands.
  Kind kind = Kind::Title;
  std::string text;   ///< What was found, in one line.
  std::string key;    ///< Of the control or the key that was found; may be empty.
  std::string label;  ///< Of the control that shows it, exactly; empty where no control is known by a label.
};

/// All that can be found in a setup: the nodes that take part and have a page in some tree, their keys and sections and
/// those of the nodes below without a page, and what their pages show. A label and its key are one hit. To be made anew
/// when nodes or pages have changed; it changes nothing itself.
class SearchIndex {
 public:
  SearchIndex() = default;
  explicit SearchIndex(CYbSEDocument& document);

  /// What holds all typed words, whatever the case of ASCII letters: one of them in the text itself or its key or
  /// section, the others there or in the title of its node. A word with '/' or ':' is sought in paths as well
  /// ("SimSpec:ModelType"). Best first.
  std::vector<SearchHit> Find(std::string_view typed, std::size_t most) const;
  std::size_t Size() const { return entries_.size(); }

 private:
  struct Entry {
    SearchHit hit;
    /// In lower case; `name` is the section of a title, the key of a label, `place` the path with the key behind it.
    std::string text, name, title, place;
  };

  std::vector<Entry> entries_;
};

}  // namespace tervane
