// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/valued_boundary.h"

namespace tervane {

void ValuedBoundary::MakeFiles(CYbSEKvfBase& node, const std::function<int()>& itemType, const Condition& mayBeSeries,
                               const Condition& mayBeGrid) {
  seriesFile_ = node.NewChild<CFMData0DFile>("TIME_SERIES_FILE");
  seriesFile_->SetItemTypeBy(itemType);
  seriesFile_->UsedWhen(mayBeSeries && Is(Type, kSeries));
  gridFile_ = node.NewChild<CFMData2DNdsFile>();
  gridFile_->SetItemTypeBy(itemType);
  gridFile_->UsedWhen(mayBeGrid && Is(Type, kGridSeries));
}

}  // namespace tervane
