// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <algorithm>
#include <ostream>
#include <string>
#include <vector>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "platform/text.h"

namespace tervane {

using TextRows = std::vector<std::vector<std::string>>;

/// Characters that take a place on the screen.
inline std::size_t ScreenWidthOf(const std::string& text) {
  return static_cast<std::size_t>(
      std::ranges::count_if(text, [](char c) { return (static_cast<unsigned char>(c) & 0xC0u) != 0x80u; }));
}

/// Cells below each other, the first row as heads.
inline void WriteTextTable(TextRows rows, std::ostream& out) {
  std::vector<std::size_t> widths;
  for (auto& row : rows)
    for (std::string& cell : row) cell = OneLine(cell);
  for (const auto& row : rows) {
    widths.resize(std::max(widths.size(), row.size()), 0);
    for (std::size_t i = 0; i < row.size(); ++i) widths[i] = std::max(widths[i], ScreenWidthOf(row[i]));
  }
  for (const auto& row : rows) {
    std::string line;
    for (std::size_t i = 0; i < row.size(); ++i)
      line += "  " + row[i] + std::string(widths[i] - ScreenWidthOf(row[i]), ' ');
    while (!line.empty() && line.back() == ' ') line.pop_back();
    fmt::print(out, "{}\n", line);
  }
}

}  // namespace tervane
