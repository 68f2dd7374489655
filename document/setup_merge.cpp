// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/setup_merge.h"

#include <cstdint>
#include <memory>

#include "core/kvf.h"
#include "core/kvf_writer.h"
#include "core/list.h"
#include "core/path.h"

namespace tervane {

namespace {

struct CloseKvf {
  void operator()(KvfFile* file) const { kvfClose(&file); }
};

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
  std::unique_ptr<KvfFile, CloseKvf> file_;
  KvfSection* target_;
};

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
  node->ReadData(section);
  const Written taken(mine, folder);
  const KvfNode* now = taken.Find(difference.path, difference.key);
  // The number of a list's items means nothing without the items.
  const bool isOfList = list && list->GetItemCount() != items;
  if (now && KvfValuesText(*now) == difference.to && !isOfList) return node;
  key->params = ownParams;
  key->count = ownCount;
  node->ReadData(section);
  problem = "the setup does not take this value here";
  return nullptr;
}

}  // namespace tervane
