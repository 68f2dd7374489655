// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The pages of what runs leave, by the names under which a shell knows them; they have no numbers.
#pragma once

#include "core/page_class.h"

namespace tervane {

inline constexpr PageClass kProcDataPage{"CProcDataDlg", 0};
inline constexpr PageClass kPreprocessedBlankPage{"CPreprocessedBlankDlg", 0};
inline constexpr PageClass kPreprocessedNds0Page{"CPreprocessedNDS0_PLOTDlg", 0};
inline constexpr PageClass kPreprocessedNds1Page{"CPreProcessedNDS1_PLOTDlg", 0};
inline constexpr PageClass kPreprocessedNds2Page{"CPreprocessedNDS2_PLOT", 0};
inline constexpr PageClass kPreprocessedNds3Page{"CPreprocessedNDS3_PLOTDlg", 0};
inline constexpr PageClass kPreprocessedTextPage{"CPreprocessedTextDlg", 0};
inline constexpr PageClass kPreprocessedTextFilePage{"CPreprocessedTXTFILEDlg", 0};
inline constexpr PageClass kPreprocessedShapePage{"CPreprocessedSHAPE_PLOTDlg", 0};

}  // namespace tervane
