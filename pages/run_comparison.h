// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Two runs side by side: what differs between their setups, and how well each agrees with what was observed.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "document/setup_diff.h"
#include "platform/files.h"
#include "platform/progress.h"
#include "results/statistics_report.h"

namespace tervane {

/// A run by its passport, and what lies beside that.
struct ComparedRun {
  std::string passport;
  std::string setup;   ///< The setup as it was.
  std::string report;  ///< That of the preprocessor, which names the points with observed values.

  bool operator==(const ComparedRun&) const = default;
};
bool IsNamedAsPassport(std::string_view path);
/// To be asked of a path that is named as a passport.
ComparedRun ComparedRunOf(const std::string& passport);

/// A point of both runs, or of one.
struct ComparedPoint {
  std::string name, dataType, unit;
  int layer = 0;
  std::optional<RunStatistics> first, second;  ///< Nothing for a run that does not have the point.

  /// The second run's figure minus the first one's; nothing where one is missing.
  std::optional<double> Difference(std::optional<double> RunStatistics::*figure) const;
};

struct RunComparison {
  std::string firstTitle, secondTitle;  ///< "karup.tvd, 2026-11-26 14:00:05 UTC".
  std::vector<SetupDifference> differences;
  std::string setupProblem;  ///< Why setups could not be compared.
  ComparedPeriod period;     ///< That both simulate, in which figures are made.
  std::vector<DetailedPoint> firstPoints, secondPoints;
  std::vector<ComparedPoint> points;
  std::string pointsProblem;  ///< Why there are no figures.
};

/// Reads the setups and the points of both, without the figures. What one of them lacks is told in the comparison; a
/// passport that cannot be read is the error.
FileResult ReadRuns(const ComparedRun& first, const ComparedRun& second, RunComparison& comparison);
/// Adds the figures of all points; in any thread.
FileResult CompareFigures(const DisplayUnits& units, RunComparison& comparison, ProgressPart progress = {});

}  // namespace tervane
