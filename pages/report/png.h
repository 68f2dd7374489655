// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <vector>

namespace tervane {

/// An image of numbers of colours, row by row from the top.
struct IndexedImage {
  int width = 0, height = 0;
  std::vector<std::uint8_t> pixels;
  std::vector<unsigned> colors;  ///< Red, green, blue; at most 256. Number 0 is transparent.
};

/// The bytes of a PNG file.
std::string PngOf(const IndexedImage& image);

/// As stands in a text: base 64.
std::string Base64(std::string_view bytes);

}  // namespace tervane
