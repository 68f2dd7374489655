// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <unordered_map>

#include "core/open_kvf.h"
#include "document/flow_model_document.h"

namespace tervane {

/// A file as the document would save it in its own folder.
class WrittenSetup {
 public:
  explicit WrittenSetup(const CFlowModelDoc& document);

  KvfFile& File() const { return *file_; }
  KvfSection& Target() const { return *target_; }
  /// The section in which a node's keys stand.
  KvfSection* SectionOf(const CYbSEKvfBase& node) const;

 private:
  OpenKvf file_;
  KvfSection* target_;
  /// Of all children of the nodes that were asked for, so that asking for each of many siblings looks at each once.
  mutable std::unordered_map<const CYbSEKvfBase*, KvfSection*> sections_;
};

}  // namespace tervane
