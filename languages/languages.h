// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The languages that the programs speak. The texts of one other than English stand in the catalogues of this folder
// whose names begin with its code, "de_pages.po".
#pragma once

#include <span>
#include <string>
#include <string_view>

#include "platform/translations.h"

namespace tervane {

struct Language {
  std::string_view code;  ///< "de"
  std::string_view name;  ///< As its speakers call it.
};

/// English first, in which the sources are written.
std::span<const Language> Languages();
bool IsLanguage(std::string_view code);
/// "en or de", for help and messages.
std::string LanguageCodes();

/// The texts of a language, read when they are first asked for; none for English and for a code that is no language.
const Translations& CatalogueOf(std::string_view code);

/// The same text, or its translation where the catalogue has one.
std::string InLanguage(const Translations& catalogue, const std::string& english);

}  // namespace tervane
