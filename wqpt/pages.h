// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The pages of water quality and particle tracking, by the names under which a shell knows them.
#pragma once

#include "core/page_class.h"

namespace tervane {

inline constexpr PageClass kSpeciesPage{"CSpeciesDlg", 0};
inline constexpr PageClass kProcessesPage{"CProcessesWQDlg", 0};
inline constexpr PageClass kWaterQualityLayersPage{"CWQLayerListDlg", 0};
inline constexpr PageClass kExtentPage{"CExtentDlg", 0};
inline constexpr PageClass kSourcesPage{"CSourcesWQListDlg", 0};
inline constexpr PageClass kStrengthPage{"CStrengthWQDlg", 0};
inline constexpr PageClass kStrengthStationPage{"CStrengthWQTimeSeriesDlg", 0};
inline constexpr PageClass kKinetraSpecificationPage{"CKinetraSpecDlg", 0};
inline constexpr PageClass kKinetraBindingPage{"CKinetraCompSpecDlg", 0};
inline constexpr PageClass kKinetraConstantLayersPage{"CKinetraConstantsUZWQLayerListDlg", 0};
inline constexpr PageClass kKinetraForcingLayersPage{"CKinetraForcingsUZWQLayerListDlg", 0};
inline constexpr PageClass kRegistrationLensesPage{"CRegLensePTListDlg", 0};
inline constexpr PageClass kRegistrationExtractionsPage{"CResultsPTRegExtractionDlg", 0};
inline constexpr PageClass kRegistrationExtractionPage{"CResultsPTRegExtractionItemDlg", 0};
inline constexpr PageClass kPathlineExtractionsPage{"CResultsPTPathlineExtractionDlg", 0};
inline constexpr PageClass kPathlineExtractionPage{"CResultsPTPathlineExtractionItemDlg", 0};

}  // namespace tervane
