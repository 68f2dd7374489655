// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "surface/crop_calendar.h"

#include <algorithm>
#include <cstdint>
#include <optional>

namespace tervane {

namespace {

/// A calendar while it grows. Dates are seconds.
class CalendarBuilder {
 public:
  CalendarBuilder(std::span<const PlannedCrop> crops, int recycleMode, const CYbDateTime& end)
      : crops_(crops), mode_(recycleMode), end_(end.SecondsSinceEpoch()) {}

  CropCalendar Build() {
    TakeCrops();
    if (mode_ & kEntireScheme) RepeatScheme();
    return std::move(calendar_);
  }

 private:
  /// The first place from `place` on that has a date.
  std::size_t NextDated(std::size_t place) const {
    while (place < crops_.size() && !crops_[place].start.IsValid()) ++place;
    return place;
  }

  void TakeCrops() {
    std::size_t place = NextDated(0);
    while (place < crops_.size() && !crops_[place].isValid) place = NextDated(place + 1);
    while (place < crops_.size() && !calendar_.isCut) {
      const std::int64_t start = crops_[place].start.SecondsSinceEpoch();
      if (start >= end_) return;
      const std::size_t next = NextDated(place + 1);
      TakeCrop(crops_[place], start, LimitOf(next));
      place = next;
    }
  }

  /// Until when a crop is repeated; nothing where it is taken once.
  std::optional<std::int64_t> LimitOf(std::size_t next) const {
    if ((mode_ & kEachEntry) && next < crops_.size()) return std::min(crops_[next].start.SecondsSinceEpoch(), end_);
    if (mode_ == kEachEntry) return end_;
    return std::nullopt;
  }

  void TakeCrop(const PlannedCrop& crop, std::int64_t start, const std::optional<std::int64_t>& limit) {
    Append(crop.file, start);
    if (mode_ <= kNoRecycling) return;
    const std::int64_t length = crop.length.seconds;
    while (limit && length > 0 && *limit - start > length && !calendar_.isCut) {
      start += length;
      Append(crop.file, start);
    }
    schemeLength_ = start - starts_.front() + length;
  }

  void RepeatScheme() {
    if (schemeLength_ <= 0) return;
    // The copies join the calendar, so that the scheme goes round.
    for (std::size_t place = 0; place < starts_.size() && end_ - starts_[place] > schemeLength_ && !calendar_.isCut;
         ++place)
      Append(calendar_.entries[place].file, starts_[place] + schemeLength_);
  }

  void Append(const CTvnVegPropFile* file, std::int64_t start) {
    if (starts_.size() == CropCalendar::kMostEntries) {
      calendar_.isCut = true;
      return;
    }
    starts_.push_back(start);
    calendar_.entries.push_back({file, CYbDateTime::FromSecondsSinceEpoch(start)});
  }

  std::span<const PlannedCrop> crops_;
  const int mode_;
  const std::int64_t end_;
  CropCalendar calendar_;
  std::vector<std::int64_t> starts_;  ///< Of the entries.
  std::int64_t schemeLength_ = 0;
};

}  // namespace

CropCalendar BuildVegCalendar(std::span<const PlannedCrop> crops, int recycleMode, const CYbDateTime& end) {
  return end.IsValid() ? CalendarBuilder(crops, recycleMode, end).Build() : CropCalendar();
}

}  // namespace tervane
