// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/three_way_merge.h"

#include <algorithm>
#include <array>
#include <optional>
#include <unordered_map>
#include <unordered_set>

#include <fmt/format.h>

#include "core/kvf_writer.h"
#include "core/list.h"
#include "core/path.h"
#include "document/setup_diff.h"
#include "platform/text.h"

namespace tervane {

namespace {

constexpr std::array<std::string_view, 2> kMadeAtEachSave{"Touched", "IsDataUsedInSetup"};

bool IsMadeAtEachSave(std::string_view key) { return std::ranges::find(kMadeAtEachSave, key) != kMadeAtEachSave.end(); }

/// The keys of a section by their names. One that stands there several times is one value of several lines.
using Keys = std::vector<std::pair<std::string_view, std::vector<const KvfNode*>>>;

Keys KeysOf(const KvfSection* section) {
  Keys keys;
  std::unordered_map<std::string_view, std::size_t> places;
  for (const KvfNode* node = section ? section->firstChild : nullptr; node; node = node->next) {
    if (!node->IsKeyword()) continue;
    const auto [place, isNew] = places.emplace(node->Name(), keys.size());
    if (isNew) keys.push_back({node->Name(), {}});
    keys[place->second].second.push_back(node);
  }
  return keys;
}

const std::vector<const KvfNode*>* FindKey(const Keys& keys, std::string_view name) {
  const auto found = std::ranges::find(keys, name, &Keys::value_type::first);
  return found == keys.end() ? nullptr : &found->second;
}

/// As the values are compared; nothing for a key that is not there.
std::optional<std::string> TextOf(const std::vector<const KvfNode*>* lines) {
  if (!lines) return {};
  std::string text;
  for (const KvfNode* line : *lines) text += (text.empty() ? "" : "\n") + ComparedText(*line);
  return text;
}

/// All that a section holds, but for what every save makes anew.
std::string ContentOf(const KvfSection& section) {
  std::string text;
  for (const auto& [name, lines] : KeysOf(&section))
    if (!IsMadeAtEachSave(name)) text += fmt::format("{} = {}\n", name, *TextOf(&lines));
  for (const KvfNode* node = section.firstChild; node; node = node->next)
    if (const KvfSection* child = AsSection(node))
      text += fmt::format("{} {{\n{}}}\n", child->Name(), ContentOf(*child));
  return text;
}

/// The name of an item, or its code; empty where it has neither.
std::string IdentityOf(const KvfSection& item) {
  const auto endsIn = [](std::string_view key, std::string_view end) {
    return key.size() >= end.size() && EqualIgnoringCase(key.substr(key.size() - end.size()), end);
  };
  std::string code;
  for (const KvfNode* node = item.firstChild; node; node = node->next) {
    if (!node->IsKeyword() || node->count == 0) continue;
    if (node->params[0].type == KvfType::String && endsIn(node->Name(), "Name")) return KvfValueText(node->params[0]);
    if (code.empty() && (endsIn(node->Name(), "GRIDCODEID") || endsIn(node->Name(), "Code")))
      code = KvfValueText(node->params[0]);
  }
  return code;
}

/// A name without the number in which it ends: "Item_12" is of the kind "Item_%d"; other names are their own kind.
std::string KindOf(std::string_view name) {
  const std::size_t stem = name.find_last_not_of("0123456789");
  const bool isNumbered = stem != std::string_view::npos && stem + 1 < name.size() && name[stem] == '_';
  return isNumbered ? fmt::format("{}%d", name.substr(0, stem + 1)) : std::string(name);
}
bool IsNumbered(const std::string& kind) { return kind.ends_with("%d"); }

/// The sections of one kind below a section, in their order.
using Items = std::vector<KvfSection*>;
std::vector<std::pair<std::string, Items>> KindsOf(KvfSection* section) {
  std::vector<std::pair<std::string, Items>> kinds;
  for (KvfNode* node = section ? section->firstChild : nullptr; node; node = node->next) {
    KvfSection* child = AsSection(node);
    if (!child) continue;
    const std::string kind = KindOf(child->Name());
    auto found = std::ranges::find(kinds, kind, &std::pair<std::string, Items>::first);
    if (found == kinds.end()) found = kinds.insert(kinds.end(), {kind, {}});
    found->second.push_back(child);
  }
  return kinds;
}

constexpr std::size_t kNoItem = static_cast<std::size_t>(-1);

/// For each of `items` its place among `olds`, or `kNoItem`: by what it holds, by its name or code, and what is left by
/// its section.
std::vector<std::size_t> Follow(const Items& olds, const Items& items) {
  std::vector<std::size_t> partner(items.size(), kNoItem);
  std::vector<bool> isTaken(olds.size(), false);
  const std::array<std::string (*)(const KvfSection&), 3> traits{
      IdentityOf, ContentOf, [](const KvfSection& item) { return std::string(item.Name()); }};
  for (const auto trait : traits) {
    std::unordered_map<std::string, std::vector<std::size_t>> places;
    for (std::size_t i = olds.size(); i-- > 0;)
      if (!isTaken[i]) places[trait(*olds[i])].push_back(i);
    places.erase(std::string());
    for (std::size_t i = 0; i < items.size(); ++i) {
      if (partner[i] != kNoItem) continue;
      const auto found = places.find(trait(*items[i]));
      if (found == places.end() || found->second.empty()) continue;
      partner[i] = found->second.back();
      isTaken[partner[i]] = true;
      found->second.pop_back();
    }
  }
  return partner;
}

/// A section as the three files have it; null where one has it not.
struct Sides {
  KvfSection* base = nullptr;
  KvfSection* mine = nullptr;
  KvfSection* theirs = nullptr;
};

class Merger {
 public:
  Merger(KvfFile& merged, MergeResult& result, const MergeChoices& choices)
      : merged_(merged), result_(result), choices_(choices) {}

