// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/file_search.h"

#include <atomic>
#include <filesystem>
#include <thread>

#include <gmock/gmock.h>

#include "tests/support/temp_folder.h"

namespace tervane::file_search_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;

TEST(FileSearch, FindsFilesBelowInAnyCaseButNotBehindLinks) {
  const test::TempFolder folder, elsewhere;
  for (const char* name : {"a.nds0", "deep/er/A.nds0", "deep/b.nds0"}) folder.Write(name, "");
  elsewhere.Write("a.nds0", "");
  std::filesystem::create_directory_symlink(elsewhere.File(""), folder.File("link"));
  std::filesystem::create_directories(folder.File("b.nds0"));
  FilesByName files;
  ASSERT_EQ(files.Search(folder.File("."), {"a.nds0", "B.nds0", "none"}).error, "");
  EXPECT_THAT(files.Of("a.nds0"), ElementsAre(folder.File("./a.nds0")));
  EXPECT_THAT(files.Of("B.nds0"), ElementsAre(folder.File("./deep/b.nds0")));
  EXPECT_TRUE(files.Of("none").empty());
  EXPECT_THAT(files.Search(folder.File("gone"), {"a.nds0"}).error, HasSubstr("gone"));
  Progress progress;
  progress.Cancel();
  EXPECT_THAT(files.Search(folder.File("."), {"a.nds0"}, progress).error, HasSubstr(kCancelled));
}

TEST(FileSearch, FoldersThatVanishMeanwhileHideNoFile) {
  const test::TempFolder folder;
  constexpr std::size_t kFolders = 20;
  for (std::size_t i = 0; i < kFolders; ++i) folder.Write("keep" + std::to_string(i) + "/a.nds0", "");
  std::atomic<bool> isDone = false;
  std::thread others([&] {
    while (!isDone)
      for (int i = 0; i < 20; ++i) {
        const std::string name = folder.File("gone" + std::to_string(i));
        std::filesystem::create_directories(name + "/x/y");
        std::filesystem::remove_all(name);
      }
  });
  for (int i = 0; i < 200; ++i) {
    FilesByName files;
    EXPECT_EQ(files.Search(folder.File("."), {"a.nds0"}).error, "");
    EXPECT_EQ(files.Of("a.nds0").size(), kFolders);
  }
  isDone = true;
  others.join();
}

}  // namespace
}  // namespace tervane::file_search_test
