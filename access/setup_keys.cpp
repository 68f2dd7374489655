// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "access/setup_keys.h"

#include <algorithm>

#include <fmt/format.h>

#include "core/kvf_writer.h"
#include "core/list.h"
#include "document/node_reading.h"
#include "document/setup_diff.h"
#include "platform/suggestion.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// What is kept beyond this is made anew.
constexpr std::size_t kMostKept = std::size_t{16} << 20;

KvfSection* Begin(KvfFile& file, const std::string& name) {
  kvfAddSection(&file, name);
  return file.open.back();
}

/// Writes the keys of a node, without what stands in sections of other nodes.
void WriteNode(CYbSEKvfBase& node, KvfFile& file) {
  const bool hasSection = !node.GetSectionName().empty();
  if (hasSection && node.GetParent()) {
    kvfPutParam(&file, "Touched", node.GetHasBeenTouched());
    if (node.GetRoot() && node.GetRoot()->WriteUsedFlags())
      kvfPutParam(&file, "IsDataUsedInSetup", node.IsDataUsedInSetup());
    node.SaveSize(&file);
  }
  // A group without a section has no keys.
  if (hasSection || !dynamic_cast<CYbSEKvfGroupBase*>(&node)) node.WriteData(&file);
}

/// Calls the operation on a node and on those that write into its section.
template <class Operation>
void ForParts(CYbSEKvfBase& node, const Operation& operation) {
  if (!node.GetParent() || !node.GetSectionUsed()) return;
  operation(node);
  for (int number = 1; number <= node.GetPropertyCount(); ++number)
    if (CYbSEKvfBase* property = node.GetProperty(number); property && property->GetSectionName().empty())
      ForParts(*property, operation);
  for (CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child))
    if (child->GetSectionName().empty()) ForParts(*child, operation);
}

/// Empty sections for the items that a node counts, so that none of them is taken for one that the file lacks.
void AddItemSections(const CYbSEKvfBase& node, KvfFile& file) {
  const auto add = [&file](int count) {
    for (int i = 0; i < count; ++i) {
      kvfAddSection(&file, "Item");
      kvfEndSection(&file);
    }
  };
  if (const auto* list = dynamic_cast<const CYbSEKvfListBaseInterface*>(&node)) add(list->GetItemCount());
  for (CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child)) {
    const auto* list = dynamic_cast<const CYbSEKvfListBaseInterface*>(child);
    if (!list) continue;
    const std::string name = list->FormattedSectionName();
    if (!name.empty()) kvfAddSection(&file, name);
    add(list->GetItemCount());
    if (!name.empty()) kvfEndSection(&file);
  }
}

OpenKvf NewScratch(const CFlowModelDoc& document) {
  OpenKvf file(kvfCreate());
  file->folder = document.Root().SetupFolder();
  kvfAddTarget(file.get(), document.Root().GetTargetName());
  return file;
}

/// A node's section alone in a file of its own.
struct WrittenAlone {
  WrittenAlone(const CFlowModelDoc& document, CYbSEKvfBase& node, bool withItems) : file(NewScratch(document)) {
    section = Begin(*file, "Node");
    WriteNode(node, *file);
    if (withItems) AddItemSections(node, *file);
    kvfEndSection(file.get());
  }
  KvfNode* Find(std::string_view key, std::size_t instance) const { return FindKvfNode(*section, true, key, instance); }

  OpenKvf file;
  KvfSection* section;
};

std::vector<PlainValue> ValuesIn(KvfSection& section, std::string_view key) {
  std::vector<PlainValue> values;
  for (std::size_t n = 1;; ++n) {
    const KvfNode* found = FindKvfNode(section, true, key, n);
    if (!found || found->count == 0) return values;
    values.push_back(PlainValueOf(found->params[0]));
  }
}

constexpr std::string_view kUsedKey = "IsDataUsedInSetup", kTouchedKey = "Touched";

}  // namespace

const SetupKeys::Parts& SetupKeys::Written(CYbSEKvfBase& node) {
  // Only for a further node: what was given of those that are kept may still be in use.
  const bool isFull = kept_ && kept_->nodes.Size() + kept_->texts.Size() > kMostKept;
  if (keptRevision_ != revision_ || (isFull && !written_.contains(node.Serial())) || !kept_) {
    written_.clear();
    kept_ = NewScratch(document_);
    keptRevision_ = revision_;
  }
  const auto [place, isNew] = written_.try_emplace(node.Serial());
  if (isNew)
    ForParts(node, [&, place = place](CYbSEKvfBase& part) {
      place->second.push_back({&part, Begin(*kept_, "Node")});
      WriteNode(part, *kept_);
      kvfEndSection(kept_.get());
    });
  return place->second;
}

std::vector<const KvfNode*> SetupKeys::KeysOf(CYbSEKvfBase& node) {
  std::vector<const KvfNode*> keys;
  for (const Part& part : Written(node))
    for (const KvfNode* key = part.section->firstChild; key; key = key->next)
      if (key->IsKeyword()) keys.push_back(key);
  return keys;
}

const KvfNode* SetupKeys::Find(CYbSEKvfBase& node, const PathStep& key, std::string& problem) {
  const std::string_view name = Trimmed(key.name);
  for (const Part& part : Written(node))
    if (const KvfNode* found = FindKvfNode(*part.section, true, name, static_cast<std::size_t>(key.instance)))
      return found;
  std::vector<std::string> names;
  for (const KvfNode* other : KeysOf(node)) names.emplace_back(other->Name());
  problem = fmt::format("{}: there is no key {} here{}", PathOf(node), key.name, Suggestion(key.name, names));
  return nullptr;
}

