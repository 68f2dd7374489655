// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Changing of data files that stand already, also of such as other programs wrote: what is not changed (items, steps,
// attributes, the projection, variables that are none of ours) stays as it is.
#pragma once

#include <cstdint>
#include <functional>
#include <limits>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "data/datafile.h"
#include "data/grid_files.h"
#include "platform/files.h"
#include "platform/os.h"

namespace tervane {

/// Whether the values of an item can be changed, and which ones the file takes.
struct ItemUpdateFacts {
  std::string whyNot;  ///< "its values are packed into whole numbers"; empty when they can.
  double from = -std::numeric_limits<double>::infinity();
  double to = std::numeric_limits<double>::infinity();  ///< Beyond, a value would be read as a missing one.
};
/// The same of a whole file.
struct FileUpdateFacts {
  std::string whyNot;                  ///< Why nothing of the file can be changed.
  std::string whyNoOtherTimes;         ///< Why its steps cannot be made others; asked of series alone.
  std::vector<ItemUpdateFacts> items;  ///< One for each item of the file.
};
FileUpdateFacts UpdateFactsOf(const std::string& path);

/// Changes a copy of a data file and puts it in its place, or in that of another one, in one step. Values are in the
/// file's unit; what is not finite, or kDeleteValue, is stored as the file marks missing values.
class DataFileUpdate {
 public:
  DataFileUpdate();
  ~DataFileUpdate();

  /// Copies a file that is held open, so that it may have been replaced or removed meanwhile. "" or why not, naming the
  /// target.
  std::string Begin(os::File& from, const std::string& to, ProgressPart progress = {});
  /// Puts a layer of a step, in the order of `DataFile::Read`. Only rows for which `isChanged` is true need be right:
  /// the others are written where that is cheaper than leaving them out.
  std::string PutLayer(int item, const GridSlice& slice, std::span<const float> values,
                       const std::function<bool(int row)>& isChanged, ProgressPart progress = {});
  /// Puts all values of a series.
  std::string PutSeries(int item, std::span<const float> values);
  /// Brings the stored statistics of the changed items up to date, which reads them once, and replaces the target.
  FileResult Finish(ProgressPart progress = {});

 private:
  struct State;
  std::unique_ptr<State> state_;
};

/// Series with other times than their file has.
struct RewrittenSeries {
  std::vector<std::int64_t> stamps;       ///< Seconds since 1970-01-01, ascending.
  std::optional<std::int64_t> begin;      ///< Of the first interval; without one, a step before the first stamp.
  std::vector<std::vector<float>> items;  ///< Of each item of the file, in its unit.
};
/// Writes the series of a file, held open as above, with other times: in its own format and with all else that it
/// holds.
FileResult RewriteSeries(os::File& from, const std::string& to, const RewrittenSeries& series,
                         ProgressPart progress = {});

}  // namespace tervane
