// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/kvf_writer.h"

#include <bit>
#include <clocale>
#include <cmath>
#include <iostream>
#include <limits>
#include <locale>
#include <random>

#include <gmock/gmock.h>

#include "tests/core/parsed.h"

namespace tervane {
namespace {

using test::Parsed;
using testing::HasSubstr;

template <class Number>
using Limits = std::numeric_limits<Number>;

/// A target T with whatever `fill` adds, written; the text must come back unchanged from its own tree.
template <class Fill>
std::string Written(const Fill& fill) {
  const Parsed built;
  kvfAddTarget(built.File(), "T");
  fill(built.File());
  const std::string text = built.Written();
  const Parsed read(text);
  EXPECT_EQ(read.Message(), "") << text;
  EXPECT_EQ(read.Written(), text);
  return text;
}

TEST(KvfWriter, EveryTypeIsWrittenInItsForm) {
  const std::string text = Written([](KvfFile* file) {
    const auto add = [&](const char* key, auto operation, auto... values) {
      EXPECT_TRUE(kvfAddKeyword(file, key));
      EXPECT_TRUE((operation(file, values) && ...));
    };
    EXPECT_TRUE(kvfAddKeyword(file, "none"));
    add("int", kvfAddInt, 0, -12, Limits<int>::max(), Limits<int>::min());
    add("float", kvfAddFloat, 6.0f, 0.1f, -0.0f, 1e9f, Limits<float>::denorm_min(), -Limits<float>::max(),
        Limits<float>::infinity(), -Limits<float>::infinity(), Limits<float>::quiet_NaN());
    add("double", kvfAddDouble, 2.0, 0.1, -0.0, 123456789.0, 1e9, 9007199254740992.0, Limits<double>::denorm_min(),
        Limits<double>::min(), Limits<double>::max(), -Limits<double>::infinity(), Limits<double>::quiet_NaN());
    add("bool", kvfAddBool, true, false);
    add("string", kvfAddString, "", "a \"b\"\\", "\n\r\t\x01\x7F", "ä€\U0001F30A", "# = {");
    add("file", kvfAddFilename, "", "maps/x.nds2", "C:\\x");
    add("mixed", kvfAddInt, 0);
    EXPECT_TRUE(kvfAddFilename(file, "x"));
  });
  EXPECT_EQ(text, R"(target T {
  none =
  int = 0, -12, 2147483647, -2147483648
  float = 6f, 0.1f, -0f, 1e9f, 1e-45f, -3.4028235e38f, inff, -inff, nanf
  double = 2.0, 0.1, -0.0, 123456789.0, 1e9, 9007199254740992.0, 5e-324, 2.2250738585072014e-308, 1.7976931348623157e308, -inf, nan
  bool = true, false
  string = "", "a \"b\"\\", "\n\r\t\u{1}\u{7f}", "ä€)"
                  "\U0001F30A"
                  R"(", "# = {"
  file = file "", file "maps/x.nds2", file "C:\\x"
  mixed = 0, file "x"
}
)");
}

TEST(KvfWriter, NodesStandInTheOrderInWhichTheyWereAddedUnderTheirNames) {
  const std::string text = Written([](KvfFile* file) {
    for (const char* key : {"b", "a", "b", "section", "%x", "1x", " padded  ", "a b", "\xC3\xA4", "q\"\t"}) {
      kvfPutParam(file, key, 1);
      kvfAddSection(file, key);
      kvfEndSection(file);
    }
    kvfEndSection(file);
    kvfAddTarget(file, "T");
  });
  std::string expected = "target T {\n";
  for (const char* name :
       {"b", "a", "b", "section", "\"%x\"", "\"1x\"", "\" padded  \"", "\"a b\"", "\"\xC3\xA4\"", "\"q\\\"\\t\""})
    expected += std::string("  ") + name + " = 1\n  section " + name + " {\n  }\n";
  EXPECT_EQ(text, expected + "}\ntarget T {\n}\n");
}

TEST(KvfWriter, EveryNumberComesBackToTheSameBits) {
  std::mt19937_64 random(20260101);
  const Parsed built;
  kvfAddTarget(built.File(), "T");
  std::vector<std::uint64_t> doubles;
  std::vector<std::uint32_t> floats;
  kvfAddKeyword(built.File(), "doubles");
  while (doubles.size() < 10'000) {
    const std::uint64_t bits = random();
    if (std::isnan(std::bit_cast<double>(bits))) continue;
    // A third with few bits, as people enter them.
    doubles.push_back(doubles.size() % 3 == 0 ? std::bit_cast<std::uint64_t>(static_cast<double>(bits >> 50) / 100)
                                              : bits);
    kvfAddDouble(built.File(), std::bit_cast<double>(doubles.back()));
  }
  kvfAddKeyword(built.File(), "floats");
  while (floats.size() < 10'000) {
    const auto bits = static_cast<std::uint32_t>(random());
    if (std::isnan(std::bit_cast<float>(bits))) continue;
    floats.push_back(floats.size() % 3 == 0 ? bits & 0x807F'FFFF : bits);  // a third of them denormal
    kvfAddFloat(built.File(), std::bit_cast<float>(floats.back()));
  }
  const Parsed read(built.Written());
  ASSERT_EQ(read.Message(), "");
  const KvfNode* readDoubles = kvfKeywordByNameNum(read.Target(), "doubles", 1);
  const KvfNode* readFloats = kvfKeywordByNameNum(read.Target(), "floats", 1);
  for (std::size_t i = 0; i < doubles.size(); ++i) {
    ASSERT_EQ(std::bit_cast<std::uint64_t>(kvfGetDouble(&readDoubles->params[i])), doubles[i]) << i;
    ASSERT_EQ(std::bit_cast<std::uint32_t>(kvfGetFloat(&readFloats->params[i])), floats[i]) << i;
  }
}

struct CommaPunctuation : std::numpunct<char> {
  char do_decimal_point() const override { return ','; }
  char do_thousands_sep() const override { return '.'; }
  std::string do_grouping() const override { return "\3"; }
};

TEST(KvfWriter, TheLocaleOfTheProcessHasNoSay) {
  const std::string text = "target T {\n  a = 1234567, 1234.5, 0.25f\n}\n";
  const std::locale before = std::locale::global(std::locale(std::locale(), new CommaPunctuation));
  EXPECT_EQ(Parsed(text).Written(), text);
  std::locale::global(before);

  const std::string cBefore = std::setlocale(LC_ALL, nullptr);
  const char* comma = nullptr;
  for (const char* name : {"de_DE.UTF-8", "de_DE.utf8", "fr_FR.UTF-8", "fr_FR.utf8", "de_DE"})
    if (!comma) comma = std::setlocale(LC_ALL, name);
  if (!comma) std::cout << "skipped: needs a locale with a decimal comma\n";
  EXPECT_EQ(Parsed(text).Written(), text);
  std::setlocale(LC_ALL, cBefore.c_str());
}

TEST(KvfWriter, WhatCouldNotBeReadAgainIsNotWritten) {
  using Fill = void (*)(KvfFile*);
  constexpr std::pair<Fill, const char*> cases[] = {
      {[](KvfFile* file) { kvfPutParam(file, "Title", "\xE4"); }, "Title in S is no UTF-8 text"},
      {[](KvfFile* file) { kvfPutParam(file, "Title", std::string_view("a\0b", 3)); }, "Title in S holds a NUL"},
      {[](KvfFile* file) { kvfPutParamFilename(file, "Name", "a\xFF"); }, "Name in S is no UTF-8 text"},
      {[](KvfFile* file) { kvfPutParam(file, "\xC3", 1); }, "a name in S is no UTF-8 text"},
      {[](KvfFile* file) { kvfAddSection(file, std::string_view("a\0", 2)); }, "a name in S holds a NUL"},
      {[](KvfFile* file) {
         for (int i = 0; i < 199; ++i) kvfAddSection(file, "D");
       },
       "D is nested deeper than 200"},
  };
  for (const auto& [fill, reason] : cases) {
    const Parsed built;
    kvfAddTarget(built.File(), "T");
    kvfAddSection(built.File(), "S");
    fill(built.File());
    EXPECT_THAT(built.Written(), HasSubstr(reason));
  }
}

TEST(KvfWriter, ValuesForPeopleHaveNoQuotesAndNoSigns) {
  const Parsed parsed("target T {\nk = 6f, 2.0, 1, true, \"a \\\"b\\\"\", file \"x\"\nempty =\n}");
  const KvfNode* keyword = kvfKeywordByNum(parsed.Target(), 1);
  EXPECT_EQ(PlainValuesText(*keyword), "6, 2, 1, true, a \"b\", x");
  EXPECT_EQ(KvfValuesText(*keyword), R"(6f, 2.0, 1, true, "a \"b\"", file "x")");
  EXPECT_EQ(KvfValuesText(*kvfKeywordByNum(parsed.Target(), 2)), "");
}

}  // namespace
}  // namespace tervane
