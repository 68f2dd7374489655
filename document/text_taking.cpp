// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/text_taking.h"

#include <algorithm>
#include <deque>
#include <map>
#include <optional>
#include <unordered_map>
#include <unordered_set>
#include <utility>

#include <fmt/format.h>

#include "core/kvf.h"
#include "core/kvf_parser.h"
#include "core/kvf_writer.h"
#include "core/open_kvf.h"
#include "document/item_owner.h"
#include "document/key_reference.h"
#include "document/node_reading.h"
#include "document/setup_diff.h"

namespace tervane {

namespace {

/// The nodes that read and write one section: its owner and those below that have no section, and the nodes of the
/// sections in it, in the order of the file.
struct NodesOfSection {
  std::vector<CYbSEKvfBase*> readers;
  std::vector<CYbSEKvfBase*> below;

  explicit NodesOfSection(CYbSEKvfBase& owner) { Add(owner); }

 private:
  void Add(CYbSEKvfBase& node) {
    readers.push_back(&node);
    const auto add = [this](CYbSEKvfBase& child) {
      if (!child.HoldsSetup() || !child.GetSectionUsed()) return;
      if (child.GetSectionName().empty())
        Add(child);
      else
        below.push_back(&child);
    };
    for (int number = 1; number <= node.GetPropertyCount(); ++number) add(*node.GetProperty(number));
    for (CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child)) add(*child);
  }
};

/// A section whose items or zones a node holds, by its kind.
struct OwnedItems {
  ItemOwner owner{nullptr};

  explicit OwnedItems(const NodesOfSection& nodes) {
    for (CYbSEKvfBase* reader : nodes.readers)
      if (const ItemOwner found(reader); found.Node()) owner = found;
  }
  bool Hold(const CYbSEKvfBase& node) const { return owner.Node() && owner.Holds(node); }
};

using Identity = std::pair<std::string, int>;

/// Nodes of one kind by name and instance.
template <class Use>
void ForEachChild(const KvfSection& section, bool keywords, Use use) {
  std::unordered_map<std::string_view, int> instances;
  for (KvfNode* node = section.firstChild; node; node = node->next)
    if (node->IsKeyword() == keywords) use(*node, ++instances[node->Name()]);
}

class Taking {
 public:
  explicit Taking(CFlowModelDoc& document) : document_(document) {}

  bool HasTaken() const { return hasTaken_; }

  void Take(CYbSEKvfBase& owner, KvfSection& before, KvfSection& after, const std::string& path) {
    const NodesOfSection nodes(owner);
    TakeKeys(nodes, before, after, path);
    const std::size_t made = made_;
    TakeSections(nodes, before, after, path);
    // A new item may take a number, of which a key keeps count.
    if (made_ != made) TakeKeys(NodesOfSection(owner), before, after, path);
  }

 private:
  /// The readers read their section as they would write it, with what was edited for their own.
  void TakeKeys(const NodesOfSection& nodes, KvfSection& before, KvfSection& after, const std::string& path) {
    std::vector<std::pair<Identity, const KvfNode*>> edited;
    ForEachChild(after, true, [&](KvfNode& key, int instance) {
      const KvfNode* old = FindKvfNode(before, true, key.Name(), static_cast<std::size_t>(instance));
      if (!old || KvfValuesText(*old) != KvfValuesText(key))
        edited.push_back({{std::string(key.Name()), instance}, &key});
    });
    ForEachChild(before, true, [&](KvfNode& key, int instance) {
      if (FindKvfNode(after, true, key.Name(), static_cast<std::size_t>(instance))) return;
      if (const KvfNode* fallback = DefaultOf(path, key.Name()))
        edited.push_back({{std::string(key.Name()), instance}, fallback});
    });
    if (edited.empty()) return;

    const OpenKvf file(kvfCreate());
    file->folder = document_.Root().SetupFolder();
    kvfAddTarget(file.get(), document_.Root().GetTargetName());
    for (CYbSEKvfBase* reader : nodes.readers) reader->WriteData(file.get());
    KvfSection& held = file->Cursor();
    bool isAny = false;
    for (const auto& [identity, key] : edited)
      if (KvfNode* own = FindKvfNode(held, true, identity.first, static_cast<std::size_t>(identity.second))) {
        own->params = key->params;
        own->count = key->count;
        isAny = true;
      }
    if (!isAny) return;
    for (CYbSEKvfBase* reader : nodes.readers) ReadKeysAnew(*reader, held);
    hasTaken_ = true;
  }

