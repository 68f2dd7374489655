// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The header of a data file, read into items and how their values are stored. Only sources of data files include this.
#pragma once

#include <cstddef>
#include <cstdint>
#include <limits>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include <netcdf.h>

#include "data/datafile.h"

namespace tervane {

/// How an item's values are stored.
struct ItemStorage {
  int variable = 0;
  nc_type type = NC_FLOAT;
  std::vector<std::size_t> lengths;  ///< In the order of the file.
  /// Of the pieces in which a netCDF-4 file stores, and perhaps packs, the values; empty when they stand in one.
  std::vector<std::size_t> chunk;
  /// Places of the dimensions in that order; -1 where there is none.
  int time = -1, x = -1, y = -1, z = -1;
  bool isXTurned = false, isYTurned = false, isZTurned = false;  ///< Stored from the east, the north, the top.
  double scale = 1, offset = 0;
  bool isUnsigned = false;  ///< Numbers of a signed type that mean unsigned ones.
  std::vector<double> missing;
  bool isFillAssumed = false;  ///< The first of these is that of the library, since the file tells none.
  double validFrom = -std::numeric_limits<double>::infinity();
  double validTo = std::numeric_limits<double>::infinity();
  std::vector<double> range;  ///< As stored; empty when it is not.
  std::optional<std::uint64_t> count;

  bool IsPacked() const { return scale != 1 || offset != 0 || isUnsigned; }
  bool HasValidRange() const;
  /// True when the values stand in the order of the caller's buffer, but for turned rows.
  bool IsInOrder() const;
  /// Puts kDeleteValue for what is missing in values that are stored as they are.
  void MarkMissing(std::span<float> values) const;
  /// The number that a stored one means; a NaN when it is missing.
  double Unpacked(double stored) const;

  // Of values that are stored as they are.

  /// What numbers of the file mean to those who read it.
  std::vector<float> Meant(std::span<const double> numbers) const;
  /// A value as the file has it; for kDeleteValue a mark that the file tells itself, where there is one.
  double Stored(float value) const;
  /// The same of many, in the place of the numbers that stand there: one that means the same stays as it is, with all
  /// its digits and its own mark of what is missing.
  std::vector<double> Stored(std::span<const float> values, std::span<const double> old) const;
};

struct DataFileHeader {
  std::vector<DataItem> items;
  std::vector<ItemStorage> storages;  ///< One for each item.
  TimeAxis time;
  std::vector<std::string> notes;
};

/// Sets the unit of an item, whose name and type are known, by what its file tells: a text, and a key of our table
/// where the file is ours. "" or a note that it does not fit the type.
std::string SetUnit(DataItem& item, std::string unitText, std::optional<int> unitKey);

/// Reads an open file of the library, whose lock must be held. "" or why the file cannot be used.
std::string ReadHeader(int file, DataFileHeader& header);

}  // namespace tervane
