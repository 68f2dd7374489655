// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/widgets/catalogue_translator.h"

#include <QMenu>
#include <QMenuBar>

#include <gtest/gtest.h>

#include "shell/widgets/qt_text.h"
#include "tests/shell/opened_setup.h"

namespace tervane {
namespace {

/// The language of a test, given back at its end.
class InLanguage {
 public:
  explicit InLanguage(const QString& language) : translator_(language) {
    QCoreApplication::installTranslator(&translator_);
  }
  ~InLanguage() { QCoreApplication::removeTranslator(&translator_); }
  InLanguage(const InLanguage&) = delete;
  InLanguage& operator=(const InLanguage&) = delete;
  const Translations& Catalogue() const { return translator_.Catalogue(); }

 private:
  CatalogueTranslator translator_;
};

TEST(CatalogueTranslatorTest, FindingsAndLabelsAreGermanAndOtherTextsStayAsTheyAre) {
  const std::string solver = "Tervane has no solver PCG4.", label = "Precipitation Rate", unknown = "My own layer";
  EXPECT_EQ(Translated(label), "Precipitation Rate");
  const InLanguage german("de");
  EXPECT_EQ(german.Catalogue().Problem(), "");
  EXPECT_EQ(Translated(solver), "Tervane hat keinen Löser PCG4.");
  EXPECT_EQ(Translated(label), "Niederschlagsrate");
  EXPECT_EQ(Translated(unknown), "My own layer");
  // One English word for two things.
  EXPECT_EQ(QCoreApplication::translate("tervane::GridEditor", "Line"), "Zeile");
  EXPECT_EQ(QCoreApplication::translate("tervane::GridEditor", "Line", "drawn"), "Linie");
  EXPECT_EQ(QCoreApplication::translate("tervane::GridEditor", "Layer", "drawn"), "Schicht");
}

TEST(CatalogueTranslatorTest, EachMenuOfTheGermanWindowIsTranslatedAndHasEachMnemonicOnce) {
  const InLanguage german("de");
  test::OpenedSetup setup;
  MainWindow& window = setup.Window();
  ASSERT_EQ(window.menuBar()->actions().front()->text(), "&Datei");
  const auto check = [](const QString& name, const QList<QAction*>& actions) {
    QString taken;
    for (const QAction* action : actions) {
      const qsizetype at = action->text().indexOf('&');
      if (at < 0) continue;
      const QChar letter = action->text().at(at + 1).toLower();
      EXPECT_FALSE(taken.contains(letter)) << FromQt(name) << ": " << FromQt(action->text());
      taken += letter;
    }
  };
  check("menus", window.menuBar()->actions());
  for (const QAction* entry : window.menuBar()->actions())
    if (const QMenu* menu = entry->menu()) check(entry->text(), menu->actions());
}

}  // namespace
}  // namespace tervane
