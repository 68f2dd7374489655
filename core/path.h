// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Places in a setup as every program, message and finding writes them: section names joined by `/`, `#n` behind a name
// for the n-th of equal names, `:Key` behind for a key; a name with one of `/ # : "` in it stands in double quotes.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace tervane {

/// A name as it stands in a path; an instance above 1 is written behind.
std::string PathName(std::string_view name, int instance = 1);

/// `path/name`, or `name` alone below an empty path.
std::string JoinPath(std::string_view path, std::string_view name);

struct PathStep {
  std::string name;
  int instance = 1;
};

/// A place that a user typed.
struct SetupPath {
  std::vector<PathStep> steps;
  PathStep key;       ///< The name is empty when the path names no key.
  std::string error;  ///< Why the text is no path; empty when it is.
};

/// Reads "Subcatchments/Subcatchment#2:Name".
SetupPath ParseSetupPath(std::string_view text);

}  // namespace tervane
