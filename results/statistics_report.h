// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The statistics of a run, point by point, and the two files in which they are kept.
#pragma once

#include <string>
#include <vector>

#include "platform/files.h"
#include "platform/progress.h"
#include "platform/units.h"
#include "results/point_comparison.h"

namespace tervane {

/// A line of the statistics.
struct PointStatistics {
  DetailedPoint point;
  std::string unit;
  RunStatistics figures;
  std::string problem;  ///< Why there are no figures.

  bool HasFigures() const { return figures.meanError.has_value(); }
};

struct StatisticsTable {
  ComparedPeriod period;
  std::vector<PointStatistics> rows;  ///< Of the points with observed values.
  /// Why the table ends before the last point: a series that cannot be opened. Empty when it is whole.
  std::string stopped;
};

/// Compares all points that have observed values. Fails only when it is to stop.
FileResult ComputeStatistics(const std::vector<DetailedPoint>& points, const ComparedPeriod& period,
                             const DisplayUnits& units, StatisticsTable& table, ProgressPart progress = {});

/// Where the statistics are kept, beside the preprocessor's report.
struct StatisticsFiles {
  std::string html, shape;
};
StatisticsFiles StatisticsFilesBeside(const std::string& report);

/// The table in HTML, places in the user's unit; one that was stopped has no end.
std::string StatisticsPage(const StatisticsTable& table, const DisplayUnits& units);

/// Writes both files. They take their places at the end: on a failure the old ones stand.
FileResult WriteStatistics(const StatisticsTable& table, const DisplayUnits& units, const StatisticsFiles& files);

}  // namespace tervane
