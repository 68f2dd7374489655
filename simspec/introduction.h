// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "core/node.h"

namespace tervane {

/// The entry at the top of the trees that shows what the editor is for. Holds no data.
class CIntroductionKvf : public CTvnKvfGroupBase {
 public:
  explicit CIntroductionKvf(CYbSEKvfBase* parent) : CTvnKvfGroupBase("Tervane Flow Model Description", "", parent) {
    SetHelp("Top.chm", "Tvn.htm");
  }
};

}  // namespace tervane
