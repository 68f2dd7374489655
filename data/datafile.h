// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Data files: time series (.nds0), lines (.nds1), grids (.nds2) and layers of grids (.nds3) over time. They are netCDF
// by the CF conventions 1.8 (https://cfconventions.org). Files of other programs are read as well: any kind of netCDF,
// and rasters (GeoTIFF, ASCII grids, ...), whose bands are grids that hold at all times.
//
// This is the one interface to them. Who knows the operations by their old names finds them here: ndsFileRead is
// DataFile::Open; ndsFileClose and ndsHeaderDestroy the end of the object; ndsGetNoOfItems and ndsItemD `Items`;
// ndsGetItemInfo, ndsGetItemDim and ndsGetItemAxisType `DataItem`; ndsGetItemAxisEqD3 and D4 `DataItem::geometry`;
// ndsGetItemStatsGlobal `Statistics`; ndsGetTimeAxisType and ndsGetEqCalendarAxis `Time`.
#pragma once

#include <cstddef>
#include <cstdint>
#include <limits>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "data/file_geometry.h"
#include "geometry/grid.h"
#include "platform/dates.h"
#include "platform/item_types.h"
#include "platform/progress.h"
#include "platform/units.h"

namespace tervane {

/// Stands where a value is missing, in everything that is read or written here; a file may store another one.
inline constexpr float kDeleteValue = -1e30f;

/// How a value belongs to its stamp, which is the end of its interval. The numbers stand in files.
enum class ValueType {
  Instantaneous = 0,
  Accumulated = 1,      ///< Since the start of the file.
  StepAccumulated = 2,  ///< Over the step that ends with the stamp.
  MeanStep = 3,         ///< Mean over that step.
};
/// "instantaneous", "mean over the step".
std::string_view ValueTypeText(ValueType type);

/// A variable of a data file.
struct DataItem {
  std::string name;
  int itemType = quantity::kUndefined;
  int unitKey = 0;                 ///< 0 when the unit is none of the table's.
  std::string unitText;            ///< As a person reads it.
  std::optional<UnitScale> scale;  ///< Nothing when nobody knows the unit.
  ValueType valueType = ValueType::Instantaneous;
  int dimensions = 0;  ///< 0 a time series, 1 a line, 2 a grid, 3 layers of grids.
  FileGeometry geometry;
  bool hasTime = false;  ///< Else its values hold at all times.

  std::size_t CellsOfLayer() const {
    return static_cast<std::size_t>(geometry.nx) * static_cast<std::size_t>(geometry.ny);
  }
  std::size_t Cells() const { return CellsOfLayer() * static_cast<std::size_t>(geometry.nz); }
};

/// The times of a file. Without a time dimension it is one step without dates.
struct TimeAxis {
  std::size_t steps = 1;
  bool hasDates = false;
  std::int64_t stepSeconds = 0;      ///< The distance of the stamps when all are equal, else 0.
  std::vector<std::int64_t> stamps;  ///< Seconds since 1970-01-01, one for each step, ascending; empty without dates.
  std::optional<CYbDateTime> begin;  ///< Begin of the interval that ends with the first stamp, where the file tells.

  CYbDateTime Stamp(std::size_t step) const { return CYbDateTime::FromSecondsSinceEpoch(stamps[step]); }
  CYbDateTime Start() const { return stamps.empty() ? CYbDateTime() : Stamp(0); }
  CYbDateTime End() const { return stamps.empty() ? CYbDateTime() : Stamp(stamps.size() - 1); }
};

/// What values show together; delete values count as missing only.
struct ValueSummary {
  float smallest = std::numeric_limits<float>::infinity();
  float largest = -std::numeric_limits<float>::infinity();
  double sum = 0;
  std::uint64_t count = 0, missing = 0;

  void Add(std::span<const float> values);
  /// The same without the sum, which takes most of the time.
  void AddRange(std::span<const float> values);
  void Add(const ValueSummary& other);
  double Mean() const { return sum / static_cast<double>(count); }
};

/// True when no value is infinite or not a number.
bool AreFinite(std::span<const float> values);

/// The statistics of an item over all its steps, in the file's unit.
struct ItemStatistics {
  double smallest = 0, largest = 0;  ///< Not numbers when every value is missing.
  std::optional<std::uint64_t>
      count;  ///< Of values that are not missing; nothing when the file stores the range alone.
  bool isStored = false;
};

/// Which values to read: steps and layers are counted from 0.
struct ValueSelection {
  int item = 1;
  std::size_t step = 0, steps = 1;
  std::optional<int> layer;              ///< Without one all layers, from the bottom.
  std::optional<CellWindow> cells = {};  ///< Of a grid; without it all of a layer.
};

/// An open data file. Opening reads the header and the times; values are read when they are asked for. Many threads may
/// read one file, one at a time. Errors name the file, say what is wrong with what, and what to do.
class DataFile {
 public:
  DataFile();
  DataFile(DataFile&& other) noexcept;
  DataFile& operator=(DataFile&& other) noexcept;
  ~DataFile();

  /// "" when the file is open, else why not.
  std::string Open(const std::string& path);

  const std::string& Path() const;
  /// Item number n stands at n - 1.
  const std::vector<DataItem>& Items() const;
  const TimeAxis& Time() const;
  /// What a user should know of a file of another program: variables that were left out and why, unplaced grids.
  const std::vector<std::string>& Notes() const;

  /// Reads values in the order step, layer, row from the south, column from the west; the buffer must be as large as
  /// the selection. What the file marks as missing, what is not finite and what lies outside the file's own valid range
  /// is kDeleteValue. Values are in the file's unit, or, when an item type is given, in that item type's base unit;
  /// quantity::kUndefined, which has none, leaves the file's unit. After an error, also "cancelled", the buffer holds
  /// nothing of use.
  std::string Read(const ValueSelection& selection, std::span<float> values, std::optional<int> inBaseUnitOf = {},
                   ProgressPart progress = {}) const;
  /// The number of values that a selection has.
  std::size_t SizeOf(const ValueSelection& selection) const;

  /// The statistics that the file stores; nothing when it stores none.
  std::optional<ItemStatistics> StoredStatistics(int item) const;
  /// The stored statistics, else those of all values, which takes as long as reading them.
  std::string Statistics(int item, ItemStatistics& statistics) const;

 private:
  struct State;
  std::unique_ptr<State> state_;
};

}  // namespace tervane
