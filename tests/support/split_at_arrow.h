// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <algorithm>
#include <string>
#include <string_view>
#include <utility>

namespace tervane::test {

/// What stands on either side of the arrow in a row of a table, "question => answer"; a row without one has no answer.
inline std::pair<std::string, std::string> SplitAtArrow(std::string_view row) {
  const std::size_t arrow = std::min(row.find(" =>"), row.size());
  std::string_view answer = row.substr(arrow);
  answer.remove_prefix(std::min<std::size_t>(answer.size(), answer.starts_with(" => ") ? 4 : 3));
  return {std::string(row.substr(0, arrow)), std::string(answer)};
}

}  // namespace tervane::test
