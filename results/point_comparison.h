// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A point's simulated series held against its observed one.
#pragma once

#include <map>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "data/datafile.h"
#include "platform/units.h"
#include "results/detailed_points.h"
#include "results/run_statistics.h"

namespace tervane {

/// The stretch of time that is compared, both ends included.
struct ComparedPeriod {
  CYbDateTime start, end;

  bool operator==(const ComparedPeriod&) const = default;
};

/// A series that was read, in the unit of the comparison.
struct PointSeries {
  std::string name;
  std::vector<std::int64_t> stamps;
  std::vector<float> values;
  ValueType valueType = ValueType::Instantaneous;
  std::optional<std::int64_t> begin;

  ComparedSeries View() const { return {stamps, values, valueType, begin}; }
};

struct PointComparison {
  DetailedPoint point;
  std::string unit;  ///< Of values and figures, as it stands behind a number.
  PointSeries simulated, observed;
  std::vector<ComparedPair> pairs;
  RunStatistics figures;
  /// Why there are no figures: a series that is missing, of another quantity, or too short. Empty where there are some.
  std::string problem;
  bool isUnreadable = false;  ///< A file could not be opened.
};

/// Compares points one after the other. A file stays open while the next point names the same one, and many series of
/// it are read together. Figures are in the user's unit of what was simulated.
class PointComparer {
 public:
  PointComparer(const ComparedPeriod& period, const DisplayUnits& units);

  PointComparison Compare(const DetailedPoint& point, ProgressPart progress = {}) {
    return CompareFirst({&point, 1}, progress);
  }
  /// Compares the first of those that are to be compared one after the other.
  PointComparison CompareFirst(std::span<const DetailedPoint> coming, ProgressPart progress = {});

 private:
  /// Where a point's series stands.
  using Place = SeriesPlace DetailedPoint::*;

  struct OpenFile {
    DataFile file;
    std::optional<std::string> path;
    std::map<int, std::vector<float>> together;  ///< Series by their items that were read ahead.

    /// "" or why it cannot be opened.
    std::string Open(const std::string& wanted);
    /// The values of the first point's series in the file's unit. "" or why not.
    std::string Read(std::span<const DetailedPoint> coming, Place place, std::vector<float>& values,
                     ProgressPart progress);
  };

  std::int64_t start_ = 0, end_ = -1;  ///< Seconds since 1970-01-01.
  const DisplayUnits& units_;
  OpenFile simulated_, observed_;
};

}  // namespace tervane
