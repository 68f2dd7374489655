// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What an engine says on its output that the programs around it understand; all other lines are only shown.
#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace tervane {

/// "progress 42 text"
struct EngineProgress {
  double percent = 0;  ///< 0 to 100.
  std::string text;    ///< May be empty.

  bool operator==(const EngineProgress&) const = default;
};
std::optional<EngineProgress> EngineProgressOf(std::string_view line);

/// "error: section/path:Key: text", "warning: text"
struct EngineMessage {
  bool isError = true;
  std::string place;  ///< What may be a path; whether it is one only the setup knows. May be empty.
  std::string text;   ///< What stands behind it.

  bool operator==(const EngineMessage&) const = default;
};
std::optional<EngineMessage> EngineMessageOf(std::string_view line);

}  // namespace tervane
