// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Writing of data files, step by step. The layout opens in other programs that follow the CF conventions 1.8: netCDF
// classic with 64-bit offsets, dimensions time, z, y, x, row 0 in the south, a grid mapping `crs`.
#pragma once

#include <memory>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "data/datafile.h"
#include "platform/files.h"
#include "platform/item_types.h"

namespace tervane {

/// An item of a new data file.
struct NewItem {
  std::string name;
  int itemType = quantity::kUndefined;
  int unitKey = kDimensionlessUnit;  ///< The unit of the values that will be put.
  ValueType valueType = ValueType::Instantaneous;
};

/// What a new data file is told before its first value.
struct NewDataFile {
  int dimensions = 2;
  FileGeometry geometry;  ///< Square cells; a line needs nx, x0 and the cell size alone, a time series nothing.
  std::vector<NewItem> items;
  bool hasTime = true;               ///< Without times the file is one step that holds always.
  std::optional<CYbDateTime> begin;  ///< Of the first interval; without one, a step before the first stamp.
  bool isCompressed = false;         ///< As netCDF-4, smaller and slower.
};

/// Writes a data file. It takes its place in one step at `Finish`; until then an old file stands, and a writer that
/// dies before leaves nothing.
class DataFileWriter {
 public:
  DataFileWriter();
  DataFileWriter(DataFileWriter&& other) noexcept;
  DataFileWriter& operator=(DataFileWriter&& other) noexcept;
  ~DataFileWriter();

  /// "" or why the file cannot be made, naming it.
  std::string Create(const std::string& path, const NewDataFile& content);

  /// Begins a step at the end of its interval, later than the one before; a file without times has one step without
  /// this call. All items of the step before must have been put.
  std::string AddStep(const CYbDateTime& stamp);
  /// Puts the values of an item (from 1) for the present step, in the order layer, row from the south, column from the
  /// west. What is not finite is stored as kDeleteValue.
  std::string Put(int item, std::span<const float> values, ProgressPart progress = {});
  /// Puts one layer, counted from 0 at the bottom.
  std::string PutLayer(int item, int layer, std::span<const float> values);

  /// Stores the statistics and puts the file in its place. Nothing can be written behind it. What was to stop before
  /// leaves no file.
  FileResult Finish(ProgressPart progress = {});

 private:
  struct State;
  std::unique_ptr<State> state_;
};

}  // namespace tervane
