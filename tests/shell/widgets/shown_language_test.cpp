// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/widgets/shown_language.h"

#include <QMenu>
#include <QStatusBar>

#include <gtest/gtest.h>

#include "tests/shell/opened_setup.h"

namespace tervane::shown_language_test {
namespace {

TEST(ShownLanguage, IsTheChosenOneOrTheFirstOfTheSystemsThatThereIs) {
  const struct {
    const char* chosen;
    QStringList ofSystem;
    const char* shown;
  } cases[] = {
      {"de", {"en-US"}, "de"},           {"en", {"de-DE"}, "en"},
      {"system", {"de-AT", "en"}, "de"}, {"system", {"fr-CH", "de_CH"}, "de"},
      {"system", {"C"}, "en"},           {"system", {}, "en"},
      {"tlh", {"de-DE"}, "de"},          {"", {"en-GB", "de-DE"}, "en"},
  };
  for (const auto& [chosen, ofSystem, shown] : cases)
    EXPECT_EQ(LanguageToShow(chosen, ofSystem), shown) << chosen << " " << FromQt(ofSystem.join(","));
}

TEST(ShownLanguage, IsChosenInTheMenuForTheNextStart) {
  test::OpenedSetup setup;
  EXPECT_EQ(setup.Program().Language(), kSystemLanguage);
  QAction* const german = setup.Action("Deutsch");
  ASSERT_TRUE(german);
  setup.Command("Deutsch");
  EXPECT_EQ(setup.Program().Language(), "de");
  EXPECT_TRUE(german->isChecked());
  // Who reads German alone must understand it, and who came here by mistake, too.
  EXPECT_EQ(setup.Window().statusBar()->currentMessage(), "Deutsch: shown from the next start of the program on.");
  const ShownLanguage shown(LanguageToShow(setup.Program().Language()));
  MainWindow next(setup.Program());
  QStringList texts, chosen;
  for (const QAction* action : next.findChildren<QAction*>()) {
    texts << action->text();
    if (action->isChecked()) chosen << action->text();
  }
  EXPECT_TRUE(texts.contains("S&prache"));
  EXPECT_TRUE(chosen.contains("&Deutsch"));
  EXPECT_FALSE(chosen.contains("&English"));
}

}  // namespace
}  // namespace tervane::shown_language_test
