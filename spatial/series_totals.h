// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What values over time come to in given periods, and where they are missing.
#pragma once

#include <cstdint>
#include <functional>
#include <limits>
#include <map>
#include <optional>
#include <span>
#include <string>
#include <utility>
#include <vector>

#include "data/datafile.h"
#include "data/datafile_facts.h"
#include "platform/progress.h"

namespace tervane {

/// A stretch of time in seconds since 1970-01-01, without its end.
struct TimeSpan {
  std::int64_t start = 0, end = 0;

  std::int64_t Seconds() const { return end - start; }
  bool operator==(const TimeSpan&) const = default;
};

/// What the values of one period come to.
struct PeriodSum {
  double integral = 0;       ///< Of the values over the time that has some, in their unit times seconds.
  std::int64_t covered = 0;  ///< Seconds that have a value.

  bool operator==(const PeriodSum&) const = default;
};

/// Sums values over several periods, which may overlap.
class PeriodSums {
 public:
  explicit PeriodSums(std::vector<TimeSpan> periods) : periods_(std::move(periods)), sums_(periods_.size()) {}

  /// A value that goes in a line from `first` to `last` over the span.
  void Add(const TimeSpan& span, double first, double last);
  const std::vector<PeriodSum>& Sums() const { return sums_; }

 private:
  std::vector<TimeSpan> periods_;
  std::vector<PeriodSum> sums_;
};

/// An item over time, as totals ask for it.
struct SeriesFacts {
  std::string error;
  std::vector<PeriodSum> sums;  ///< One for each period; a quantity that is counted over steps as its rate per second.
  std::vector<TimeSpan> gaps;   ///< Within `watched`, ascending: time between the first and last value that has none.
};

/// Gives the value of a step; not a number where it is missing. An error ends the reading.
using ReadStep = std::function<std::string(std::size_t step, double& value)>;

/// Sums an item over the periods and finds the gaps within `watched`. Only steps that touch one of them are read. A
/// step that is several times as long as nearly all others is a gap too.
SeriesFacts SumSteps(const DataItem& item, const TimeAxis& time, const std::vector<TimeSpan>& periods,
                     const std::optional<TimeSpan>& watched, const ReadStep& read, ProgressPart progress);
/// The same of a time series in a file, in the base unit of its item type.
SeriesFacts SumSeries(const std::string& path, int item, const std::vector<TimeSpan>& periods,
                      const std::optional<TimeSpan>& watched, ProgressPart progress);

/// How sums of a quantity are told: as an amount, for rates and for what is counted over steps, else as a mean.
struct TotalForm {
  bool isTotal = false;
  std::string unit;
  double factor = 1;  ///< From the unit of the sums to this one.

  /// Not a number where nothing is covered.
  double Of(const PeriodSum& sum) const;
};
TotalForm TotalFormOf(int itemType, ValueType valueType);

/// A series of a file as it was read.
struct SeriesOfFile {
  std::string path;
  FileStamp stamp;
  int item = 1;

  bool operator==(const SeriesOfFile&) const = default;
};
/// The means of series over a stretch of time, by file and item: of rates and amounts for each day. Absent where a
/// series cannot be read or has no value in it.
struct SeriesMeans {
  struct Mean {
    double value = 0;
    std::string unit;
  };
  std::map<std::pair<std::string, int>, Mean> means;
};
FileResult ComputeMeans(const std::vector<SeriesOfFile>& series, const TimeSpan& span, ProgressPart progress,
                        SeriesMeans& means);

}  // namespace tervane
