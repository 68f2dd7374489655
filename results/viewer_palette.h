// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The palettes of the result viewer: sixteen colours, each with the upper end of its class.
#pragma once

#include <array>
#include <string>

#include "core/kvf.h"

namespace tervane {

inline constexpr int kPaletteClasses = 16;

struct PaletteColor {
  int red = 0, green = 0, blue = 0;

  bool operator==(const PaletteColor&) const = default;
};

/// From violet for low values to red for high ones.
extern const std::array<PaletteColor, kPaletteClasses> kResultColors;

struct PaletteRange {
  double low = 0, high = 0;

  bool operator==(const PaletteRange&) const = default;
};

/// The range of a palette over values from a to b, in any order: sixteen classes as wide as a number that is easy to
/// read, the topmost of which ends at the greater value or at the first multiple of the width above it. One value alone
/// has classes of 1.
PaletteRange ScaledRange(double a, double b);

/// The upper ends of the sixteen classes.
std::array<float, kPaletteClasses> ClassesOf(const PaletteRange& range);

/// The section of a palette over that range.
void WriteResultPalette(KvfFile* file, const std::string& title, const PaletteRange& range);
/// The section of the palette of flow vectors, which is always the same.
void WriteVectorPalette(KvfFile* file);

}  // namespace tervane
