// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What cmake/EmbedTexts.cmake makes of pages/document/help/ when the program is built.
#pragma once

#include <span>
#include <string_view>

namespace tervane {

struct HelpPage {
  std::string_view name;
  std::string_view text;
};

/// All pages, in the order of their names.
std::span<const HelpPage> AllHelpPages();

}  // namespace tervane
