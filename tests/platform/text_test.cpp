// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/text.h"

#include <bit>
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <limits>
#include <random>

#include <gmock/gmock.h>

namespace tervane {
namespace {

TEST(Text, TrimmingTakesBlanksAndLineEndsOfBothSides) {
  EXPECT_EQ(Trimmed(" \t a b \r\n"), "a b");
  EXPECT_EQ(Trimmed("a"), "a");
  EXPECT_EQ(Trimmed(" \t\r\n"), "");
  EXPECT_EQ(Trimmed(""), "");
}

TEST(Text, ComparisonIgnoresTheCaseOfAsciiLettersOnly) {
  EXPECT_TRUE(EqualIgnoringCase("Climate", "cLIMATE"));
  EXPECT_FALSE(EqualIgnoringCase("Climate", "Climat"));
  EXPECT_FALSE(EqualIgnoringCase("ä", "Ä"));
  EXPECT_FALSE(EqualIgnoringCase("[", "{"));
}

TEST(Text, EveryOccurrenceIsReplacedFromTheLeft) {
  EXPECT_EQ(Replaced("a\\b\\c", "\\", "/"), "a/b/c");
  EXPECT_EQ(Replaced("aaa", "aa", "b"), "ba");
  EXPECT_EQ(Replaced("aa", "a", "aa"), "aaaa");
  EXPECT_EQ(Replaced("", "a", "b"), "");
}

TEST(Text, WellFormedUtf8IsAccepted) {
  for (const char* text : {"", "plain", "eight by", "nine byte", "Übung ä", "€ 20", "\U0001F30A", "\uD7FF\uE000\uFFFF",
                           "\x7F", "\U0010FFFF", "long enough for words, then ö and more behind it"}) {
    EXPECT_EQ(FirstInvalidUtf8(text), std::nullopt) << text;
  }
}

TEST(Text, TheFirstByteThatIsNoUtf8IsFound) {
  struct Case {
    std::string text;
    std::size_t place;
  };
  const Case cases[] = {
      {"\x80", 0},                      // continuation without a lead
      {"abc\xFF", 3},                   //
      {"12345678\xE4gypten", 8},        // Latin 1
      {"1234567\xC3", 7},               // cut
      {"a\xE2\x82", 1},                 //
      {"a\xF0\x9F\x8C", 1},             //
      {"\xC3(", 0},                     // lead without continuation
      {"\xC0\xAF", 0},                  // overlong forms of '/'
      {"\xC1\xBF", 0},                  //
      {"\xE0\x80\xAF", 0},              //
      {"\xF0\x80\x80\xAF", 0},          //
      {"ok \xED\xA0\x80", 3},           // surrogates
      {"ok \xED\xBF\xBF", 3},           //
      {"\xF4\x90\x80\x80", 0},          // above U+10FFFF
      {"\xF5\x80\x80\x80", 0},          //
      {"\xC3\xB6\xC3\xB6\xFE rest", 4}  //
  };
  for (const Case& c : cases) EXPECT_EQ(FirstInvalidUtf8(c.text), c.place) << testing::PrintToString(c.text);
}

TEST(Text, EditDistanceCountsInsertedDeletedAndReplacedBytes) {
  EXPECT_EQ(EditDistance("", ""), 0u);
  EXPECT_EQ(EditDistance("", "abc"), 3u);
  EXPECT_EQ(EditDistance("abc", ""), 3u);
  EXPECT_EQ(EditDistance("SearchRadius", "SearchRadius"), 0u);
  EXPECT_EQ(EditDistance("SerchRadius", "SearchRadius"), 1u);
  EXPECT_EQ(EditDistance("kitten", "sitting"), 3u);
  EXPECT_EQ(EditDistance("ab", "ba"), 2u);
}

TEST(Text, NumbersAreWrittenInTheirShortestForm) {
  struct Case {
    double value;
    const char* text;
  };
  const Case cases[] = {
      {0, "0"},
      {-0.0, "-0"},
      {6, "6"},
      {-12, "-12"},
      {0.1, "0.1"},
      {100000, "100000"},
      {6200000, "6200000"},
      {999999999, "999999999"},
      {1e9, "1e9"},
      {-1e-35, "-1e-35"},
      {1e-5, "1e-5"},
      {1.5e10, "1.5e10"},
      {1e100, "1e100"},
      {1e-110, "1e-110"},
      {1.0 / 3, "0.3333333333333333"},
      {5e-324, "5e-324"},
      {std::numeric_limits<double>::max(), "1.7976931348623157e308"},
      {std::numeric_limits<double>::infinity(), "inf"},
      {-std::numeric_limits<double>::infinity(), "-inf"},
      {std::numeric_limits<double>::quiet_NaN(), "nan"},
      {-std::numeric_limits<double>::quiet_NaN(), "nan"},
  };
  for (const Case& c : cases) EXPECT_EQ(ShortestNumber(c.value), c.text);
}

TEST(Text, AFloatIsAsShortAsItsOwnPrecisionAllows) {
  EXPECT_EQ(ShortestNumber(0.1f), "0.1");
  EXPECT_EQ(ShortestNumber(-1e-35f), "-1e-35");
  EXPECT_EQ(ShortestNumber(16777216.f), "16777216");
  EXPECT_EQ(ShortestNumber(1e9f), "1e9");
  EXPECT_EQ(ShortestNumber(std::numeric_limits<float>::max()), "3.4028235e38");
}

TEST(Text, EveryNumberReadsBackToTheSameBits) {
  std::mt19937_64 random(7);
  for (int i = 0; i < 20000; ++i) {
    const auto value = std::bit_cast<double>(random());
    if (std::isnan(value)) continue;
    const std::string text = ShortestNumber(value);
    ASSERT_EQ(std::bit_cast<std::uint64_t>(std::strtod(text.c_str(), nullptr)), std::bit_cast<std::uint64_t>(value))
        << text;
    const auto whole = static_cast<float>(static_cast<std::int32_t>(random()) / (i % 1000 + 1));
    ASSERT_EQ(std::strtof(ShortestNumber(whole).c_str(), nullptr), whole);
  }
}

}  // namespace
}  // namespace tervane
