// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <vector>

#include "core/node.h"

namespace tervane {

/// What another editor may ask of a setup, once after a file was handed to it.
struct EditorRequests {
  bool domain = false;
  bool layers = false;
};

/// The root of a setup: makes the whole tree, fixes the order in which its sections are read, and carries old files
/// over.
class CGlobal : public CTvnKvfGlobalBase {
 public:
  CGlobal();

  EditorRequests Requests;  ///< Those that are open; not stored.

  int WriteUsedFlags() override { return 1; }
  int ReadDocVersion() const override;
  int AddToOverview(std::vector<OverviewLine>& /*lines*/, int /*level*/) override { return 1; }

  void Load(KvfNode* parentSection) override;

  /// What old files hold and no new one: alive and registered, but no part of the tree any more.
  const std::vector<std::shared_ptr<CYbSEKvfBase>>& Retired() const { return retired_; }

 private:
  std::vector<std::shared_ptr<CYbSEKvfBase>> retired_;
};

}  // namespace tervane