  const KvfNode* DefaultOf(const std::string& path, std::string_view key) {
    const std::string value(KeyReference::Get().DefaultOf(path, key));
    if (value.empty()) return nullptr;
    KvfFile& file = defaults_.emplace_back();
    file.folder = document_.Root().SetupFolder();
    const std::string text = fmt::format("target T {{\nKey = {}\n}}\n", value);
    const KvfSection* target = ParseKvf(FileContent::Of(text), file) ? AsSection(file.top.firstChild) : nullptr;
    return target ? target->firstChild : nullptr;
  }

  void TakeSections(const NodesOfSection& nodes, KvfSection& before, KvfSection& after, const std::string& path) {
    const OwnedItems items(nodes);
    std::map<Identity, CYbSEKvfBase*> always;
    std::unordered_map<std::string, int> instances;
    for (CYbSEKvfBase* node : nodes.below) {
      const std::string name = node->FormattedSectionName();
      if (!items.Hold(*node)) always[{name, ++instances[name]}] = node;
    }
    std::vector<KvfSection*> olds, news;
    ForEachChild(before, false, [&](KvfNode& section, int instance) {
      if (!always.contains({std::string(section.Name()), instance})) olds.push_back(AsSection(&section));
    });
    ForEachChild(after, false, [&](KvfNode& section, int instance) {
      const auto found = always.find({std::string(section.Name()), instance});
      if (found == always.end()) return news.push_back(AsSection(&section));
      KvfNode* old = FindKvfNode(before, false, section.Name(), static_cast<std::size_t>(instance));
      if (old)
        Take(*found->second, *AsSection(old), *AsSection(&section), JoinPath(path, PathName(section.Name(), instance)));
    });
    if (items.owner.Node()) TakeItems(items.owner, olds, news, path);
  }

  void TakeItems(const ItemOwner& owner, const std::vector<KvfSection*>& olds, const std::vector<KvfSection*>& news,
                 const std::string& path) {
    const std::vector<CYbSEKvfBase*> items = owner.Items();
    if (items.size() != olds.size()) {
      // A key may have told their number. Where items came or went on a page, nobody knows which is which.
      for (std::size_t place = 0; place < items.size() && items.size() == news.size(); ++place)
        if (place < olds.size()) {
          Take(*items[place], *olds[place], *news[place], JoinPath(path, PathName(olds[place]->Name())));
        } else {
          LoadItem(*items[place], *news[place]);
        }
      return;
    }
    std::size_t front = 0, behind = 0;
    const std::size_t shorter = std::min(olds.size(), news.size());
    const auto isAlike = [](const KvfSection& a, const KvfSection& b) { return KvfTextInside(a) == KvfTextInside(b); };
    while (front < shorter && isAlike(*olds[front], *news[front])) ++front;
    while (behind < shorter - front && isAlike(*olds[olds.size() - 1 - behind], *news[news.size() - 1 - behind]))
      ++behind;
    const std::size_t oldEnd = olds.size() - behind, newEnd = news.size() - behind;
    std::size_t at = front;
    for (; at < std::min(oldEnd, newEnd); ++at)
      Take(*items[at], *olds[at], *news[at], JoinPath(path, PathName(olds[at]->Name())));
    for (std::size_t gone = oldEnd; gone > at; --gone) {
      owner.Remove(*items[gone - 1]);
      hasTaken_ = true;
    }
    for (; at < newEnd; ++at) {
      const int place = static_cast<int>(at) + 1;
      CYbSEKvfBase* made = place > owner.Count() ? owner.Add() : owner.Insert(place);
      if (!made) break;
      LoadItem(*made, *news[at]);
    }
  }

  void LoadItem(CYbSEKvfBase& item, KvfSection& section) {
    LoadAnew(item, section);
    hasTaken_ = true;
    ++made_;
  }

