// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/widgets/shown_language.h"

#include <QCoreApplication>
#include <QLibraryInfo>
#include <QLocale>

#include "languages/languages.h"
#include "shell/widgets/qt_text.h"

namespace tervane {

namespace {

/// That of the sources.
QString English() { return ToQt(std::string(Languages().front().code)); }

}  // namespace

QString LanguageToShow(const QString& chosen, const QStringList& ofSystem) {
  if (IsLanguage(FromQt(chosen))) return chosen;
  // "de-AT"
  for (const QString& language : ofSystem)
    if (const QString code = language.section('-', 0, 0).section('_', 0, 0); IsLanguage(FromQt(code))) return code;
  return English();
}

QString LanguageToShow(const QString& chosen) { return LanguageToShow(chosen, QLocale::system().uiLanguages()); }

ShownLanguage::ShownLanguage(const QString& code) : ours_(code) {
  if (code != English() && ofToolkit_.load("qtbase_" + code, QLibraryInfo::path(QLibraryInfo::TranslationsPath)))
    QCoreApplication::installTranslator(&ofToolkit_);
  QCoreApplication::installTranslator(&ours_);
}

ShownLanguage::~ShownLanguage() {
  QCoreApplication::removeTranslator(&ours_);
  QCoreApplication::removeTranslator(&ofToolkit_);
}

}  // namespace tervane