  /// What becomes of a section that at least one side has; `above` is the one in which it stands.
  void MergeInto(KvfSection& to, const Sides& from, const Sides& above, const std::string& path) {
    MergeKeys(to, from, above, path);
    std::vector<Count> counts;
    for (const std::string& kind : AllKinds(from)) MergeKind(kind, to, from, path, counts);
    CorrectCounts(to, counts);
  }

 private:
  /// Which side is taken of it.
  MergeSide Report(MergeConflict conflict) {
    if (const auto chosen = choices_.find(conflict.Identity()); chosen != choices_.end())
      conflict.taken = chosen->second;
    result_.conflicts.push_back(std::move(conflict));
    return result_.conflicts.back().taken;
  }

  // ---- Keys

  void CopyKey(KvfSection& to, const std::vector<const KvfNode*>& lines) {
    for (const KvfNode* line : lines) {
      KvfNode* copy = merged_.AddKeyword(to, line->WrittenName(), line->count);
      for (; copy->count < line->count; ++copy->count) {
        auto* param = new (&copy->params[copy->count]) KvfParam(line->params[copy->count]);
        if (param->IsText()) merged_.SetText(*param, param->Text());
      }
    }
  }

  void MergeKeys(KvfSection& to, const Sides& from, const Sides& above, const std::string& path) {
    const Keys old = KeysOf(from.base), own = KeysOf(from.mine), other = KeysOf(from.theirs);
    const auto merge = [&](std::string_view name) {
      const auto* oldLines = FindKey(old, name);
      const auto* ownLines = FindKey(own, name);
      const auto* otherLines = FindKey(other, name);
      const auto was = TextOf(oldLines), isMine = TextOf(ownLines), isTheirs = TextOf(otherLines);
      const bool isTheirChange = isTheirs != was && !IsMadeAtEachSave(name), isMyChange = isMine != was;
      const bool takesTheirs = isTheirChange && !isMyChange;
      // Numbers of items are counted when the items are there.
      const bool isTold = isTheirChange && isMine != isTheirs && !IsCount(name, from, above);
      MergeSide side = takesTheirs ? MergeSide::Theirs : MergeSide::Mine;
      if (isTold && takesTheirs)
        ++result_.takenFromThem;
      else if (isTold)
        side = Report({MergeConflict::Kind::Value, path, std::string(name), was.value_or(""), isMine.value_or(""),
                       isTheirs.value_or("")});
      const auto* lines = side == MergeSide::Mine ? ownLines : side == MergeSide::Theirs ? otherLines : oldLines;
      if (lines) CopyKey(to, *lines);
    };
    for (const auto& [name, lines] : own) merge(name);
    for (const auto& [name, lines] : other)
      if (!FindKey(own, name)) merge(name);
  }

