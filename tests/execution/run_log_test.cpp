// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "execution/run_log.h"

#include <filesystem>
#include <fstream>

#include <fmt/format.h>
#include <gtest/gtest.h>

#include "tests/support/temp_folder.h"

namespace tervane::run_log_test {
namespace {

std::string Lines(const LogPiece& piece) {
  std::string text;
  for (std::size_t i = 0; i < piece.Count(); ++i) text += fmt::format("[{}]", piece.Line(i));
  return text;
}

TEST(RunLog, LinesAreTheSameInWhateverPiecesTheyCome) {
  const std::string bytes = "one\n\ntwo\r\nthree\rfour\r\r\nfive \xff\n\nsix";
  const std::string expected = "[one][][two][three][four][][five \xff][][six]";
  for (std::size_t size = 1; size <= bytes.size(); ++size) {
    LineCutter cutter;
    LogPiece all;
    for (std::size_t i = 0; i < bytes.size(); i += size) all.Add(cutter.Cut(std::string_view(bytes).substr(i, size)));
    all.Add(cutter.Rest());
    EXPECT_EQ(Lines(all), expected) << size;
  }
}

TEST(RunLog, OfALineWithoutEndTheBeginningIsKept) {
  LineCutter cutter;
  for (int i = 0; i < 1000; ++i) EXPECT_EQ(cutter.Cut(std::string(1000, 'x')).Count(), 0u);
  const LogPiece lines = cutter.Cut("\nnext\n");
  ASSERT_EQ(lines.Count(), 2u);
  EXPECT_EQ(lines.Line(0), std::string(LineCutter::kLongestLine, 'x') + "…");
  EXPECT_EQ(lines.Line(1), "next");
}

TEST(RunLog, TheTailKeepsTheLastLinesUnderTheirNumbers) {
  LogTail tail;
  constexpr std::size_t kAll = 350'000;
  // Some come directly, the last ones in a tail that has lost its own beginning.
  LogTail last;
  LogPiece piece;
  for (std::size_t i = 0; i < kAll; ++i) {
    piece.Append(std::to_string(i));
    piece.EndLine();
    if (piece.Count() == i % 7 * 700 + 1) (i < 150'000 ? tail : last).Add(std::exchange(piece, {}));
  }
  last.Add(std::move(piece));
  ASSERT_GT(last.Dropped(), 0u);
  tail.Add(std::move(last));
  EXPECT_GE(tail.Count(), LogTail::kMostLines);
  EXPECT_LT(tail.Count(), 2 * LogTail::kMostLines);
  EXPECT_EQ(tail.Dropped() + tail.Count(), kAll);
  for (const std::size_t i : {std::size_t{0}, std::size_t{1}, tail.Count() / 2, tail.Count() - 1})
    EXPECT_EQ(tail.Line(i), std::to_string(tail.Dropped() + i));
}

TEST(RunLog, AFileThatBeginsAnewIsReadFromItsBeginning) {
  const test::TempFolder folder;
  LogReader reader(folder.File("run.log"));
  EXPECT_EQ(reader.Read(100), "");
  folder.Write("run.log", "first");
  EXPECT_EQ(reader.Read(3), "fir");
  EXPECT_EQ(reader.Read(100), "st");
  EXPECT_EQ(reader.Read(100), "");
  std::ofstream(folder.File("run.log"), std::ios::app) << " more";
  EXPECT_EQ(reader.Read(100), " more");
  folder.Write("run.log", "short");
  EXPECT_EQ(reader.Read(100), "short");
  folder.Write("other.log", "a longer text in another file");
  std::filesystem::rename(folder.File("other.log"), folder.File("run.log"));
  EXPECT_EQ(reader.Read(100), "a longer text in another file");
}

}  // namespace
}  // namespace tervane::run_log_test
