// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/text.h"

#include <cstdlib>
#include <limits>

#include <gmock/gmock.h>

namespace tervane::text_test {
namespace {

TEST(Text, IsTrimmedComparedAndReplaced) {
  EXPECT_EQ(Trimmed(" \t a b \r\n"), "a b");
  EXPECT_EQ(Trimmed(" \t\r\n"), "");
  EXPECT_TRUE(EqualIgnoringCase("Climate", "cLIMATE"));
  EXPECT_FALSE(EqualIgnoringCase("Climate", "Climat"));
  EXPECT_FALSE(EqualIgnoringCase("ä", "Ä"));
  EXPECT_FALSE(EqualIgnoringCase("[", "{"));
  EXPECT_EQ(Replaced("aaa", "aa", "b"), "ba");
  EXPECT_EQ(Replaced("aa", "a", "aa"), "aaaa");
}

TEST(Text, WellFormedUtf8IsAccepted) {
  for (const char* text : {"", "plain", "eight by", "nine byte", "Übung ä", "€ 20", "\U0001F30A", "\uD7FF\uE000\uFFFF",
                           "\x7F", "\U0010FFFF", "long enough for words, then ö and more behind it"})
    EXPECT_EQ(FirstInvalidUtf8(text), std::nullopt) << text;
}

TEST(Text, TheFirstByteThatIsNoUtf8IsFound) {
  // Behind ^: continuation without a lead, Latin 1, cut, lead without continuation, overlong forms of '/', surrogates,
  // above U+10FFFF.
  for (std::string text :
       {"^\x80", "abc^\xFF", "12345678^\xE4gypten", "1234567^\xC3", "a^\xE2\x82", "a^\xF0\x9F\x8C", "^\xC3(",
        "^\xC0\xAF", "^\xC1\xBF", "^\xE0\x80\xAF", "^\xF0\x80\x80\xAF", "ok ^\xED\xA0\x80", "ok ^\xED\xBF\xBF",
        "^\xF4\x90\x80\x80", "^\xF5\x80\x80\x80", "\xC3\xB6\xC3\xB6^\xFE rest"}) {
    const std::size_t place = text.find('^');
    text.erase(place, 1);
    EXPECT_EQ(FirstInvalidUtf8(text), place) << testing::PrintToString(text);
  }
}

TEST(Text, WhatATerminalWouldObeyIsShownInWords) {
  const struct {
    const char *text, *line, *lines;
  } cases[] = {{"Rain \xc3\xa9\xe2\x82\xac [mm]", "Rain \xc3\xa9\xe2\x82\xac [mm]", "Rain \xc3\xa9\xe2\x82\xac [mm]"},
               {"a\nb\tc\r\nd\re", "a\\nb\\tc\\r\\nd\\re", "a\nb\tc\r\nd\\re"},
               {"\x1b[2J\x7f\xc2\x9b", "\\u{1b}[2J\\u{7f}\\u{9b}", "\\u{1b}[2J\\u{7f}\\u{9b}"},
               {"\xff\xc3", "\\xff\\xc3", "\\xff\\xc3"}};
  for (const auto& c : cases) {
    EXPECT_EQ(OneLine(c.text), c.line);
    // A line end of two characters stays as it is.
    EXPECT_EQ(Printable(c.text), c.lines);
  }
}

TEST(Text, EditDistanceCountsInsertedDeletedAndReplacedBytes) {
  EXPECT_EQ(EditDistance("", "abc"), 3u);
  EXPECT_EQ(EditDistance("abc", ""), 3u);
  EXPECT_EQ(EditDistance("SerchRadius", "SearchRadius"), 1u);
  EXPECT_EQ(EditDistance("kitten", "sitting"), 3u);
  EXPECT_EQ(EditDistance("ab", "ba"), 2u);
}

TEST(Text, NumbersAreWrittenInTheirShortestForm) {
  for (const char* text : {"0",
                           "-0",
                           "6",
                           "-12",
                           "0.1",
                           "100000",
                           "6200000",
                           "999999999",
                           "1e9",
                           "-1e-35",
                           "1e-5",
                           "1.5e10",
                           "1e100",
                           "1e-110",
                           "0.3333333333333333",
                           "5e-324",
                           "1.7976931348623157e308",
                           "inf",
                           "-inf",
                           "nan"})
    EXPECT_EQ(ShortestNumber(std::strtod(text, nullptr)), text);
  EXPECT_EQ(ShortestNumber(-std::numeric_limits<double>::quiet_NaN()), "nan");
  // A float in its own precision.
  for (const char* text : {"0.1", "-1e-35", "16777216", "1e9", "3.4028235e38"})
    EXPECT_EQ(ShortestNumber(std::strtof(text, nullptr)), text);
}

}  // namespace
}  // namespace tervane::text_test
