// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/text_pieces.h"

#include <gmock/gmock.h>

#include "tests/support/temp_folder.h"

namespace tervane::text_pieces_test {
namespace {

std::string ReadAll(TextPieces& pieces, std::size_t bytes) {
  std::string text;
  while (!pieces.IsAtEnd()) text += pieces.Next(bytes);
  return text;
}

TEST(TextPieces, GiveTheSameTextWhateverTheirSize) {
  const std::string longLine(TextPieces::kLongestLine + 5, 'x');
  const struct {
    std::string bytes, text;
  } cases[] = {
      {"", ""},
      {"one\r\ntwo\n", "one\r\ntwo\n"},
      {"\xc3\xa6\xe2\x82\xac\xf0\x9f\x8c\x8a", "\xc3\xa6\xe2\x82\xac\xf0\x9f\x8c\x8a"},
      {"K\xf8"
       "benhavn \xc3\xa6",
       "K\xc3\xb8"
       "benhavn \xc3\xa6"},                      // Latin-1 beside UTF-8
      {"cut \xe2\x82", "cut \xc3\xa2\xc2\x82"},  // half a character at the end
      {"\xff\xfe"
       "bad\xed\xa0\x80",
       "\xc3\xbf\xc3\xbe"
       "bad\xc3\xad\xc2\xa0\xc2\x80"},  // none of these is UTF-8
      {longLine, longLine.substr(5) + "\nxxxxx"},
  };
  const test::TempFolder folder;
  for (const auto& c : cases) {
    const std::string path = folder.Write("log.txt", c.bytes);
    for (const std::size_t size : {std::size_t{1}, std::size_t{2}, std::size_t{3}, std::size_t{1 << 20}}) {
      TextPieces pieces;
      ASSERT_EQ(pieces.Open(path), "");
      EXPECT_EQ(ReadAll(pieces, size), c.text) << size;
      EXPECT_EQ(pieces.Error(), "");
      EXPECT_EQ(pieces.Place(), c.bytes.size());
      EXPECT_EQ(pieces.Size(), c.bytes.size());
    }
  }
}

TEST(TextPieces, WhatIsNoFileIsRefusedAndSaid) {
  const test::TempFolder folder;
  TextPieces pieces;
  for (const std::string& path : {folder.Path(), folder.File("nowhere")}) {
    EXPECT_THAT(pieces.Open(path), testing::HasSubstr("cannot read " + path));
    EXPECT_TRUE(pieces.IsAtEnd());
    EXPECT_EQ(pieces.Next(10), "");
  }
}

}  // namespace
}  // namespace tervane::text_pieces_test
