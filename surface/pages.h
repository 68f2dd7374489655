// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The pages of what happens at and above the ground, by the names and resource numbers under which a shell knows them.
#pragma once

#include "core/page_class.h"

namespace tervane {

inline constexpr PageClass kClimatePage{"CPrecipitationRelatedDlg", 16539};
inline constexpr PageClass kStressPeriodGridsPage{"CRechargeAndPondingModListDlg", 0};
inline constexpr PageClass kPrecipitationPage{"CPrecipitationDlg", 16538};
inline constexpr PageClass kPrecipitationStationPage{"CPrecTimeSeriesDlg", 16540};
inline constexpr PageClass kPotEvapTransPage{"CPotEvapTransDlg", 16538};
inline constexpr PageClass kPotEvapTransStationPage{"CPotEvapTransTimeSeriesDlg", 16540};
inline constexpr PageClass kAirTemperaturePage{"CSnowmeltDlg", 16538};
inline constexpr PageClass kAirTemperatureStationPage{"CSnowmeltTimeSeriesDlg", 16540};
inline constexpr PageClass kSnowMeltPage{"CSnowmeltConstDlg", 16605};
inline constexpr PageClass kLandUsePage{"CLandUseDlg", 16512};
inline constexpr PageClass kCommandAreasPage{"CIrrCommandAreasDlg", 16506};
inline constexpr PageClass kCommandAreaPage{"CIrrCommandAreasPropDlg", 16511};
inline constexpr PageClass kDemandsPage{"CIrrDemandDlg", 16508};
inline constexpr PageClass kDemandPage{"CIrrDemandPropDlg", 16509};
inline constexpr PageClass kPrioritiesPage{"CIrrPrioritiesDlg", 16510};
inline constexpr PageClass kVegetationPage{"CVegetationDlg", 16641};
inline constexpr PageClass kVegetationStationPage{"CVegetationTimeSeriesDlg", 16642};

inline constexpr PageClass kOverlandPage{"COverlandDlg", 0};
inline constexpr PageClass kPondedWaterExchangePage{"CPondedWaterExchangeDlg", 0};
inline constexpr PageClass kPondedDrainagePage{"CPondedDrainageDlg", 0};
inline constexpr PageClass kOverlandZonesPage{"CTopographicalRoutingDlg", 0};
inline constexpr PageClass kOverlandZonePage{"CTopographicalRoutingPropDlg", 0};
inline constexpr PageClass kRiverPage{"CRiverDlg", 0};
inline constexpr PageClass kModflowRiverPage{"CRiverMFDlg", 0};

}  // namespace tervane