  // ---- Numbers of items

  static bool LooksLikeCount(std::string_view key) {
    return key == CYbSEKvfListBaseInterface::kItemCountKey || key.starts_with("No") || key.starts_with("NO") ||
           key.starts_with("Number");
  }

  static std::optional<std::size_t> WholeNumber(KvfSection& section, std::string_view key) {
    const KvfNode* found = FindKvfNode(section, true, key);
    if (!found || found->count != 1 || found->params[0].type != KvfType::Int || found->params[0].asInt < 0) return {};
    return static_cast<std::size_t>(found->params[0].asInt);
  }

  /// Whether in each file the key tells how many items of one kind stand beside it, or beside its own section.
  static bool IsCount(std::string_view key, const Sides& from, const Sides& above) {
    if (!LooksLikeCount(key)) return false;
    for (const Sides& holder : {from, above}) {
      for (const std::string& kind : AllKinds(holder)) {
        const auto fits = [&](KvfSection* section, KvfSection* around) {
          return !section || !around || WholeNumber(*section, key) == ItemsOf(around, kind).size();
        };
        if (IsNumbered(kind) && fits(from.base, holder.base) && fits(from.mine, holder.mine) &&
            fits(from.theirs, holder.theirs))
          return true;
      }
    }
    return false;
  }

  /// How many items of a kind each file has, and the merged one.
  struct Count {
    std::size_t mine, theirs, merged;
  };
  static void CorrectCounts(KvfSection& section, const std::vector<Count>& counts) {
    for (const Count& count : counts) {
      const auto correct = [&](KvfSection& holder) {
        for (KvfNode* node = holder.firstChild; node; node = node->next) {
          if (!node->IsKeyword() || !LooksLikeCount(node->Name())) continue;
          const auto number = WholeNumber(holder, node->Name());
          if (number == count.mine || number == count.theirs)
            node->params[0].asInt = static_cast<std::int32_t>(count.merged);
        }
      };
      if (count.merged == count.mine && count.merged == count.theirs) continue;
      correct(section);
      for (KvfNode* node = section.firstChild; node; node = node->next)
        if (KvfSection* child = AsSection(node); child && !IsNumbered(KindOf(child->Name()))) correct(*child);
    }
  }

  // ---- Sections

  static std::vector<std::string> AllKinds(const Sides& from) {
    std::vector<std::string> kinds;
    for (KvfSection* side : {from.mine, from.theirs})
      for (const auto& [kind, items] : KindsOf(side))
        if (std::ranges::find(kinds, kind) == kinds.end()) kinds.push_back(kind);
    return kinds;
  }

  static Items ItemsOf(KvfSection* section, const std::string& kind) {
    for (auto& [name, items] : KindsOf(section))
      if (name == kind) return std::move(items);
    return {};
  }

  /// The items of one side and their places among those of the base.
  struct Followed {
    Items items;
    std::vector<std::size_t> of;

    Followed(const Items& old, Items its) : items(std::move(its)), of(Follow(old, items)) {}
    Items New() const {
      Items added;
      for (std::size_t i = 0; i < items.size(); ++i)
        if (of[i] == kNoItem) added.push_back(items[i]);
      return added;
    }
    /// Of those that the base has.
    std::vector<std::size_t> Order() const {
      std::vector<std::size_t> order = of;
      std::erase(order, kNoItem);
      return order;
    }
  };

