// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/widgets/catalogue_translator.h"

#include "languages/languages.h"
#include "shell/widgets/qt_text.h"

namespace tervane {

CatalogueTranslator::CatalogueTranslator(const QString& language) : catalogue_(CatalogueOf(FromQt(language))) {}

QString CatalogueTranslator::translate(const char* context, const char* text, const char* disambiguation,
                                       int /*n*/) const {
  const bool isFinished = std::string_view(context) == "Pages";
  const auto found =
      isFinished ? catalogue_.Finished(text) : catalogue_.Exact(text, disambiguation ? disambiguation : "");
  return found ? ToQt(*found) : QString();
}

}  // namespace tervane
