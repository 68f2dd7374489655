// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "languages/languages.h"

#include <algorithm>
#include <map>
#include <mutex>

#include "languages/catalogues_data.h"

namespace tervane {

namespace {

constexpr Language kLanguages[] = {{"en", "English"}, {"de", "Deutsch"}};

std::string TextOf(std::string_view code) {
  std::string text;
  const std::string begin = std::string(code) + "_";
  for (const CatalogueText& catalogue : AllCatalogueTexts())
    if (catalogue.name.starts_with(begin)) text.append(catalogue.text).append("\n");
  return text;
}

}  // namespace

std::span<const Language> Languages() { return kLanguages; }

bool IsLanguage(std::string_view code) {
  return std::ranges::any_of(kLanguages, [code](const Language& each) { return each.code == code; });
}

std::string LanguageCodes() {
  std::string codes;
  for (const Language& each : kLanguages) codes.append(codes.empty() ? "" : " or ").append(each.code);
  return codes;
}

const Translations& CatalogueOf(std::string_view code) {
  static const Translations none;
  if (!IsLanguage(code) || code == kLanguages[0].code) return none;
  static std::mutex mutex;
  static std::map<std::string, Translations, std::less<>> read;
  const std::lock_guard guard(mutex);
  const auto found = read.find(code);
  return (found != read.end() ? found : read.try_emplace(std::string(code), TextOf(code)).first)->second;
}

std::string InLanguage(const Translations& catalogue, const std::string& english) {
  return catalogue.Finished(english).value_or(english);
}

}  // namespace tervane
