// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/search.h"

#include <algorithm>
#include <set>
#include <tuple>
#include <unordered_map>
#include <unordered_set>

#include "forms/page.h"
#include "forms/table_form.h"
#include "pages/tree_entries.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// A text of a page in one line.
std::string OneLine(std::string_view text) { return std::string(Trimmed(Replaced(text, "\n", " "))); }

/// What a page shows, and what its node and those below it that have no page store; each text once.
class PageTexts {
 public:
  PageTexts(const TreeEntry& entry, int tree) {
    page_.serial = entry.node->Serial();
    page_.title = entry.title;
    page_.tree = tree;
    AddNode(*entry.node, entry.path);
    Add(SearchHit::Kind::Title, entry.title, *entry.node, {}, {});
    Add(SearchHit::Kind::Title, entry.node->GetTitle(), *entry.node, {}, {});
  }

  void AddControl(const Control& control) {
    const CYbSEKvfBase& node = paths_.contains(control.node) ? *control.node : *nodes_.front();
    const bool isCalled = !OneLine(control.label).empty();
    Add(SearchHit::Kind::Label, control.label, node, control.key, control.label);
    if (!control.key.empty()) {
      if (!isCalled) Add(SearchHit::Kind::Key, control.key, node, control.key, {});
      keys_.emplace(&node, control.key);
    }
    for (const std::string& option : control.Options())
      Add(SearchHit::Kind::Option, option, node, control.key, control.label);
    if (!control.table) return;
    for (const TableColumn& column : control.table->Columns()) {
      Add(SearchHit::Kind::Label, column.head, node, {}, control.label);
      Add(SearchHit::Kind::Key, column.key, node, {}, control.label);
      for (const CellChoice& choice : column.choices)
        Add(SearchHit::Kind::Option, choice.text, node, {}, control.label);
    }
  }

  /// Behind the page, whose controls lead to their keys better than a key alone.
  void AddKeysAndSections() {
    for (CYbSEKvfBase* node : nodes_) {
      std::vector<KeyInfo> described;
      node->DescribeKeys(described);
      for (const KeyInfo& info : described) {
        const std::string key(Trimmed(info.key));
        if (!keys_.contains({node, key})) Add(SearchHit::Kind::Key, key, *node, key, {});
      }
      if (node != nodes_.front() && !node->GetSectionName().empty())
        Add(SearchHit::Kind::Section, node->FormattedSectionName(), *node, {}, {});
    }
  }

  std::vector<SearchHit> Take() { return std::move(hits_); }

 private:
  void AddNode(CYbSEKvfBase& node, const std::string& path) {
    nodes_.push_back(&node);
    paths_.emplace(&node, path);
    ChildSteps steps(node);
    for (CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child)) {
      const std::string step = steps.StepOf(*child);
      if (child->HoldsSetup() && !PageClassOf(*child) && child->IsDlgUsedInSetup())
        AddNode(*child, JoinPath(path, step));
    }
  }

  void Add(SearchHit::Kind kind, std::string_view text, const CYbSEKvfBase& node, const std::string& key,
           const std::string& label) {
    SearchHit hit = page_;
    hit.path = paths_.at(&node);
    hit.kind = kind;
    hit.text = OneLine(text);
    hit.key = key;
    hit.label = label;
    if (!hit.text.empty() && seen_.emplace(kind, hit.text, hit.path, key).second) hits_.push_back(std::move(hit));
  }

  SearchHit page_;
  std::vector<CYbSEKvfBase*> nodes_;  ///< That of the page first.
  std::unordered_map<const CYbSEKvfBase*, std::string> paths_;
  std::set<std::pair<const CYbSEKvfBase*, std::string>> keys_;  ///< Which controls show.
  std::set<std::tuple<SearchHit::Kind, std::string, std::string, std::string>> seen_;
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
      PageTexts texts(entry, tree);
      if (const auto page = MakePageToRead(*entry.page, *entry.node, {document, host, {}}))
        page->Form().ForEach([&](const Control& control) { texts.AddControl(control); });
      texts.AddKeysAndSections();
      for (SearchHit& hit : texts.Take()) {
        using Kind = SearchHit::Kind;
        const bool hasPlace = hit.kind != Kind::Option;
        std::string place = !hasPlace ? std::string() : hit.key.empty() ? hit.path : hit.path + ":" + hit.key;
        std::string name = hit.kind == Kind::Title   ? hit.path.substr(hit.path.rfind('/') + 1)
                           : hit.kind == Kind::Label ? hit.key
                                                     : std::string();
        std::string text = LowerCase(hit.text), title = LowerCase(hit.title);
        entries_.push_back({std::move(hit), std::move(text), LowerCase(name), std::move(title), LowerCase(place)});
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
      const bool isOwn = entry.text.find(word) != std::string::npos || entry.name.find(word) != std::string::npos ||
                         (isPlace && entry.place.find(word) != std::string::npos);
      hasOwn = hasOwn || isOwn;
      hasAll = hasAll && (isOwn || entry.title.find(word) != std::string::npos);
    }
    if (!hasAll || !hasOwn) continue;
    const bool isBegin = entry.text.starts_with(words.front()) || entry.name.starts_with(words.front());
    found.emplace_back(2 * static_cast<int>(entry.hit.kind) + (isBegin ? 0 : 1), &entry.hit);
  }
  std::ranges::stable_sort(found, {}, &std::pair<int, const SearchHit*>::first);
  std::vector<SearchHit> hits;
  for (std::size_t i = 0; i < std::min(most, found.size()); ++i) hits.push_back(*found[i].second);
  return hits;
}

}  // namespace tervane
