// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "access/written_setup.h"

#include "platform/paths.h"

namespace tervane {

WrittenSetup::WrittenSetup(const CFlowModelDoc& document)
    : file_(document.BuildFile(std::string(FolderOf(AbsoluteFromHere(document.PathName()))))),
      target_(AsSection(FindKvfNode(file_->top, false, document.Root().GetTargetName()))) {}

KvfSection* WrittenSetup::SectionOf(const CYbSEKvfBase& node) const {
  const CYbSEKvfBase* parent = node.GetParent();
  if (!parent) return target_;
  if (const auto known = sections_.find(&node); known != sections_.end()) return known->second;
  KvfSection* const section = SectionOf(*parent);
  // Like sections are told apart by their place among each other.
  std::unordered_map<std::string, std::size_t> instances;
  for (CYbSEKvfBase* child = parent->GetFirstChild(); child; child = parent->GetNextChild(child)) {
    const std::string name = child->FormattedSectionName();
    const bool isInParents = !section || child->GetSectionName().empty();
    sections_[child] = isInParents ? section : AsSection(FindKvfNode(*section, false, name, ++instances[name]));
  }
  return sections_[&node];
}

}  // namespace tervane
