// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Time series as text: a table with a line of column names, dates in its first column.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "data/datafile.h"
#include "platform/dates.h"

namespace tervane {

/// One column of a table over time.
struct CsvSeries {
  std::string column;  ///< As the table names it.
  std::vector<CYbDateTime> stamps;
  std::vector<float> values;       ///< kDeleteValue where a cell is empty or says that there is none.
  std::vector<std::string> notes;  ///< Missing values and gaps, with their lines.
  std::string error;               ///< With the line and what to do; empty when all was read.
};

/// The names of a table's columns behind that of the dates; none when it has no first line.
std::vector<std::string> CsvColumns(std::string_view text);

/// Reads one column by its name (in any case), or the only one when the name is empty. Cells stand between semicolons,
/// tabs or commas, whichever the first line shows, and may be quoted as RFC 4180 says. Dates are ISO 8601: 2000-01-31
/// or 2000/01/31, with a time as 12:00 or 12:00:30 behind a blank or T. They must ascend. Decimals stand behind a
/// point, or a comma where no comma separates cells.
CsvSeries ReadCsvSeries(std::string_view text, std::string_view column);
/// Dates and values as people paste them: the same with a single column, whose line of names may be missing. Where the
/// first line has none of the signs, the last blank of each line separates.
CsvSeries ReadPastedSeries(std::string_view text);

/// What the dates of a table are: each the end of the interval of its value, as in the file, or its begin.
enum class CsvStamps { Ends, Begins };

/// The items of a file of time series as such a table, in the file's units; missing values are empty cells. "" or why
/// not.
std::string WriteCsvSeries(const DataFile& file, CsvStamps stamps, std::string& text);

}  // namespace tervane
