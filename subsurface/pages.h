// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The pages of what is below the ground, by the names and resource numbers under which a shell knows them.
#pragma once

#include "core/page_class.h"

namespace tervane {

inline constexpr PageClass kUnsaturatedZonePage{"CUnsatzoneDlg", 0};
inline constexpr PageClass kSoilProfilesPage{"CUZSoilProfileDlg", 0};
inline constexpr PageClass kSoilProfilePage{"CUZSoilProfilePropDlg", 0};
inline constexpr PageClass kTwoLayerSoilsPage{"CUZWetlandSoilProfileDlg", 0};
inline constexpr PageClass kTwoLayerSoilPage{"CUZWetlandSoilPropDlg", 0};
inline constexpr PageClass kGroundwaterDepthsPage{"CUZGroundWaterDepthListDlg", 0};
inline constexpr PageClass kSaturatedZonePage{"CSatZoneDlg", 0};
inline constexpr PageClass kGeologicalUnitsPage{"CGeoUnitsSZListDlg", 0};
inline constexpr PageClass kGeologicalLayersPage{"CGeoLayerSZDlg", 0};
inline constexpr PageClass kGeologicalLensesPage{"CGeoLenseSZDlg", 0};
inline constexpr PageClass kComputationalLayersPage{"CSZVerDiscrLayerListDlg", 0};
inline constexpr PageClass kComputationalLayersOfGeologyPage{"CSZVerDiscrLayerGeoListDlg", 0};
inline constexpr PageClass kOuterBoundaryPage{"CGeoDataBoundCondListDlg", 0};
inline constexpr PageClass kBoundarySegmentPage{"CGeoDataBoundCondItemDlg", 0};

inline constexpr PageClass kDrainagePage{"CDrainageSZDlg", 0};
inline constexpr PageClass kModflowDrainsPage{"CDrainageMFSZDlg", 0};
inline constexpr PageClass kWellsPage{"CSZWellDlg", 0};
inline constexpr PageClass kReservoirZonePage{"CSatZoneSubCatchmentDlg", 0};
inline constexpr PageClass kInterflowZonesPage{"CSZShallowGWRoutingDlg", 0};
inline constexpr PageClass kInterflowZonePage{"CSZShallowGWRoutingPropDlg", 0};
inline constexpr PageClass kBaseflowZonesPage{"CSZDeepGWRoutingDlg", 0};
inline constexpr PageClass kBaseflowZonePage{"CSZDeepGWRoutingPropDlg", 0};
inline constexpr PageClass kBaseflowReservoirPage{"CSZDeepGWRoutingReservoirDlg", 0};
inline constexpr PageClass kInternalBoundariesPage{"CSZVerDiscrInternalBoundaryDlg", 0};
inline constexpr PageClass kInternalBoundaryPage{"CSZVerDiscrInternalBoundaryPropDlg", 0};

}  // namespace tervane
