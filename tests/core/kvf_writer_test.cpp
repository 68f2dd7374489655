// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/kvf_writer.h"

#include <bit>
#include <clocale>
#include <cmath>
#include <iostream>
#include <locale>
#include <random>

#include <gmock/gmock.h>

#include "tests/core/parsed.h"

namespace tervane::kvf_writer_test {
namespace {

using test::Parsed;
using testing::HasSubstr;

TEST(KvfWriter, EveryNumberComesBackToTheSameBits) {
  std::mt19937_64 random(20260101);
  const Parsed built;
  kvfAddTarget(built.File(), "T");
  std::vector<double> doubles;
  std::vector<float> floats;
  kvfAddKeyword(built.File(), "doubles");
  for (int i = 0; i < 10'000; ++i) {
    const std::uint64_t bits = random();
    // A third with few bits, as people enter them.
    const double number = i % 3 ? std::bit_cast<double>(bits) : static_cast<double>(bits >> 50) / 100;
    if (!std::isnan(number) && kvfAddDouble(built.File(), number)) doubles.push_back(number);
  }
  kvfAddKeyword(built.File(), "floats");
  for (int i = 0; i < 10'000; ++i) {
    const auto bits = static_cast<std::uint32_t>(random());
    const auto number = std::bit_cast<float>(i % 3 ? bits : bits & 0x807F'FFFF);  // A third denormal.
    if (!std::isnan(number) && kvfAddFloat(built.File(), number)) floats.push_back(number);
  }
  const Parsed read(built.Written());
  ASSERT_EQ(read.Message(), "");
  const KvfNode* ofDoubles = kvfKeywordByNameNum(read.Target(), "doubles", 1);
  const KvfNode* ofFloats = kvfKeywordByNameNum(read.Target(), "floats", 1);
  ASSERT_TRUE(ofDoubles->count == doubles.size() && ofFloats->count == floats.size() && floats.size() > 9000);
  const auto bits64 = [](double number) { return std::bit_cast<std::uint64_t>(number); };
  const auto bits32 = [](float number) { return std::bit_cast<std::uint32_t>(number); };
  for (std::size_t i = 0; i < doubles.size(); ++i)
    ASSERT_EQ(bits64(kvfGetDouble(&ofDoubles->params[i])), bits64(doubles[i])) << i;
  for (std::size_t i = 0; i < floats.size(); ++i)
    ASSERT_EQ(bits32(kvfGetFloat(&ofFloats->params[i])), bits32(floats[i])) << i;
}

TEST(KvfWriter, TextsOfEveryLengthLeaveTheirNeighboursAlone) {
  // Around the sizes of the memory's pieces, odd ones too, each with a node behind it.
  for (const std::size_t size : {0, 1, 4095, 4096, 65'535, 100'000, 100'001, 1'048'577}) {
    const Parsed built;
    kvfAddTarget(built.File(), "T");
    const std::string title(size, 'x');
    kvfPutParam(built.File(), "Title", title);
    kvfPutParam(built.File(), "Behind", 7);
    EXPECT_EQ(built.Written(), "target T {\n  Title = \"" + title + "\"\n  Behind = 7\n}\n") << size;
  }
}

TEST(KvfWriter, TheLocaleOfTheProcessHasNoSay) {
  struct CommaPunctuation : std::numpunct<char> {
    char do_decimal_point() const override { return ','; }
    char do_thousands_sep() const override { return '.'; }
    std::string do_grouping() const override { return "\3"; }
  };
  const std::string text = "target T {\n  a = 1234567, 1234.5, 0.25f\n}\n";
  const std::locale before = std::locale::global(std::locale(std::locale(), new CommaPunctuation));
  EXPECT_EQ(Parsed(text).Written(), text);
  std::locale::global(before);
  const char* comma = nullptr;
  for (const char* name : {"de_DE.UTF-8", "de_DE.utf8", "fr_FR.UTF-8", "fr_FR.utf8", "de_DE"})
    if (!comma) comma = std::setlocale(LC_ALL, name);
  if (!comma) std::cout << "skipped: needs a locale with a decimal comma\n";
  EXPECT_EQ(Parsed(text).Written(), text);
  std::setlocale(LC_ALL, "C");
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

}  // namespace
}  // namespace tervane::kvf_writer_test
