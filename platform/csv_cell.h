// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <string_view>

#include "platform/text.h"

namespace tervane {

/// A cell of a table that is separated by commas: in quotes where its text needs them.
inline std::string CsvCell(std::string_view text) {
  if (text.find_first_of(",\"\r\n") == std::string_view::npos) return std::string(text);
  return "\"" + Replaced(std::string(text), "\"", "\"\"") + "\"";
}

}  // namespace tervane
