// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/setup_diff.h"

#include <algorithm>
#include <array>
#include <bit>
#include <cstdint>
#include <unordered_map>

#include "core/kvf_writer.h"
#include "core/list.h"
#include "core/open_kvf.h"
#include "core/path.h"
#include "document/flow_model_document.h"

namespace tervane {

namespace {

constexpr std::array<std::string_view, 3> kComputed{"Touched", "IsDataUsedInSetup",
                                                    CYbSEKvfListBaseInterface::kItemCountKey};

bool IsComputed(std::string_view key) { return std::find(kComputed.begin(), kComputed.end(), key) != kComputed.end(); }

/// Nodes of one kind, with the instance number of each among those of its name.
struct NumberedNode {
  KvfNode* node;
  int instance;
  std::string Name() const { return PathName(node->Name(), instance); }
};

std::vector<NumberedNode> ChildrenOf(const KvfSection& section, bool keywords) {
  std::vector<NumberedNode> children;
  std::unordered_map<std::string_view, int> instances;
  for (KvfNode* node = section.firstChild; node; node = node->next)
    if (node->IsKeyword() == keywords) children.push_back({node, ++instances[node->Name()]});
  return children;
}

bool AreAlike(const KvfParam& a, const KvfParam& b) {
  if (a.type != b.type) return false;
  if (a.IsText()) return a.Text() == b.Text();
  switch (a.type) {
    case KvfType::Double:
      return std::bit_cast<std::uint64_t>(a.asDouble) == std::bit_cast<std::uint64_t>(b.asDouble);
    case KvfType::Float:
      return std::bit_cast<std::uint32_t>(a.asFloat) == std::bit_cast<std::uint32_t>(b.asFloat);
    case KvfType::Bool:
      return a.asBool == b.asBool;
    default:
      return a.asInt == b.asInt;
  }
}

/// Whether both hold the same in the same order: nearly all of two files is so, and needs no text to be compared.
bool AreAlike(const KvfSection& a, const KvfSection& b) {
  if (a.count != b.count) return false;
  const KvfNode* other = b.firstChild;
  for (const KvfNode* node = a.firstChild; node; node = node->next, other = other->next) {
    if (node->IsKeyword() != other->IsKeyword() || node->count != other->count ||
        node->WrittenName() != other->WrittenName())
      return false;
    if (!node->IsKeyword()) {
      if (!AreAlike(*AsSection(node), *AsSection(other))) return false;
      continue;
    }
    for (std::uint32_t i = 0; i < node->count; ++i)
      if (!AreAlike(node->params[i], other->params[i])) return false;
  }
  return true;
}

/// Places in a longest increasing run of `values`: what moved least.
std::vector<bool> LongestIncreasing(const std::vector<std::size_t>& values) {
  std::vector<std::size_t> ends;  // place of the smallest end of a run of each length
  std::vector<std::size_t> before(values.size(), values.size());
  for (std::size_t i = 0; i < values.size(); ++i) {
    const auto at = std::lower_bound(ends.begin(), ends.end(), values[i],
                                     [&](std::size_t place, std::size_t value) { return values[place] < value; });
    if (at != ends.begin()) before[i] = *(at - 1);
    if (at == ends.end())
      ends.push_back(i);
    else
      *at = i;
  }
  std::vector<bool> isIn(values.size(), false);
  for (std::size_t i = ends.empty() ? values.size() : ends.back(); i < values.size(); i = before[i]) isIn[i] = true;
  return isIn;
}

class Comparison {
 public:
  explicit Comparison(const KeyReference& reference) : reference_(reference) {}

  std::vector<SetupDifference> result;

