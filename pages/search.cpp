// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/search.h"

#include <algorithm>
#include <set>
#include <unordered_set>

#include "forms/page.h"
#include "forms/table_form.h"
#include "pages/tree_entries.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// A text of a page in one line.
std::string OneLine(std::string_view text) { return std::string(Trimmed(Replaced(text, "\n", " "))); }

/// What a page shows and its node stores, each text once.
class PageTexts {
 public:
  explicit PageTexts(const TreeEntry& entry) : node_{entry.node->Serial(), entry.path, entry.title, {}, {}, {}, {}} {}

  void Add(SearchHit::Kind kind, std::string_view text, const std::string& key, const std::string& label) {
    SearchHit hit = node_;
    hit.kind = kind;
    hit.text = OneLine(text);
    hit.key = key;
    hit.label = label;
    if (!hit.text.empty() && seen_.emplace(kind, hit.text, key).second) hits_.push_back(std::move(hit));
  }

  void AddControl(const Control& control) {
    Add(SearchHit::Kind::Label, control.label, control.key, control.label);
    for (const std::string& option : control.Options())
      Add(SearchHit::Kind::Option, option, control.key, control.label);
    Add(SearchHit::Kind::Key, control.key, control.key, control.label);
    if (!control.table) return;
    for (const TableColumn& column : control.table->Columns()) {
      Add(SearchHit::Kind::Label, column.head, {}, control.label);
      Add(SearchHit::Kind::Key, column.key, {}, control.label);
      for (const CellChoice& choice : column.choices) Add(SearchHit::Kind::Option, choice.text, {}, control.label);
    }
  }

  std::vector<SearchHit> Take() { return std::move(hits_); }

 private:
  SearchHit node_;
  std::set<std::tuple<SearchHit::Kind, std::string, std::string>> seen_;
  std::vector<SearchHit> hits_;
};

std::vector<std::string> Words(std::string_view typed) {
  std::vector<std::string> words;
  const std::string lower = LowerCase(typed);
  for (std::string_view rest = Trimmed(lower); !rest.empty(); rest = Trimmed(rest)) {
    const std::size_t end = std::min(rest.find_first_of(" \t\r\n"), rest.size());
    words.emplace_back(rest.substr(0, end));
    rest.remove_prefix(end);
  }
  return words;
}

}  // namespace

SearchIndex::SearchIndex(CYbSEDocument& document) {
  NobodyToAsk host;
  std::unordered_set<const CYbSEKvfBase*> done;
  for (const int tree : {kSetupDataTree, kProcessedDataTree, kResultsTree}) {
    for (const TreeEntry& entry : TreeEntries(document.Root(), tree)) {
      if (!done.insert(entry.node).second) continue;
      PageTexts texts(entry);
      texts.Add(SearchHit::Kind::Title, entry.title, {}, {});
      texts.Add(SearchHit::Kind::Title, entry.node->GetTitle(), {}, {});
      if (const auto page = MakePageToRead(*entry.page, *entry.node, {document, host, {}}))
        page->Form().ForEach([&](const Control& control) { texts.AddControl(control); });
      // Behind the page, whose controls lead to their keys better than a key alone.
      std::vector<KeyInfo> keys;
      entry.node->DescribeKeys(keys);
      for (const KeyInfo& key : keys) texts.Add(SearchHit::Kind::Key, key.key, std::string(Trimmed(key.key)), {});
      for (SearchHit& hit : texts.Take()) {
        std::string place = hit.kind == SearchHit::Kind::Title ? hit.path
                            : hit.kind == SearchHit::Kind::Key ? hit.path + ":" + hit.key
                                                               : std::string();
        std::string text = LowerCase(hit.text), title = LowerCase(hit.title);
        entries_.push_back({std::move(hit), std::move(text), std::move(title), LowerCase(place)});
      }
    }
  }
}

std::vector<SearchHit> SearchIndex::Find(std::string_view typed, std::size_t most) const {
  const std::vector<std::string> words = Words(typed);
  std::vector<std::pair<int, const SearchHit*>> found;
  for (const Entry& entry : entries_) {
    bool hasAll = true, hasOwn = false;
    for (const std::string& word : words) {
      const bool isPlace = word.find_first_of("/:") != std::string::npos;
      const bool isOwn =
          entry.text.find(word) != std::string::npos || (isPlace && entry.place.find(word) != std::string::npos);
      hasOwn = hasOwn || isOwn;
      hasAll = hasAll && (isOwn || entry.title.find(word) != std::string::npos);
    }
    if (!hasAll || !hasOwn) continue;
    found.emplace_back(2 * static_cast<int>(entry.hit.kind) + (entry.text.starts_with(words.front()) ? 0 : 1),
                       &entry.hit);
  }
  std::ranges::stable_sort(found, {}, &std::pair<int, const SearchHit*>::first);
  std::vector<SearchHit> hits;
  for (std::size_t i = 0; i < std::min(most, found.size()); ++i) hits.push_back(*found[i].second);
  return hits;
}

}  // namespace tervane
