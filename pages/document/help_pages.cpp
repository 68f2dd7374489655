// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/document/help_pages.h"

#include <algorithm>

#include "pages/document/help_pages_data.h"

namespace tervane {

const std::string_view* FindHelpPage(std::string_view name) {
  const auto pages = AllHelpPages();
  const auto page = std::ranges::find(pages, name, &HelpPage::name);
  return page == pages.end() ? nullptr : &page->text;
}

std::vector<std::string_view> HelpPageNames() {
  std::vector<std::string_view> names;
  for (const HelpPage& page : AllHelpPages()) names.push_back(page.name);
  return names;
}

}  // namespace tervane