  void CompareSections(KvfSection& from, KvfSection& to, const std::string& path) {
    if (AreAlike(from, to)) return;
    CompareKeys(from, to, path);
    const std::vector<NumberedNode> olds = ChildrenOf(from, false);
    const std::vector<NumberedNode> news = ChildrenOf(to, false);
    const bool isList = FindKvfNode(to, true, CYbSEKvfListBaseInterface::kItemCountKey) ||
                        FindKvfNode(from, true, CYbSEKvfListBaseInterface::kItemCountKey);
    std::vector<std::size_t> partner = isList ? MatchItems(olds, news) : MatchNames(olds, news);
    if (isList) ReportMoves(olds, news, partner, path);
    std::vector<bool> isMatched(olds.size(), false);
    for (std::size_t i = 0; i < news.size(); ++i) {
      const std::string childPath = JoinPath(path, news[i].Name());
      if (partner[i] == kNone) {
        result.push_back({SetupDifference::Kind::Added, childPath, {}, {}, {}});
        continue;
      }
      isMatched[partner[i]] = true;
      CompareSections(*AsSection(olds[partner[i]].node), *AsSection(news[i].node), childPath);
    }
    for (std::size_t i = 0; i < olds.size(); ++i)
      if (!isMatched[i]) result.push_back({SetupDifference::Kind::Removed, JoinPath(path, olds[i].Name()), {}, {}, {}});
  }

 private:
  static constexpr std::size_t kNone = static_cast<std::size_t>(-1);

  void CompareKeys(KvfSection& from, KvfSection& to, const std::string& path) {
    const auto isDefault = [&](const NumberedNode& key, const std::string& value) {
      return value == reference_.DefaultOf(path, key.node->Name());
    };
    const auto meaning = [&](const NumberedNode& key, const std::string& value) {
      return std::string(reference_.MeaningOf(path, key.node->Name(), value));
    };
    for (const NumberedNode& key : ChildrenOf(to, true)) {
      if (IsComputed(key.node->Name())) continue;
      const std::string value = ComparedText(*key.node);
      const KvfNode* old = FindKvfNode(from, true, key.node->Name(), static_cast<std::size_t>(key.instance));
      const std::string oldValue = old ? ComparedText(*old) : std::string();
      if (old && oldValue == value) continue;
      result.push_back({old ? SetupDifference::Kind::Changed : SetupDifference::Kind::Added, path, key.Name(), oldValue,
                        value, old && isDefault(key, oldValue), isDefault(key, value),
                        old ? meaning(key, oldValue) : std::string(), meaning(key, value)});
    }
    for (const NumberedNode& key : ChildrenOf(from, true)) {
      if (IsComputed(key.node->Name()) ||
          FindKvfNode(to, true, key.node->Name(), static_cast<std::size_t>(key.instance)))
        continue;
      const std::string value = ComparedText(*key.node);
      result.push_back({SetupDifference::Kind::Removed,
                        path,
                        key.Name(),
                        value,
                        {},
                        isDefault(key, value),
                        false,
                        meaning(key, value),
                        {}});
    }
  }

  /// For each new section the place of its old one, or `kNone`.
  static std::vector<std::size_t> MatchNames(const std::vector<NumberedNode>& olds,
                                             const std::vector<NumberedNode>& news) {
    std::unordered_map<std::string, std::size_t> places;
    for (std::size_t i = 0; i < olds.size(); ++i) places.emplace(olds[i].Name(), i);
    std::vector<std::size_t> partner(news.size(), kNone);
    for (std::size_t i = 0; i < news.size(); ++i)
      if (const auto found = places.find(news[i].Name()); found != places.end()) partner[i] = found->second;
    return partner;
  }

  /// The text by which an item of a list is followed: its content, its name, or its section; empty when it has none.
  enum class Trait { Content, Name, Section };
  static std::string TraitOf(const NumberedNode& item, Trait trait) {
    if (trait == Trait::Section) return item.Name();
    KvfSection& section = *AsSection(item.node);
    std::string text;
    if (trait == Trait::Content)
      AppendKvfNodes(section, 0, text);
    else if (const KvfNode* name = FindKvfNode(section, true, "Name"))
      text = KvfValuesText(*name);
    return text;
  }

