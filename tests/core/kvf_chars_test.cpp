// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/kvf_chars.h"

#include <string>

#include <gtest/gtest.h>

namespace tervane::kvf_chars_test {
namespace {

/// How many of the eight characters, from the first on, are of a class by the table.
template <class IsOfClass>
int Leading(const std::string& text, IsOfClass isOfClass) {
  int count = 0;
  while (count < 8 && isOfClass(text[static_cast<std::size_t>(count)])) ++count;
  return count;
}

TEST(KvfChars, EightCharactersAreCountedAsOneByOne) {
  const auto isWordChar = [](char c) { return Is(c, kNameRest) && c != '.' && c != '%' && c != '-'; };
  // Every byte at every place, between neighbours of each class and of none.
  for (const char filler : {'a', 'Z', '_', '0', '9', ' ', '~', '"', '\x80', '\xFF', '\0'}) {
    for (std::size_t place = 0; place < 8; ++place) {
      for (int byte = 0; byte < 256; ++byte) {
        std::string text(8, filler);
        text[place] = static_cast<char>(byte);
        const EightChars eight(text.data());
        SCOPED_TRACE(testing::PrintToString(text));
        ASSERT_EQ(eight.WordChars(), Leading(text, isWordChar));
        ASSERT_EQ(eight.Digits(), Leading(text, [](char c) { return Is(c, kDigit); }));
        ASSERT_EQ(eight.PlainChars(), Leading(text, [](char c) { return Is(c, kPlain); }));
        ASSERT_EQ(eight.Blanks(), Leading(text, [](char c) { return c == ' '; }));
      }
    }
  }
}

TEST(KvfChars, DigitsAreTakenAsANumberWhateverStandsBehind) {
  for (const std::string digits : {"12345678", "90807060", "00000009", "99999999"}) {
    for (std::size_t count = 1; count <= 8; ++count) {
      for (const char behind : {' ', ',', '\0', '.', '\xFF'}) {
        const std::string text = digits.substr(0, count) + std::string(8 - count, behind);
        EXPECT_EQ(EightChars(text.data()).NumberOf(static_cast<int>(count)), std::stoull(digits.substr(0, count)))
            << text;
      }
    }
  }
}

TEST(KvfChars, AWordEndsBehindItsLastCharacter) {
  for (const std::string word : {"a", "Name", "Eight_88", "a.b-c%d", "SevenAn-", "A_name_longer_than_8.5%-and-more"}) {
    for (const std::string behind : {" = 1", "=", "", "{", "\xC3\xA5"}) {
      const std::string text = word + behind + std::string(8, '\0');
      const char* at = text.data();
      EXPECT_EQ(ScanWord(at), word);
      EXPECT_EQ(at, text.data() + word.size());
    }
  }
}

}  // namespace
}  // namespace tervane::kvf_chars_test
