// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The points for which a run stores time series, as the preprocessor's report tells them.
#pragma once

#include <string>
#include <vector>

#include "core/kvf.h"
#include "platform/files.h"

namespace tervane {

/// An item of a data file.
struct SeriesPlace {
  std::string path;
  int item = 0;

  bool operator==(const SeriesPlace&) const = default;
};

struct DetailedPoint {
  std::string name;
  std::string dataType;     ///< The name of its type of results.
  double x = 0, y = 0;      ///< In metres.
  int column = 0, row = 0;  ///< Its cell.
  int layer = 0;            ///< Below 1 for a type without layers.
  SeriesPlace simulated;    ///< Where the run puts its values.
  bool includesObserved = false;
  SeriesPlace observed;

  bool operator==(const DetailedPoint&) const = default;
};

/// Reads the points of a report; one without points gives none. What the report says in too few items is left out.
FileResult ReadDetailedPoints(const std::string& report, std::vector<DetailedPoint>& points);

/// Writes the points into the section of a report that holds them; names of files are relative to its folder.
void WriteDetailedPoints(KvfFile* file, const std::vector<DetailedPoint>& points, const std::string& folder);

}  // namespace tervane
