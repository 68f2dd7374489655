// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The pages of the simulation specification, by the names and resource numbers under which a shell knows them; 0 where
// a page has no number.
#pragma once

#include "core/page_class.h"

namespace tervane {

inline constexpr PageClass kHelpPage{"CTvnHelpView", 0};
inline constexpr PageClass kBasicParaPage{"CBasicParaDlg", 16457};
inline constexpr PageClass kModelCompWQPage{"CModelCompWQDlg", 0};
inline constexpr PageClass kModelCompPTPage{"CModelCompPTDlg", 0};
inline constexpr PageClass kSimTitlePage{"CSimTitleDlg", 16599};
inline constexpr PageClass kSimTitleWQPage{"CSimTitleWQDlg", 16600};
inline constexpr PageClass kSimTitlePTPage{"CSimTitlePTDlg", 16597};
inline constexpr PageClass kSimPeriodPage{"CSimPeriodDlg", 16601};
inline constexpr PageClass kSimPeriodWQPage{"CSimPeriodWQDlg", 16592};
inline constexpr PageClass kSimPeriodPTPage{"CSimPeriodPTDlg", 16596};
inline constexpr PageClass kAirFlowModPage{"CAirFlowModDlg", 16456};
inline constexpr PageClass kExtraParamsPage{"CExtraParamsDlg", 0};
inline constexpr PageClass kTimeStepPage{"CCompControlParaTimeStepDlg", 16472};
inline constexpr PageClass kTimeStepWQPage{"CCompControlParaTimeStepWQDlg", 16594};
inline constexpr PageClass kColloidWQPage{"CCompControlParaColloidWQDlg", 16591};
inline constexpr PageClass kControlPTPage{"CCompControlParaPTDlg", 0};
inline constexpr PageClass kControlOLPage{"CCompControlParaOLDlg", 16466};
inline constexpr PageClass kControlUZPage{"CCompControlParaUZDlg", 16473};
inline constexpr PageClass kControlSZPage{"CCompControlParaSZDlg", 16468};
inline constexpr PageClass kControlModflowPage{"CCompControlParaModDlg", 16459};
inline constexpr PageClass kModflowPackagePage{"CCompControlParaModPackageDlg", 16461};
inline constexpr PageClass kStressPeriodsPage{"CStressPeriodsDlg", 16617};
inline constexpr PageClass kStressPeriodPropertiesPage{"CStressPeriodsPropDlg", 0};
inline constexpr PageClass kModflowOutputPage{"COutputModDlg", 16524};

}  // namespace tervane