  static std::vector<std::size_t> MatchItems(const std::vector<NumberedNode>& olds,
                                             const std::vector<NumberedNode>& news) {
    std::vector<std::size_t> partner(news.size(), kNone);
    std::vector<bool> isTaken(olds.size(), false);
    // What stands alike at both ends has not moved.
    const auto match = [&](std::size_t old, std::size_t item) {
      if (!AreAlike(*AsSection(olds[old].node), *AsSection(news[item].node))) return false;
      partner[item] = old;
      isTaken[old] = true;
      return true;
    };
    const std::size_t most = std::min(olds.size(), news.size());
    std::size_t front = 0, back = 0;
    while (front < most && match(front, front)) ++front;
    while (front + back < most && match(olds.size() - 1 - back, news.size() - 1 - back)) ++back;
    for (const Trait trait : {Trait::Content, Trait::Name, Trait::Section}) {
      std::unordered_map<std::string, std::vector<std::size_t>> places;
      for (std::size_t i = olds.size(); i-- > 0;)
        if (!isTaken[i]) places[TraitOf(olds[i], trait)].push_back(i);
      places.erase(std::string());
      for (std::size_t i = 0; i < news.size(); ++i) {
        if (partner[i] != kNone) continue;
        const auto found = places.find(TraitOf(news[i], trait));
        if (found == places.end() || found->second.empty()) continue;
        partner[i] = found->second.back();
        isTaken[partner[i]] = true;
        found->second.pop_back();
      }
    }
    return partner;
  }

  void ReportMoves(const std::vector<NumberedNode>& olds, const std::vector<NumberedNode>& news,
                   const std::vector<std::size_t>& partner, const std::string& path) {
    std::vector<std::size_t> matched, oldPlaces;
    for (std::size_t i = 0; i < news.size(); ++i) {
      if (partner[i] == kNone) continue;
      matched.push_back(i);
      oldPlaces.push_back(partner[i]);
    }
    const std::vector<bool> stays = LongestIncreasing(oldPlaces);
    for (std::size_t i = 0; i < matched.size(); ++i)
      if (!stays[i])
        result.push_back({SetupDifference::Kind::Moved,
                          JoinPath(path, news[matched[i]].Name()),
                          {},
                          olds[oldPlaces[i]].Name(),
                          news[matched[i]].Name()});
  }

  const KeyReference& reference_;
};

/// The first target of that name, made where the file has none.
KvfSection& TargetOf(KvfFile& file, std::string_view name) {
  KvfSection* target = AsSection(FindKvfNode(file.top, false, name));
  return target ? *target : *file.AddSection(file.top, KvfKind::Target, name);
}

}  // namespace

std::string ComparedText(const KvfNode& keyword) {
  const bool isFile = keyword.count > 0 && keyword.params[0].type == KvfType::Filename;
  return isFile ? KvfValueText(keyword.params[0]) : KvfValuesText(keyword);
}

std::vector<SetupDifference> CompareSetups(KvfSection& from, KvfSection& to, const KeyReference& reference) {
  Comparison comparison(reference);
  comparison.CompareSections(from, to, {});
  return std::move(comparison.result);
}

std::vector<SetupDifference> CompareFiles(KvfFile& before, KvfFile& after, std::string_view setup) {
  std::vector<SetupDifference> differences;
  for (const std::string_view target : {setup, std::string_view("SYSTEM")})
    for (SetupDifference& difference :
         CompareSetups(TargetOf(before, target), TargetOf(after, target), KeyReference::Get()))
      differences.push_back(std::move(difference));
  return differences;
}

std::vector<SetupDifference> CompareDocuments(const CFlowModelDoc& before, const CFlowModelDoc& after) {
  const std::string& folder = after.Root().SetupFolder();
  return CompareFiles(*OpenKvf(before.BuildFile(folder)), *OpenKvf(after.BuildFile(folder)),
                      after.Root().GetTargetName());
}

}  // namespace tervane
