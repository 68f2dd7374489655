// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The series that drive a setup with a Modflow engine, by whose events its user lays out stress periods.
#pragma once

#include <string>
#include <vector>

#include "forms/plots.h"

namespace tervane {

struct DrivingSeries {
  std::string source;  ///< What the series is one of: "Precipitation".
  std::string title;   ///< Of its own, "Precipitation - Station 1".
  std::string path;
  int item = 1;
};

/// Those of precipitation and evapotranspiration that take part, and what is pumped from wells.
std::vector<DrivingSeries> DrivingSeriesOf(const CYbSEKvfBase& node);

/// A chart of the series in the user's units, below each other over the time of the simulation, each in a chart of its
/// own, or all of one source in one chart.
SeriesContent DrivingSeriesChart(const CYbSEKvfBase& node, bool isLumped, const DisplayUnits* units);

}  // namespace tervane
