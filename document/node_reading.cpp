// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/node_reading.h"

#include <utility>

#include "core/doc_version.h"
#include "core/list.h"
#include "spatial/zone_source.h"

namespace tervane {

namespace {

/// A setup of another version, or none, reads like one of ours meanwhile.
class AsWrittenVersion {
 public:
  explicit AsWrittenVersion(const CYbSEKvfBase& node) : version_(node.Important(kDocVersion)) {
    if (version_) before_ = std::exchange(version_->ReadVersion, CFlowModelDocVersionKvf::kWrittenVersion);
  }
  AsWrittenVersion(const AsWrittenVersion&) = delete;
  AsWrittenVersion& operator=(const AsWrittenVersion&) = delete;
  ~AsWrittenVersion() {
    if (version_) version_->ReadVersion = before_;
  }

 private:
  CFlowModelDocVersionKvf* version_;
  int before_ = -1;
};

/// What reads its items or zones beside its keys would throw away those that it has.
bool MakesItems(const CYbSEKvfBase& node) {
  return dynamic_cast<const CFMSEKvfBase*>(&node) || dynamic_cast<const ZoneSource*>(&node) ||
         dynamic_cast<const CYbSEKvfListBaseInterface*>(&node);
}

}  // namespace

void ReadKeysAnew(CYbSEKvfBase& node, KvfSection& section) {
  const AsWrittenVersion version(node);
  if (MakesItems(node))
    node.CYbSEKvfBase::ReadData(&section);
  else
    node.ReadData(&section);
}

void LoadAnew(CYbSEKvfBase& node, KvfSection& section) {
  const AsWrittenVersion version(node);
  const std::string own = node.FormattedSectionName();
  KvfName name = *section.name;
  name.text = own.c_str();
  name.length = static_cast<std::uint32_t>(own.size());
  name.blanksBefore = name.blanksAfter = 0;
  KvfSection copy = section;
  copy.name = &name;
  copy.next = nullptr;
  KvfSection alone;
  alone.file = section.file;
  alone.firstChild = alone.lastChild = &copy;
  alone.count = 1;
  node.Load(&alone);
}

}  // namespace tervane
