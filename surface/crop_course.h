// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What a calendar of crops comes to over a period: when which crop grows, and how leaves and roots develop.
#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <vector>

#include "libraries/vegetations.h"
#include "spatial/series_totals.h"
#include "surface/crop_calendar.h"

namespace tervane {

/// What grows over a stretch of time.
struct CropStretch {
  enum class Kind {
    Crop,     ///< From its start to its last stage, or until the next crop begins.
    Gap,      ///< No crop grows.
    Overlap,  ///< A crop has begun before the one before it reached its last stage.
  };

  Kind kind = Kind::Crop;
  TimeSpan span;
  const CTvnVegPropFile* file = nullptr;  ///< Of the crop, in an overlap of the one that is cut short.

  bool operator==(const CropStretch&) const = default;
};

/// Both quantities over time, linear between the stages of a crop, and without a value where no crop grows.
struct CropCourse {
  std::vector<std::int64_t> times;     ///< Seconds since 1970-01-01, ascending; where values jump, a time stands twice.
  std::vector<double> lai, rootDepth;  ///< As many; in metres. Not a number in gaps.
};

struct CropDevelopment {
  std::string problem = {};            ///< Why nothing is told.
  std::vector<CropStretch> stretches;  ///< Ascending by their start.
  CropCourse course;
};

/// The stages of a crop in time order.
using StagesOf = std::function<const CTvnVegPropStageDataList&(const CTvnVegPropFile& file)>;

/// Within the period; a crop that begins takes over from the one before it.
CropDevelopment DevelopmentOf(const CTvnVegFileDataList& calendar, const StagesOf& stagesOf, const TimeSpan& period);

}  // namespace tervane
