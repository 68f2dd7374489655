// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The calendar of crops: which crop begins when, as a sequence of crops is recycled up to the end of the simulation.
#pragma once

#include <cstddef>
#include <span>
#include <vector>

#include "core/key_facts.h"
#include "platform/dates.h"

namespace tervane {

class CTvnVegPropFile;

/// How a sequence of crops goes on. Bit 0 repeats each crop until the next one, bit 1 the sequence.
enum RecycleModes : int { kNoRecycling = 0, kEachEntry = 1, kEntireScheme = 2, kEntriesThenScheme = 3 };
inline constexpr KeyChoice kRecycleModes[] = {{kNoRecycling, "None"},
                                              {kEachEntry, "Each entry"},
                                              {kEntireScheme, "Entire scheme"},
                                              {kEntriesThenScheme, "Entries, then scheme"}};

/// A crop of the sequence.
struct PlannedCrop {
  const CTvnVegPropFile* file = nullptr;
  CYbDateTime start;       ///< A crop whose date is none is passed over.
  CYbDateTimeSpan length;  ///< 0 where nothing is known of it: such a crop is not repeated.
  bool isValid = true;     ///< A calendar begins with a crop that is.
};

/// A crop of the calendar.
struct CTvnVegFileData {
  const CTvnVegPropFile* file = nullptr;
  CYbDateTime start;

  bool operator==(const CTvnVegFileData&) const = default;
};
using CTvnVegFileDataList = std::vector<CTvnVegFileData>;

struct CropCalendar {
  CTvnVegFileDataList entries;  ///< As they are taken, which is the order of time unless dates run backwards.
  bool isCut = false;           ///< It has more than the most entries.

  static constexpr std::size_t kMostEntries = 1'000'000;
};

/// Crops are taken in the order of the sequence, not of their dates; the first that does not begin before `end` ends
/// the calendar.
CropCalendar BuildVegCalendar(std::span<const PlannedCrop> crops, int recycleMode, const CYbDateTime& end);

}  // namespace tervane
