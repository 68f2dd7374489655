// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The pages of spatial and temporal input, by the names and resource numbers under which a shell knows them.
#pragma once

#include "core/page_class.h"

namespace tervane {

inline constexpr PageClass kCatchmentPage{"CCatchmentDlg", 16458};
inline constexpr PageClass kData2DPage{"CData2DDlg", 16474};
inline constexpr PageClass kSoilLayersPage{"CUnSatInitConditionLayerListDlg", 0};
inline constexpr PageClass kStationBasedDataPage{"C2DStationBasedDataDlg", 16538};
inline constexpr PageClass kStationPage{"C2DStationBaseDataTimeSeriesDlg", 16540};
inline constexpr PageClass kSubcatchmentPage{"CSubcatchmentDlg", 16619};
inline constexpr PageClass kSubcatchmentPropPage{"CSubcatchmentPropDlg", 16620};
inline constexpr PageClass kRiverLinksPage{"CSubcatchmentRiverLinksDlg", 16621};
inline constexpr PageClass kTimeseriesConstPage{"CTimeseriesConstDlg", 16632};

}  // namespace tervane
