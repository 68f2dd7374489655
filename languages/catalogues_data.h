// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <span>
#include <string_view>

namespace tervane {

/// A catalogue of this folder: "de_pages.po" and what it holds.
struct CatalogueText {
  std::string_view name, text;
};
/// In the order of their names.
std::span<const CatalogueText> AllCatalogueTexts();

}  // namespace tervane
