// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The pages of maps, by the names and resource numbers under which a shell knows them.
#pragma once

#include "core/page_class.h"

namespace tervane {

inline constexpr PageClass kDisplayPage{"CDisplayDlg", 16479};
inline constexpr PageClass kOverlayListPage{"COverlayListDlg", 0};
inline constexpr PageClass kImageOverlayPage{"COverlayBMPDlg", 0};
inline constexpr PageClass kGridOverlayPage{"COverlayGridDlg", 0};
inline constexpr PageClass kShapeOverlayPage{"COverlayShapeDlg", 0};
inline constexpr PageClass kRiverOverlayPage{"COverlayRiverDlg", 0};
inline constexpr PageClass kWellOverlayPage{"COverlayWellDlg", 0};

}  // namespace tervane
