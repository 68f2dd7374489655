// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>

#include "core/node.h"
#include "document/pages.h"
#include "platform/computation.h"
#include "spatial/coverage.h"

namespace tervane {

/// The board of coverage. It is no part of the setup, and the file holds nothing of it: its page is reached by a
/// command.
class CCoverageKvf : public CTvnKvfGroupBase {
 public:
  explicit CCoverageKvf(CYbSEKvfBase* parent) : CTvnKvfGroupBase("Data Coverage", {}, parent) {
    SetPage(kCoveragePage);
  }

  int IsDlgUsedInSetup() override { return 0; }
  bool HoldsSetup() const override { return false; }
  int AddToOverview(std::vector<OverviewLine>& /*lines*/, int /*level*/) override { return 1; }

  /// The computing of the board of the setup as it is, its latest validation included; the same one as long as neither
  /// the setup nor its files change. It asks no node.
  std::shared_ptr<Computed<CoverageBoard>> Board();

 private:
  CoverageRequest request_;
  std::shared_ptr<Computed<CoverageBoard>> board_;
  std::shared_ptr<const CoverageBoard> latest_;  ///< The last that was computed.
};
inline constexpr ImportantName<CCoverageKvf> kCoverage{"COVERAGE"};

}  // namespace tervane
