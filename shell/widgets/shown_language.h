// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QString>
#include <QTranslator>

#include "shell/widgets/catalogue_translator.h"

namespace tervane {

/// What the user may choose beside the languages: the one of the system.
inline constexpr const char* kSystemLanguage = "system";

/// The code of the language to show: the chosen one; the first of the system's that the program has; or English.
QString LanguageToShow(const QString& chosen, const QStringList& ofSystem);
QString LanguageToShow(const QString& chosen);

/// The texts of the window, and of the toolkit's own dialogs where its translations are installed, in a language as
/// long as this lives.
class ShownLanguage {
 public:
  explicit ShownLanguage(const QString& code);
  ~ShownLanguage();
  ShownLanguage(const ShownLanguage&) = delete;
  ShownLanguage& operator=(const ShownLanguage&) = delete;

 private:
  QTranslator ofToolkit_;
  CatalogueTranslator ours_;
};

}  // namespace tervane
