// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Time series in data files.
#pragma once

#include <string>
#include <vector>

#include "platform/dates.h"
#include "platform/files.h"
#include "platform/progress.h"

namespace tervane {

/// A series as it is made: values in the base unit of the item type, each for the interval that ends with its time.
struct NewSeries {
  std::string name;
  int itemType = 0;
  int valueType = 0;  ///< As data files number them.
  std::vector<CYbDateTime> times;
  std::vector<float> values;
};

/// Writes a series as a data file with one item, in place of a file of that name.
FileResult WriteSeriesFile(const std::string& path, const NewSeries& series, ProgressPart progress = {});

}  // namespace tervane
