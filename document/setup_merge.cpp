// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/setup_merge.h"

#include <cstdint>
#include <memory>
#include <utility>

#include "core/kvf.h"
#include "core/kvf_writer.h"
#include "core/list.h"
#include "core/open_kvf.h"
#include "core/path.h"
#include "document/item_owner.h"
#include "document/node_reading.h"

namespace tervane {

namespace {

/// A setup as it would be written to a folder.
class Written {
 public:
  Written(const CFlowModelDoc& document, const std::string& folder)
      : file_(document.BuildFile(folder)),
        target_(AsSection(FindKvfNode(file_->top, false, document.Root().GetTargetName()))) {}

  KvfSection& Target() const { return *target_; }
  /// Null where there is no such section.
  KvfSection* Find(const std::string& path) const {
    KvfSection* section = target_;
    for (const PathStep& step : ParseSetupPath(path).steps)
      if (section)
        section = AsSection(FindKvfNode(*section, false, step.name, static_cast<std::size_t>(step.instance)));
    return section;
  }
  KvfNode* Find(const std::string& path, const std::string& key) const {
    KvfSection* section = Find(path);
    const PathStep step = ParseSetupPath(":" + key).key;
    return section ? FindKvfNode(*section, true, step.name, static_cast<std::size_t>(step.instance)) : nullptr;
  }

 private:
  OpenKvf file_;
  KvfSection* target_;
};

std::string PathAbove(const std::string& path) {
  const std::size_t end = path.rfind('/');
  return end == std::string::npos ? std::string() : path.substr(0, end);
}

}  // namespace

std::vector<SetupDifference> DifferencesBetween(const CFlowModelDoc& from, const CFlowModelDoc& to) {
  const std::string& folder = from.Root().SetupFolder();
  return CompareSetups(Written(from, folder).Target(), Written(to, folder).Target(), KeyReference::Get());
}

CYbSEKvfBase* TakeValue(CFlowModelDoc& mine, const CFlowModelDoc& theirs, const SetupDifference& difference,
                        std::string& problem) {
  const std::string& folder = mine.Root().SetupFolder();
  const Written here(mine, folder), there(theirs, folder);
  KvfSection* section = here.Find(difference.path);
  KvfNode* key = section ? here.Find(difference.path, difference.key) : nullptr;
  const KvfNode* other = there.Find(difference.path, difference.key);
  CYbSEKvfBase* node = FindNode(mine.Root(), ParseSetupPath(difference.path).steps);
  if (difference.key.empty() || !node || !key || !other) {
    problem = "only the value of a key that both setups have at the same place can be taken";
    return nullptr;
  }
  if (KvfValuesText(*key) != difference.from || KvfValuesText(*other) != difference.to) {
    problem = "the setups are others than when they were compared";
    return nullptr;
  }
  // The node reads its section as it stands, with that one value for its own.
  KvfParam* const ownParams = key->params;
  const std::uint32_t ownCount = key->count;
  const auto* list = dynamic_cast<const CYbSEKvfListBaseInterface*>(node);
  const int items = list ? list->GetItemCount() : 0;
  key->params = other->params;
  key->count = other->count;
  ReadKeysAnew(*node, *section);
  const Written taken(mine, folder);
  const KvfNode* now = taken.Find(difference.path, difference.key);
  // The number of a list's items means nothing without the items.
  const bool isOfList = list && list->GetItemCount() != items;
  if (now && KvfValuesText(*now) == difference.to && !isOfList) return node;
  key->params = ownParams;
  key->count = ownCount;
  ReadKeysAnew(*node, *section);
  problem = "the setup does not take this value here";
  return nullptr;
}

bool IsOfItem(const SetupDifference& difference) {
  return difference.key.empty() &&
         (difference.kind == SetupDifference::Kind::Added || difference.kind == SetupDifference::Kind::Removed);
}

CYbSEKvfBase* TakeItem(CFlowModelDoc& mine, const CFlowModelDoc& theirs, const SetupDifference& difference,
                       std::string& problem) {
  const bool isTheirs = difference.kind == SetupDifference::Kind::Added;
  const std::vector<PathStep> steps = ParseSetupPath(difference.path).steps;
  const std::vector<PathStep> above = ParseSetupPath(PathAbove(difference.path)).steps;
  const ItemOwner owner(above.empty() ? nullptr : FindNode(mine.Root(), above));
  const ItemOwner place(isTheirs && !above.empty() ? FindNode(theirs.Root(), above) : owner.Node());
  CYbSEKvfBase* item = FindNode(isTheirs ? theirs.Root() : mine.Root(), steps);
  if (!IsOfItem(difference) || !owner.Node() || !place.Node() || !item || !place.Holds(*item)) {
    problem = "only an item of a list, or a zone, that one of the setups has can be taken";
    return nullptr;
  }
  if (!isTheirs) {
    owner.Remove(*item);
    return owner.Node();
  }
  const Written there(theirs, mine.Root().SetupFolder());
  KvfSection* section = there.Find(difference.path);
  CYbSEKvfBase* added = section ? owner.Add() : nullptr;
  if (!added) {
    problem = "the setup does not take another item here";
    return nullptr;
  }
  LoadAnew(*added, *section);
  return owner.Node();
}

}  // namespace tervane
