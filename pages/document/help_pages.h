// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The help pages that the program carries: the files of pages/document/help/. To add one: pages/document/help/NAME.htm,
// with its heading as title and h1, and a row in tests/pages/document/help_pages_test.cpp.
#pragma once

#include <string_view>
#include <vector>

namespace tervane {

/// The HTML text of a help page, or null when the program holds none of that name. The name is exact: "Tvn.htm".
const std::string_view* FindHelpPage(std::string_view name);

/// The names of all pages, in the order of their bytes.
std::vector<std::string_view> HelpPageNames();

}  // namespace tervane
