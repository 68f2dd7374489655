// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "libraries/vegetations.h"

#include <algorithm>
#include <cmath>
#include <limits>

namespace tervane {

namespace {

constexpr LibraryField kFields[] = {
    {"Name", "Name:", "The name by which setups know the vegetation"},
    {"Source", "Source:", "Where the values come from"},
};

enum Column { kDay, kLai, kRootDepth, kCropCoefficient };
constexpr LibraryColumn kColumns[] = {
    {"Day", "", "Whole days from the start of the crop", true, 0, 36500},
    {"LAI", "", "Leaf area index: area of leaves above an area of ground", false, 0, 20},
    {"RD", "m", "Root depth", false, 0, 50},
    {"Kc", "", "Crop coefficient: factor of the reference evapotranspiration", false, 0, 3},
};
static_assert(std::size(kColumns) <= kMostLibraryColumns);

}  // namespace

constexpr LibraryKind kVegetationLibrary{
    .name = "vegetation property file",
    .entryName = "vegetation",
    .entryNames = "vegetations",
    .rowName = "stage",
    .rowNames = "stages",
    .extension = "etv",
    .filter = "ET Vegetation property file (*.etv)|*.etv|All Files (*.*)|*.*||",
    .target = "TERVANE_VEGETATION",
    .sectionPattern = "Vegetation_%d",
    .fields = kFields,
    .rowKey = "Stage",
    .columns = kColumns,
    .between = "Values are linear between stages.",
};

CTvnVegPropStageDataList GetVegPropStages(const LibraryEntry& vegetation) {
  CTvnVegPropStageDataList stages;
  stages.reserve(vegetation.rows.size());
  for (const LibraryRow& row : vegetation.rows) {
    const double day = row.values[kDay];
    // What validation refuses has no place in time.
    if (!(day >= kColumns[kDay].least && day <= kColumns[kDay].most)) continue;
    stages.push_back(
        {static_cast<int>(std::lround(day)), row.values[kLai], row.values[kRootDepth], row.values[kCropCoefficient]});
  }
  std::ranges::stable_sort(stages, {}, &CTvnVegPropStageData::day);
  return stages;
}

CTvnVegPropStageDataList GetVegPropStages(const std::string& path, std::string_view vegetation) {
  const auto reading = ReadLibraryOnce(kVegetationLibrary, path);
  const auto place = reading->library.Find(vegetation);
  return place ? GetVegPropStages(reading->library.entries[*place]) : CTvnVegPropStageDataList();
}

}  // namespace tervane
