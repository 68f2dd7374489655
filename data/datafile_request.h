// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What a reader of a data file requires of it.
#pragma once

#include <cstddef>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "data/datafile_facts.h"
#include "platform/dates.h"

namespace tervane {

/// Demands on the selected items of a file and on its times; what is left out is not demanded.
struct DataFileRequest {
  struct Period {
    CYbDateTime start, end;
  };

  std::vector<int> itemTypes;     ///< One of these; any when there are none.
  std::optional<int> dimensions;  ///< 0 a time series, 1 a line, 2 a grid, 3 layers of grids.
  std::optional<Period> period;   ///< Of the simulation: the values must cover it.
  std::optional<std::size_t> steps;
};

/// "" when the selected items (counted from 1; none stands for item 1) meet the request, else why not in words: "item 2
/// is Elevation, Precipitation Rate was expected". Nothing is read.
std::string WhyNotMet(const DataFileFacts& file, std::span<const int> items, const DataFileRequest& request);
/// The same of a file by its path.
std::string WhyNotMet(const std::string& path, std::span<const int> items, const DataFileRequest& request);

/// Why the values do not cover a period: "the file covers 2000-01-01 to 2000-12-31, the simulation starts at
/// 1999-01-01"; empty when they do.
std::string WhyNotCovered(const DataItem& item, const TimeAxis& time, const DataFileRequest::Period& period);
/// From when on the values hold: over steps, from the begin of the first one's interval.
CYbDateTime StartOfValues(const DataItem& item, const TimeAxis& time);

/// A date for people: without the time at midnight, and without seconds where there are none.
std::string DateInWords(const CYbDateTime& date);

}  // namespace tervane
