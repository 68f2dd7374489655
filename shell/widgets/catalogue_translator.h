// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QTranslator>

#include "platform/translations.h"

namespace tervane {

/// Gives the toolkit the texts of one of the languages of the programs.
class CatalogueTranslator : public QTranslator {
 public:
  /// Nothing is translated of a language that has no catalogue, as "en".
  explicit CatalogueTranslator(const QString& language);

  const Translations& Catalogue() const { return catalogue_; }
  bool isEmpty() const override { return catalogue_.Texts().empty(); }
  QString translate(const char* context, const char* text, const char* disambiguation = nullptr,
                    int n = -1) const override;

 private:
  const Translations& catalogue_;
};

}  // namespace tervane
