// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "core/node.h"
#include "simspec/pages.h"

namespace tervane {

/// The entry at the top of the trees that shows what the editor is for. Holds no data.
class CIntroductionKvf : public CTvnKvfGroupBase {
 public:
  explicit CIntroductionKvf(CYbSEKvfBase* parent) : CTvnKvfGroupBase("Tervane Flow Model Description", "", parent) {
    SetHelp("Top.chm", "Tvn.htm");
  }

  const PageClass* GetDlgRuntimeClass(int treeId) const override {
    const bool shows = treeId == kSetupDataTree || treeId == kProcessedDataTree || treeId == kResultsTree;
    return shows ? &kHelpPage : nullptr;
  }
};

}  // namespace tervane