  void MergeKind(const std::string& kind, KvfSection& to, const Sides& from, const std::string& path,
                 std::vector<Count>& counts) {
    const Items old = ItemsOf(from.base, kind);
    const Followed own(old, ItemsOf(from.mine, kind)), other(old, ItemsOf(from.theirs, kind));
    // Mine is the order, unless only they have moved something.
    const bool haveIMoved = !std::ranges::is_sorted(own.Order()),
               haveTheyMoved = !std::ranges::is_sorted(other.Order());
    bool byThem = haveTheyMoved && !haveIMoved;
    if (byThem) ++result_.takenFromThem;
    if (haveIMoved && haveTheyMoved && own.Order() != other.Order())
      byThem = Report({MergeConflict::Kind::Order, path, {}, {}, kind, {}}) == MergeSide::Theirs;

    std::size_t number = 0;
    for (const Sides& item : Arranged(old, own, other, byThem, IsNumbered(kind))) {
      const KvfSection& named = item.mine ? *item.mine : *item.theirs;
      const std::string itemPath = JoinPath(path, std::string(named.Name()));
      if (!IsKept(item, itemPath)) continue;
      ++number;
      const std::string name =
          IsNumbered(kind) ? Replaced(kind, "%d", std::to_string(number)) : std::string(named.WrittenName());
      KvfSection& made = *merged_.AddSection(to, KvfKind::Section, name);
      if (item.mine && item.theirs)
        MergeInto(made, item, from, itemPath);
      else
        merged_.CopyChildren(named, made);
    }
    if (IsNumbered(kind)) counts.push_back({own.items.size(), other.items.size(), number});
  }

  /// What tells whether two new items are the same thing.
  static std::string TraitOfNew(const KvfSection& item, bool isNumbered) {
    std::string trait = isNumbered ? IdentityOf(item) : std::string(item.Name());
    return trait.empty() ? ContentOf(item) : trait;
  }

  /// The items of the leading side in its order; those that the other has alone stand behind what is before them there.
  static std::vector<Sides> Arranged(const Items& old, const Followed& own, const Followed& other, bool isLedByThem,
                                     bool areNumbered) {
    const Followed &leading = isLedByThem ? other : own, &following = isLedByThem ? own : other;
    const auto make = [&](KvfSection* base, KvfSection* lead, KvfSection* follow) {
      return isLedByThem ? Sides{base, follow, lead} : Sides{base, lead, follow};
    };
    std::vector<KvfSection*> ofOld(old.size(), nullptr);
    std::unordered_map<std::string, std::vector<KvfSection*>> ofNew;  // the first at the end
    for (std::size_t i = following.items.size(); i-- > 0;) {
      if (following.of[i] != kNoItem)
        ofOld[following.of[i]] = following.items[i];
      else
        ofNew[TraitOfNew(*following.items[i], areNumbered)].push_back(following.items[i]);
    }
    std::vector<Sides> led;
    std::unordered_set<KvfSection*> placed;
    for (std::size_t i = 0; i < leading.items.size(); ++i) {
      KvfSection *base = nullptr, *follow = nullptr;
      if (leading.of[i] != kNoItem) {
        base = old[leading.of[i]];
        follow = ofOld[leading.of[i]];
      } else if (auto found = ofNew.find(TraitOfNew(*leading.items[i], areNumbered));
                 found != ofNew.end() && !found->second.empty()) {
        follow = found->second.back();
        found->second.pop_back();
      }
      led.push_back(make(base, leading.items[i], follow));
      if (follow) placed.insert(follow);
    }
    // Those of the other side alone, by the placed item that stands before them there.
    std::unordered_map<KvfSection*, std::vector<Sides>> behind;
    KvfSection* before = nullptr;
    for (std::size_t i = 0; i < following.items.size(); ++i) {
      if (placed.contains(following.items[i])) {
        before = following.items[i];
        continue;
      }
      KvfSection* base = following.of[i] == kNoItem ? nullptr : old[following.of[i]];
      behind[before].push_back(make(base, nullptr, following.items[i]));
    }
    std::vector<Sides> all = behind[nullptr];
    for (const Sides& item : led) {
      all.push_back(item);
      KvfSection* follow = isLedByThem ? item.mine : item.theirs;
      if (const auto alone = follow ? behind.find(follow) : behind.end(); alone != behind.end())
        all.insert(all.end(), alone->second.begin(), alone->second.end());
    }
    return all;
  }

