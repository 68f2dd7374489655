// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <vector>

#include "core/node.h"
#include "document/pages.h"

namespace tervane {

/// The overview of the whole setup as text, made when its page is shown.
class COverviewKvf : public CTvnKvfBase {
 public:
  explicit COverviewKvf(CYbSEKvfBase* parent) : CTvnKvfBase("Overview", "Overview", parent) { SetPage(kOverviewPage); }

  std::vector<OverviewLine> Lines;
  std::string Text;

  int IsDlgUsedInSetup() override { return 0; }
};
inline constexpr ImportantName<COverviewKvf> kOverview{"OVERVIEW"};

}  // namespace tervane
