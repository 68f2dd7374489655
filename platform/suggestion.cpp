// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/suggestion.h"

#include <fmt/format.h>

#include "platform/text.h"

namespace tervane {

std::string Suggestion(const std::string& typed, const std::vector<std::string>& names) {
  const std::string* nearest = nullptr;
  std::size_t least = typed.size() / 3 + 2;
  for (const std::string& name : names) {
    if (EqualIgnoringCase(name, typed)) return fmt::format("; did you mean {}?", name);
    const std::size_t distance = EditDistance(name, typed);
    if (distance >= least) continue;
    least = distance;
    nearest = &name;
  }
  return nearest ? fmt::format("; did you mean {}?", *nearest) : std::string();
}

}  // namespace tervane
