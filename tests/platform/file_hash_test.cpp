// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/file_hash.h"

#include <gmock/gmock.h>

#include "tests/support/temp_folder.h"

namespace tervane::file_hash_test {
namespace {

TEST(FileHash, IsThatOfTheUsualTools) {
  const test::TempFolder folder;
  // As xxhsum 0.8 prints them.
  const std::pair<std::string, const char*> cases[] = {
      {"", "99aa06d3014798d86001c324468d497f"},
      {"a", "a96faf705af16834e6c632b61e964e1f"},
      {std::string(3'000'000, 'x'), "1f895bac9b72598405afde2f9995314a"},
  };
  for (const auto& [text, expected] : cases) {
    std::string hash;
    EXPECT_EQ(HashFile(folder.Write("a.bin", text), hash).error, "");
    EXPECT_EQ(hash, expected);
  }
}

TEST(FileHash, WhatCannotBeReadIsTold) {
  const test::TempFolder folder;
  std::string hash;
  EXPECT_THAT(HashFile(folder.File("none"), hash).error, testing::HasSubstr("it does not exist"));
  EXPECT_THAT(HashFile(folder.Path(), hash).error, testing::HasSubstr("folder"));
  Progress progress;
  progress.Cancel();
  EXPECT_EQ(HashFile(folder.Write("a.bin", "a"), hash, progress).error, "cancelled");
  EXPECT_EQ(hash, "");
}

}  // namespace
}  // namespace tervane::file_hash_test