std::optional<KeyInfo> SetupKeys::InfoOf(CYbSEKvfBase& node, std::string_view key) {
  for (const Part& part : Written(node)) {
    std::vector<KeyInfo> infos;
    part.node->DescribeKeys(infos);
    for (KeyInfo& info : infos)
      if (info.section.empty() && Trimmed(info.key) == key && info.written) return std::move(info);
  }
  return std::nullopt;
}

std::string SetupKeys::Set(CYbSEKvfBase& node, const PathStep& key, const Take& take) {
  std::string problem;
  if (!Find(node, key, problem)) return problem;
  const std::string_view name = Trimmed(key.name);
  const auto instance = static_cast<std::size_t>(key.instance);
  const auto refuse = [&](std::string_view why) {
    return fmt::format("{}:{}: {}", PathOf(node), PathName(key.name, key.instance), why);
  };
  if (name == kUsedKey || name == kTouchedKey) return refuse("it is made when the setup is saved");
  if (name == CYbSEKvfListBaseInterface::kItemCountKey)
    return refuse("the number of items follows from the items: insert or delete some");
  CYbSEKvfBase* owner = nullptr;
  for (const Part& part : Written(node))
    if (!owner && FindKvfNode(*part.section, true, name, instance)) owner = part.node;
  const std::optional<KeyInfo> info = InfoOf(*owner, name);
  const WrittenAlone before(document_, *owner, true), changed(document_, *owner, true);
  KvfNode* keyword = changed.Find(name, instance);
  if (const std::string expected = take(info ? &*info : nullptr, *changed.section, *keyword); !expected.empty())
    return refuse(expected + " was expected");
  const std::string wanted = ComparedText(*keyword);
  Forget();
  ReadKeysAnew(*owner, *changed.section);
  const WrittenAlone after(document_, *owner, false);
  const KvfNode* taken = after.Find(name, instance);
  if (taken && ComparedText(*taken) == wanted) return {};
  ReadKeysAnew(*owner, *before.section);
  return refuse(fmt::format("the setup does not take this value: it would be saved as {}",
                            taken ? PlainValuesText(*taken) : "nothing"));
}

std::string SetupKeys::Set(CYbSEKvfBase& node, const PathStep& key, std::string_view typed) {
  return Set(node, key, [typed](const KeyInfo* info, KvfSection& section, KvfNode& keyword) {
    return TakeTyped(typed, info, section, keyword);
  });
}

std::string SetupKeys::Set(CYbSEKvfBase& node, const PathStep& key, std::span<const PlainValue> values) {
  return Set(node, key, [values](const KeyInfo* info, KvfSection& section, KvfNode& keyword) {
    return TakePlainValues(values, info, section, keyword);
  });
}

std::optional<std::vector<PlainValue>> SetupKeys::Repeated(CYbSEKvfBase& node, std::string_view section,
                                                           std::string_view key) {
  for (const Part& part : Written(node))
    if (KvfSection* inner = AsSection(FindKvfNode(*part.section, false, section))) return ValuesIn(*inner, key);
  return std::nullopt;
}

std::string SetupKeys::SetRepeated(CYbSEKvfBase& node, std::string_view section, std::string_view key,
                                   std::span<const PlainValue> values) {
  const auto refuse = [&](std::string_view why) {
    return fmt::format("{}/{}:{}: {}", PathOf(node), section, key, why);
  };
  if (!Repeated(node, section, key)) return refuse("there is no such section");
  const WrittenAlone before(document_, node, true), changed(document_, node, true);
  KvfSection* inner = AsSection(FindKvfNode(*changed.section, false, section));
  if (!inner) return refuse("there is no such section");
  KvfFile& file = *changed.file;
  // The number of values is made when the setup is saved.
  file.Clear(*inner);
  for (const PlainValue& value : values) {
    file.BeginKeyword(*inner, key);
    const bool isText = std::holds_alternative<std::string>(value);
    KvfNode& keyword = *file.currentKeyword;
    file.AddParam(isText ? KvfType::String : KvfType::Int);
    if (const std::string expected = TakePlainValues({&value, 1}, nullptr, *inner, keyword); !expected.empty())
      return refuse(expected + " was expected");
  }
  Forget();
  ReadKeysAnew(node, *changed.section);
  const WrittenAlone after(document_, node, false);
  KvfSection* taken = AsSection(FindKvfNode(*after.section, false, section));
  if (taken && std::ranges::equal(ValuesIn(*taken, key), values)) return {};
  ReadKeysAnew(node, *before.section);
  return refuse("the setup does not take these values: texts, or whole numbers, were expected");
}

void SetupKeys::TakeFolder() {
  Forget();
  WalkNodes(document_.Root(), [this](const NodePlace& place) {
    const WrittenAlone written(document_, place.node, true);
    bool namesFile = false;
    for (const KvfNode* key = written.section->firstChild; key; key = key->next)
      if (key->IsKeyword() && key->count > 0 && key->params[0].type == KvfType::Filename)
        namesFile = namesFile || !key->params[0].Text().empty();
    if (namesFile) ReadKeysAnew(place.node, *written.section);
  });
}

}  // namespace tervane
