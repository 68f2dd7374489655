// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/translations.h"

#include <gtest/gtest.h>

namespace tervane {
namespace {

constexpr const char* kSample =
    "# of a test\n"
    "msgid \"\"\nmsgstr \"Content-Type: text/plain; charset=UTF-8\\n\"\n\n"
    "msgid \"Save %1\"\nmsgstr \"%1 speichern\"\n\n"
    "msgid \"Not yet\"\nmsgstr \"\"\n\n"
    "msgctxt \"Pages\"\nmsgid \"%1 of %2\"\nmsgstr \"%2: %1\"\n\n"
    "msgctxt \"Pages\"\nmsgid \"%1 of %2 \"\n\"\\\"wells\\\"\"\nmsgstr \"%1 von %2 \\\"Brunnen\\\"\"\n";

TEST(TranslationsTest, ValuesGoOverToTheTemplateWithTheMostLetters) {
  const Translations texts(kSample);
  EXPECT_EQ(texts.Problem(), "");
  EXPECT_EQ(texts.Finished("3 of 12 \"wells\""), "3 von 12 \"Brunnen\"");
  EXPECT_EQ(texts.Finished("3 of 12"), "12: 3");
  EXPECT_EQ(texts.Finished("of"), std::nullopt);
  // A template of the window alone is no form of a finished text.
  EXPECT_EQ(texts.Exact("Save %1"), "%1 speichern");
  EXPECT_EQ(texts.Finished("Save all"), std::nullopt);
  // What has no translation yet stays English.
  EXPECT_EQ(texts.Exact("Not yet"), std::nullopt);
}

TEST(TranslationsTest, ValuesThatAreTextsAndLinesAreTranslatedThemselves) {
  const Translations texts(
      "msgid \"Grid\"\nmsgstr \"Gitter\"\n\n"
      "msgctxt \"Pages\"\nmsgid \"%1:\"\nmsgstr \"%1:\"\n\n"
      "msgctxt \"Pages\"\nmsgid \"%1 not known, %2\"\nmsgstr \"%1 nicht bekannt, %2\"\n\n"
      "msgctxt \"Pages\"\nmsgid \"%1 to %2\"\nmsgstr \"%1 bis %2\"\n\n"
      "msgctxt \"Pages\"\nmsgid \"%1 not known\"\nmsgstr \"%1 nicht bekannt\"\n\n"
      "msgctxt \"Pages\"\nmsgid \"Thickness of %1\"\nmsgstr \"Dicke von %1\"\n");
  EXPECT_EQ(texts.Finished("Grid:"), "Gitter:");
  EXPECT_EQ(texts.Finished("Thickness of Grid"), "Dicke von Gitter");
  EXPECT_EQ(texts.Finished("a not known, b not known, Grid not known"),
            "a nicht bekannt, b nicht bekannt, Gitter nicht bekannt");
  EXPECT_EQ(texts.Finished("Clay\nGrid\n"), "Clay\nGitter\n");
  EXPECT_EQ(texts.Finished("Clay:\nGrid:"), "Clay:\nGitter:");
  EXPECT_EQ(texts.Finished("2000-01-01 to 2000-02-01"), "2000-01-01 bis 2000-02-01");
  EXPECT_EQ(texts.Finished("flow to river"), std::nullopt);
  // Nothing is said of values alone.
  EXPECT_EQ(texts.Finished("Clay:"), std::nullopt);
  EXPECT_EQ(texts.Finished("Clay\nSand"), std::nullopt);
  EXPECT_EQ(texts.Finished(""), std::nullopt);
  EXPECT_EQ(texts.Templates().front(), "Thickness of %1");
}

TEST(TranslationsTest, FaultsAreToldWithTheirLine) {
  const struct {
    const char* catalogue;
    const char* problem;
  } cases[] = {
      {"msgid \"a\"\nmsgstr \"b\n", "line 2: msgctxt, msgid, msgstr or a text in quotes was expected"},
      {"\n\"alone\"\n", "line 2: msgctxt, msgid, msgstr or a text in quotes was expected"},
      {"msgid \"a %1\"\nmsgstr \"b\"\n", "line 1: the translation has other place holders than the text"},
      {"msgctxt \"Pages\"\nmsgid \"%2 %1\"\nmsgstr \"%1 %2\"\n", "line 2: %1, %2 ... in this order were expected"},
      {"msgid \"a\"\nmsgstr \"b\"\n\nmsgid \"a\"\nmsgstr \"c\"\n", "line 4: this text has an entry already"},
  };
  for (const auto& [catalogue, problem] : cases) EXPECT_EQ(Translations(catalogue).Problem(), problem) << catalogue;
}

}  // namespace
}  // namespace tervane
