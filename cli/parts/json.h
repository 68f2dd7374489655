// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace tervane {

/// A text as a JSON string, quotes included.
std::string JsonQuoted(std::string_view text);
inline std::string JsonBool(bool value) { return value ? "true" : "false"; }

/// An object of names and values that are JSON already; a member with an empty value is left out.
std::string JsonObject(const std::vector<std::pair<std::string_view, std::string>>& members);
/// One element a line.
std::string JsonArray(const std::vector<std::string>& elements);

}  // namespace tervane
