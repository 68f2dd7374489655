// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "surface/crop_course.h"

#include <algorithm>
#include <cstdint>
#include <limits>
#include <utility>

namespace tervane {

namespace {

constexpr double kNone = std::numeric_limits<double>::quiet_NaN();
constexpr std::int64_t kDay = 86'400;

/// A crop of the calendar in seconds.
struct Growing {
  const CTvnVegPropFile* file;
  std::int64_t start, end;  ///< Of its stages.
};

class DevelopmentBuilder {
 public:
  DevelopmentBuilder(const StagesOf& stagesOf, const TimeSpan& period) : stagesOf_(stagesOf), period_(period) {}

  CropDevelopment Build(const CTvnVegFileDataList& calendar) {
    std::vector<Growing> crops;
    for (const CTvnVegFileData& entry : calendar) {
      const CTvnVegPropStageDataList& stages = stagesOf_(*entry.file);
      const std::int64_t start = entry.start.SecondsSinceEpoch();
      crops.push_back({entry.file, start, start + kDay * (stages.empty() ? 0 : stages.back().DayStamp())});
    }
    // Dates may run backwards.
    std::ranges::stable_sort(crops, {}, &Growing::start);
    std::int64_t grown = period_.start;
    for (std::size_t i = 0; i < crops.size(); ++i) {
      const std::int64_t next = i + 1 < crops.size() ? crops[i + 1].start : std::numeric_limits<std::int64_t>::max();
      const std::int64_t end = std::min(crops[i].end, next);
      AddGap(grown, crops[i].start);
      AddStretch(CropStretch::Kind::Crop, crops[i].start, end, crops[i].file);
      if (next < crops[i].end) AddStretch(CropStretch::Kind::Overlap, next, crops[i].end, crops[i].file);
      AddCourse(crops[i], end);
      grown = std::max(grown, end);
    }
    AddGap(grown, period_.end);
    // An overlap lies over the crop that begins with it.
    std::ranges::stable_sort(development_.stretches, {}, [](const CropStretch& stretch) {
      return std::pair(stretch.span.start, stretch.kind == CropStretch::Kind::Overlap);
    });
    return std::move(development_);
  }

 private:
  /// The part within the period.
  void AddStretch(CropStretch::Kind kind, std::int64_t start, std::int64_t end, const CTvnVegPropFile* file) {
    const TimeSpan span{std::max(start, period_.start), std::min(end, period_.end)};
    if (span.Seconds() > 0) development_.stretches.push_back({kind, span, file});
  }

  void AddGap(std::int64_t start, std::int64_t end) {
    AddStretch(CropStretch::Kind::Gap, start, end, nullptr);
    const bool isWithin = start < end && start < period_.end && end > period_.start;
    if (isWithin && !development_.course.times.empty()) AddPoint(start, kNone, kNone);
  }

  void AddCourse(const Growing& crop, std::int64_t end) {
    const CTvnVegPropStageDataList& stages = stagesOf_(*crop.file);
    const TimeSpan span{std::max(crop.start, period_.start), std::min(end, period_.end)};
    if (span.Seconds() <= 0) return;
    const auto timeOf = [&](const CTvnVegPropStageData& stage) { return crop.start + kDay * stage.DayStamp(); };
    for (std::size_t i = 0; i < stages.size(); ++i) {
      const std::int64_t time = timeOf(stages[i]);
      if (time >= span.start && time <= span.end) AddPoint(time, stages[i].lai, stages[i].rootDepth);
      if (i + 1 == stages.size()) break;
      for (const std::int64_t border : {span.start, span.end})
        AddBetween(stages[i], stages[i + 1], time, timeOf(stages[i + 1]), border);
    }
  }

  /// A point on the line between two stages, if it lies strictly between them.
  void AddBetween(const CTvnVegPropStageData& a, const CTvnVegPropStageData& b, std::int64_t start, std::int64_t end,
                  std::int64_t time) {
    if (time <= start || time >= end) return;
    const double part = static_cast<double>(time - start) / static_cast<double>(end - start);
    AddPoint(time, a.lai + part * (b.lai - a.lai), a.rootDepth + part * (b.rootDepth - a.rootDepth));
  }

  void AddPoint(std::int64_t time, double lai, double rootDepth) {
    development_.course.times.push_back(time);
    development_.course.lai.push_back(lai);
    development_.course.rootDepth.push_back(rootDepth);
  }

  const StagesOf& stagesOf_;
  const TimeSpan period_;
  CropDevelopment development_;
};

}  // namespace

CropDevelopment DevelopmentOf(const CTvnVegFileDataList& calendar, const StagesOf& stagesOf, const TimeSpan& period) {
  return DevelopmentBuilder(stagesOf, period).Build(calendar);
}

}  // namespace tervane
