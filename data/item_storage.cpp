// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What the stored values of an item mean.
#include <algorithm>
#include <cmath>
#include <limits>

#include "data/datafile_header.h"

namespace tervane {

void ItemStorage::MarkMissing(std::span<float> values) const {
  // Looking first is faster than storing every value anew, and one plain loop for each condition faster than one loop
  // with all of them.
  if (!AreFinite(values)) {
    for (float& value : values) value = std::isfinite(value) ? value : kDeleteValue;
  }
  for (const double one : missing) {
    const auto mark = static_cast<float>(one);
    if (mark == kDeleteValue) continue;
    for (float& value : values) value = value == mark ? kDeleteValue : value;
  }
  if (!HasValidRange()) return;
  const auto from = static_cast<float>(std::max(validFrom, -static_cast<double>(std::numeric_limits<float>::max())));
  const auto to = static_cast<float>(std::min(validTo, static_cast<double>(std::numeric_limits<float>::max())));
  for (float& value : values) value = value >= from && value <= to ? value : kDeleteValue;
}

double ItemStorage::Unpacked(double stored) const {
  if (isUnsigned && stored < 0) {
    stored += type == NC_BYTE ? 0x1p8 : type == NC_SHORT ? 0x1p16 : 0x1p32;
  }
  constexpr double kNone = std::numeric_limits<double>::quiet_NaN();
  if (!std::isfinite(stored) || !(stored >= validFrom && stored <= validTo)) return kNone;
  for (double mark : missing) {
    if (isUnsigned && mark < 0) {
      mark += type == NC_BYTE ? 0x1p8 : type == NC_SHORT ? 0x1p16 : 0x1p32;
    }
    if (stored == mark) return kNone;
  }
  return stored * scale + offset;
}

std::vector<float> ItemStorage::Meant(std::span<const double> numbers) const {
  constexpr double kLargest = static_cast<double>(std::numeric_limits<float>::max());
  std::vector<float> values;
  values.reserve(numbers.size());
  for (const double number : numbers)
    values.push_back(std::abs(number) <= kLargest ? static_cast<float>(number)
                                                  : std::numeric_limits<float>::quiet_NaN());
  MarkMissing(values);
  return values;
}

double ItemStorage::Stored(float value) const {
  if (value != kDeleteValue && std::isfinite(value)) return static_cast<double>(value);
  if (missing.empty()) return static_cast<double>(kDeleteValue);
  return isFillAssumed && missing.size() > 1 ? missing[1] : missing.front();
}

std::vector<double> ItemStorage::Stored(std::span<const float> values, std::span<const double> old) const {
  const std::vector<float> meant = Meant(old);
  std::vector<double> stored;
  stored.reserve(values.size());
  for (std::size_t i = 0; i < values.size(); ++i)
    stored.push_back(i < meant.size() && values[i] == meant[i] ? old[i] : Stored(values[i]));
  return stored;
}

bool ItemStorage::HasValidRange() const { return std::isfinite(validFrom) || std::isfinite(validTo); }

bool ItemStorage::IsInOrder() const {
  int last = -1;
  for (const int place : {time, z, y, x}) {
    if (place < 0) continue;
    if (place < last) return false;
    last = place;
  }
  return !isXTurned && !isZTurned;
}

}  // namespace tervane
