// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/csv_reader.h"

#include <charconv>

namespace tervane {

std::optional<double> ParseCsvNumber(std::string_view cell, bool mayHaveComma) {
  std::string number(Trimmed(cell));
  if (mayHaveComma && number.find('.') == std::string::npos) std::ranges::replace(number, ',', '.');
  const char* begin = number.data() + (number.starts_with('+') ? 1 : 0);
  double value = 0;
  const auto [end, error] = std::from_chars(begin, number.data() + number.size(), value);
  if (error != std::errc() || end != number.data() + number.size()) return std::nullopt;
  return value;
}

}  // namespace tervane
