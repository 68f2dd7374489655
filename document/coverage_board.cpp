// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/coverage_board.h"

namespace tervane {

std::shared_ptr<Computed<CoverageBoard>> CCoverageKvf::Board() {
  CoverageRequest request = GetRoot() ? AskCoverage(*GetRoot()) : CoverageRequest();
  if (board_ && request == request_) return board_;
  if (board_ && board_->IsDone()) latest_ = board_->Result();
  request_ = std::move(request);
  board_ = std::make_shared<Computed<CoverageBoard>>(
      "Comparing the data with simulation and domain",
      [request = request_, previous = latest_](CoverageBoard& board, ProgressPart progress) {
        return ComputeCoverage(request, previous.get(), board, progress);
      });
  return board_;
}

}  // namespace tervane
