// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

namespace tervane::test {

/// Setups in which every page shows all that it has.
inline constexpr const char* kRichSetups[] = {
    "section SimSpec {\nsection ModelComp {\nWQ = 1\nRiver = 1\nUseCurrentWmSimulation = 0\n}\n"
    "section SimulationPeriod {\nHotStart = 1\n}\n}\n"
    "section ModelCompWQ {\nOL = 1\nUZ = 1\nSZ = 1\nIncludeProcesses = 1\n}\n"
    "section LandUse {\nsection Vegetation {\nsection GLOBAL {\nTYPE = 3\n}\n}\n}",
    "section SimSpec {\nsection ModelComp {\nWQ = 1\nADPTRadio = 1\n}\n}\n"
    "section LandUse {\nsection Vegetation {\nDistributionType = 2\nsection STATION_BASED {\nNO_TIMESERIES = 2\n}\n"
    "section TIME_SERIES_1 {\nTYPE = 2\n}\nsection TIME_SERIES_2 {\nTYPE = 3\n}\n}\n}",
    "section SimSpec {\nModelType = 1\nsection ModModelComp {\nSubsurface_ModelType = 2\nWithAirFlow = 1\n}\n}"};

}  // namespace tervane::test