  CFlowModelDoc& document_;
  std::deque<KvfFile> defaults_;
  bool hasTaken_ = false;
  std::size_t made_ = 0;
};

/// Holds an edited section against what the setup would write in its place.
class Check {
 public:
  Check(const EditedSection& edited, std::vector<TextProblem>& problems) : edited_(edited), problems_(problems) {}

  /// What is as it was before the edit is passed over; `before` is null where nothing was.
  void Sections(KvfSection& held, KvfSection* before, KvfSection& after) {
    ForEachChild(after, true, [&](KvfNode& key, int instance) {
      const KvfNode* old =
          before ? FindKvfNode(*before, true, key.Name(), static_cast<std::size_t>(instance)) : nullptr;
      if (!old || KvfValuesText(*old) != KvfValuesText(key)) Key(held, key, instance);
    });
    // Items are numbered anew, and go by their order.
    std::unordered_map<std::string, std::size_t> places;
    std::unordered_map<std::string, std::vector<KvfSection*>> byKind;
    ForEachChild(held, false, [&](KvfNode& section, int /*instance*/) {
      byKind[NumberlessPath(section.Name())].push_back(AsSection(&section));
    });
    std::unordered_set<std::string> known;
    if (before)
      ForEachChild(*before, false, [&](KvfNode& section, int /*instance*/) {
        known.insert(NumberlessPath(section.Name()) + KvfTextInside(*AsSection(&section)));
      });
    ForEachChild(after, false, [&](KvfNode& section, int instance) {
      const std::string kind = NumberlessPath(section.Name());
      if (known.contains(kind + KvfTextInside(*AsSection(&section)))) {
        ++places[kind];
        return;
      }
      const std::vector<KvfSection*>& own = byKind[kind];
      const std::size_t place = places[kind]++;
      KvfNode* old = before ? FindKvfNode(*before, false, section.Name(), static_cast<std::size_t>(instance)) : nullptr;
      if (place < own.size())
        Sections(*own[place], AsSection(old), *AsSection(&section));
      else
        Tell(section, fmt::format("the setup takes no section {} here", section.Name()));
    });
  }

  void Tell(int line, std::string text) {
    const int inText = line - 1 + edited_.firstLine;
    if (inText >= edited_.firstEdited && inText <= edited_.lastEdited) problems_.push_back({inText, std::move(text)});
  }

 private:
  void Key(KvfSection& held, const KvfNode& key, int instance) {
    const KvfNode* own = FindKvfNode(held, true, key.Name(), static_cast<std::size_t>(instance));
    if (!own)
      Tell(key, fmt::format("the setup has no key {} here", key.Name()));
    else if (const std::string value = KvfValuesText(*own);
             ComparedText(*own) != ComparedText(key) && value != KvfValuesText(key))
      Tell(key, fmt::format("{} stays {}: the setup does not take {} here", key.Name(), value, KvfValuesText(key)));
  }
  void Tell(const KvfNode& node, std::string text) { Tell(static_cast<int>(node.line), std::move(text)); }

  const EditedSection& edited_;
  std::vector<TextProblem>& problems_;
};

/// A section as a file of its own; the target of a setup is one.
bool ParseSection(std::string_view text, bool isTarget, const std::string& folder, KvfFile& file) {
  file.folder = folder;
  const std::string whole = isTarget ? std::string(text) : fmt::format("target T {{{}\n}}\n", text);
  return ParseKvf(FileContent::Of(whole), file);
}

/// The only section of such a file, or null.
KvfSection* OnlySection(const KvfFile& file, bool isTarget) {
  KvfSection* section = AsSection(file.top.firstChild);
  if (!section || section->next) return nullptr;
  if (isTarget) return section;
  KvfSection* inner = AsSection(section->firstChild);
  return inner && !inner->next ? inner : nullptr;
}

std::vector<TextProblem> FaultsOf(const EditedSection& edited, const KvfFile& file, bool isParsed) {
  if (!isParsed) {
    // The place in front of the message counts from the section.
    std::string text = file.syntaxError.message;
    const std::string place = fmt::format("{}:{}: ", file.syntaxError.line, file.syntaxError.column);
    if (text.starts_with(place)) text.erase(0, place.size());
    return {{std::min(file.syntaxError.line - 1 + edited.firstLine, std::max(edited.lastEdited, edited.firstLine)),
             std::move(text)}};
  }
  if (!OnlySection(file, edited.steps.empty()))
    return {{edited.firstEdited, "the braces of a section do not match: each { needs its }"}};
  return {};
}

}  // namespace