  /// Whether an item that one side has not stays; a deletion that meets a change is a conflict, and mine holds.
  bool IsKept(const Sides& item, const std::string& path) {
    if (item.mine && item.theirs) return true;
    if (!item.base) {
      if (!item.mine) ++result_.takenFromThem;
      return true;
    }
    const KvfSection& left = item.mine ? *item.mine : *item.theirs;
    if (ContentOf(left) == ContentOf(*item.base)) {
      if (item.mine) ++result_.takenFromThem;
      return false;
    }
    const auto kind = item.mine ? MergeConflict::Kind::DeletedByThem : MergeConflict::Kind::DeletedByMe;
    const bool takesTheirs = Report({kind, path, {}, {}, {}, {}}) == MergeSide::Theirs;
    return item.mine ? !takesTheirs : takesTheirs;
  }

  KvfFile& merged_;
  MergeResult& result_;
  const MergeChoices& choices_;
};

std::optional<int> VersionOf(KvfFile& file) {
  for (KvfNode* node = file.top.firstChild; node; node = node->next)
    if (KvfSection* target = AsSection(node))
      if (KvfSection* section = AsSection(FindKvfNode(*target, false, "FlowModelDocVersion")))
        if (const KvfNode* key = FindKvfNode(*section, true, "Version"); key && key->count == 1)
          return key->params[0].asInt;
  return {};
}

}  // namespace

std::string MergeConflict::Identity() const {
  return fmt::format("{}|{}|{}|{}", static_cast<int>(kind), path, key, kind == Kind::Order ? mine : std::string());
}

std::string MergeConflict::Sentence() const {
  const auto told = [](const std::string& value) { return value.empty() ? std::string("nothing") : value; };
  const bool isTheirs = taken == MergeSide::Theirs;
  switch (kind) {
    case Kind::DeletedByMe:
      return fmt::format("{}: deleted by me, changed by them; it {}", path, isTheirs ? "comes back" : "stays deleted");
    case Kind::DeletedByThem:
      return fmt::format("{}: deleted by them, changed by me; it {}", path, isTheirs ? "goes" : "stays");
    case Kind::Order:
      return fmt::format("{}: both have moved its items {}; {} order stays", path, mine, isTheirs ? "their" : "my");
    case Kind::Value:
      break;
  }
  return fmt::format("{}:{}: it was {}, mine is {}, theirs is {}; {}", path, key, told(base), told(mine), told(theirs),
                     isTheirs                   ? "theirs is taken"
                     : taken == MergeSide::Base ? "it is as it was"
                                                : "mine stays");
}

MergeResult MergeSetups(KvfFile& base, KvfFile& mine, KvfFile& theirs, KvfFile& merged, const MergeChoices& choices) {
  MergeResult result;
  const auto versions = std::array{VersionOf(base), VersionOf(mine), VersionOf(theirs)};
  if (versions[0] != versions[1] || versions[1] != versions[2]) {
    const auto told = [](std::optional<int> version) { return version ? std::to_string(*version) : "none"; };
    result.problem = fmt::format(
        "the setups have different document versions ({}, {} and {}): bring them to one with `tervane convert` first",
        told(versions[0]), told(versions[1]), told(versions[2]));
    return result;
  }
  merged.header = mine.header;
  Merger merger(merged, result, choices);
  // Targets are told apart by their names.
  std::vector<std::string_view> names;
  for (const KvfFile* file : {&mine, &theirs})
    for (const KvfNode* node = file->top.firstChild; node; node = node->next)
      if (std::ranges::find(names, node->Name()) == names.end()) names.push_back(node->Name());
  for (const std::string_view name : names) {
    KvfSection& target = *merged.AddSection(merged.top, KvfKind::Target, name);
    const auto targetOf = [name](KvfFile& file) { return AsSection(FindKvfNode(file.top, false, name)); };
    merger.MergeInto(target, {targetOf(base), targetOf(mine), targetOf(theirs)}, {}, {});
  }
  return result;
}

}  // namespace tervane
