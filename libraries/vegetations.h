// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Vegetations: how leaf area index, root depth and crop coefficient of crops and covers develop.
#pragma once

#include <vector>

#include "libraries/library.h"

namespace tervane {

/// Vegetation property files (.etv).
extern const LibraryKind kVegetationLibrary;

/// A stage of a vegetation; the values are linear between stages.
struct CTvnVegPropStageData {
  int day = 0;                 ///< From the start of the crop.
  double lai = 0;              ///< Leaf area index.
  double rootDepth = 0;        ///< In metres.
  double cropCoefficient = 0;  ///< Factor of the reference evapotranspiration.

  /// Whole days from the start of the crop; that of the last stage is the length of the crop.
  int DayStamp() const { return day; }
};
using CTvnVegPropStageDataList = std::vector<CTvnVegPropStageData>;

/// The stages of a vegetation in time order.
CTvnVegPropStageDataList GetVegPropStages(const LibraryEntry& vegetation);
/// Those of a vegetation of a file; none where there is no such file or vegetation.
CTvnVegPropStageDataList GetVegPropStages(const std::string& path, std::string_view vegetation);

}  // namespace tervane