std::vector<TextProblem> FaultsOf(const EditedSection& edited) {
  KvfFile file;
  const bool isParsed = ParseSection(edited.after, edited.steps.empty(), {}, file);
  return FaultsOf(edited, file, isParsed);
}

TakenText TakeText(CFlowModelDoc& document, const EditedSection& edited) {
  TakenText taken;
  const bool isTarget = edited.steps.empty();
  const std::string& folder = document.Root().SetupFolder();
  KvfFile before, after;
  taken.problems = FaultsOf(edited, after, ParseSection(edited.after, isTarget, folder, after));
  if (!taken.problems.empty()) return taken;
  taken.isParsed = true;
  KvfSection* const now = OnlySection(after, isTarget);
  KvfSection* const old =
      ParseSection(edited.before, isTarget, folder, before) ? OnlySection(before, isTarget) : nullptr;
  CYbSEKvfBase* owner = OwnerOfSection(document.Root(), edited.steps);
  Check check(edited, taken.problems);
  if (isTarget && now->Name() != document.Root().GetTargetName()) {
    taken.problems.push_back({edited.firstEdited, "what stands here is no part of the setup, and is kept as it was"});
    return taken;
  }
  if (!old || !owner || old->Name() != now->Name()) {
    taken.problems.push_back({edited.firstEdited, "the setup has no such section any more"});
    return taken;
  }
  std::string path;
  for (const PathStep& step : edited.steps) path = JoinPath(path, PathName(step.name, step.instance));
  Taking taking(document);
  taking.Take(*owner, *old, *now, path);
  if (taking.HasTaken()) {
    owner->SetRevalidateAll();
    taken.node = owner;
  }

  const OpenKvf file(kvfCreate());
  file->folder = folder;
  if (!isTarget) kvfAddTarget(file.get(), "T");
  owner->Save(file.get());
  KvfSection* held = AsSection(file->top.firstChild);
  if (held && !isTarget) held = AsSection(held->firstChild);
  if (held) check.Sections(*held, old, *now);
  for (const KvfComment& comment : after.comments) check.Tell(comment.line, "a saved setup keeps no comment here");
  std::stable_sort(taken.problems.begin(), taken.problems.end(),
                   [](const TextProblem& a, const TextProblem& b) { return a.line < b.line; });
  return taken;
}

std::vector<PathStep> SectionOf(const CYbSEKvfBase& node) {
  const CYbSEKvfBase* own = &node;
  while (own->GetParent() && own->GetSectionName().empty()) own = own->GetParent();
  if (!own->GetParent()) return {};
  CYbSEKvfBase* above = own->GetParent();
  while (above->GetParent() && above->GetSectionName().empty()) above = above->GetParent();
  std::vector<PathStep> steps = SectionOf(*above);
  const std::string name = own->FormattedSectionName();
  int instance = 0;
  for (const CYbSEKvfBase* sibling : NodesOfSection(*above).below) {
    instance += sibling->FormattedSectionName() == name;
    if (sibling == own) break;
  }
  steps.push_back({name, instance});
  return steps;
}

CYbSEKvfBase* OwnerOfSection(CYbSEKvfBase& root, const std::vector<PathStep>& steps) {
  CYbSEKvfBase* owner = &root;
  for (const PathStep& step : steps) {
    CYbSEKvfBase* found = nullptr;
    int instance = 0;
    for (CYbSEKvfBase* node : NodesOfSection(*owner).below)
      if (node->FormattedSectionName() == step.name && ++instance == step.instance) {
        found = node;
        break;
      }
    if (!found) return nullptr;
    owner = found;
  }
  return owner;
}

}  // namespace tervane
