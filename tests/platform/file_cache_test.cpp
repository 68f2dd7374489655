// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/file_cache.h"

#include <filesystem>

#include <gtest/gtest.h>

#include "tests/support/temp_folder.h"

namespace tervane::file_cache_test {
namespace {

using std::chrono::seconds;

class FileCaches : public testing::Test {
 protected:
  /// Writes a file that is `age` seconds old.
  void Write(const std::string& name, const std::string& text, int age) {
    folder_.Write(name, text);
    std::filesystem::last_write_time(folder_.File(name), std::filesystem::file_time_type::clock::now() - seconds(age));
  }
  /// The number of readings that the answer cost.
  int Ask(const std::string& name, const std::string& question = "size") {
    const int before = readings_;
    const auto answer = cache_.Get(folder_.File(name), question, [&] {
      ++readings_;
      return test::ReadFile(folder_.File(name));
    });
    EXPECT_EQ(*answer, test::ReadFile(folder_.File(name)));
    return readings_ - before;
  }

  test::TempFolder folder_;
  FileCache<std::string> cache_{2};
  int readings_ = 0;
};

TEST_F(FileCaches, ReadAgainOnlyWhatChanged) {
  Write("a", "one", 60);
  EXPECT_EQ(Ask("a"), 1);
  EXPECT_EQ(Ask("a"), 0);
  EXPECT_EQ(Ask("a", "other question"), 1);
  EXPECT_EQ(Ask("a"), 0);
  Write("a", "two", 30);
  EXPECT_EQ(Ask("a"), 1) << "another time";
  Write("a", "three", 30);
  EXPECT_EQ(Ask("a"), 1) << "another size";
  EXPECT_EQ(Ask("a"), 0);
}

TEST_F(FileCaches, DoNotTrustAFileThatWasJustWritten) {
  Write("a", "one", 0);
  EXPECT_EQ(Ask("a"), 1);
  Write("a", "two", 0);
  EXPECT_EQ(Ask("a"), 1);
}

TEST_F(FileCaches, ForgetWhatNobodyAskedForLongest) {
  for (const char* name : {"a", "b", "c"}) Write(name, name, 60);
  EXPECT_EQ(Ask("a") + Ask("b"), 2);
  EXPECT_EQ(Ask("a"), 0);
  EXPECT_EQ(Ask("c"), 1);
  EXPECT_EQ(Ask("a"), 0);
  EXPECT_EQ(Ask("b"), 1);
}

}  // namespace
}  // namespace tervane::file_cache_test
