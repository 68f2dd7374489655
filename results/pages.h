// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The pages of results, by the names under which a shell knows them.
#pragma once

#include "core/page_class.h"

namespace tervane {

inline constexpr PageClass kStoringResultsPage{"CStoringResultsDlg", 0};
inline constexpr PageClass kGridSeriesPage{"COutputGridSeriesListDlg", 0};
inline constexpr PageClass kDetailedSeriesPage{"CDetailedTSOutputDlg", 0};
inline constexpr PageClass kDetailedRiverSeriesPage{"CDetailedFvrTSOutputDlg", 0};
inline constexpr PageClass kDetailedResultPage{"CResultDetailedTSDlg", 0};
inline constexpr PageClass kDetailedRiverResultPage{"CResultFvrDetailedTSDlg", 0};
inline constexpr PageClass kResultViewerPage{"CResultViewerDlg", 0};
inline constexpr PageClass kRunStatisticsPage{"CRunStatisticsDlg", 0};
inline constexpr PageClass kGeoScenePage{"CGeoScene3DDlg", 0};

}  // namespace tervane
