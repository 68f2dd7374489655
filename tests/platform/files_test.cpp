// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/files.h"

#include <algorithm>
#include <atomic>
#include <csignal>
#include <filesystem>
#include <functional>
#include <iostream>
#include <system_error>
#include <thread>
#include <vector>

#include <fcntl.h>
#include <gmock/gmock.h>
#include <grp.h>
#include <sched.h>
#include <sys/mount.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <sys/xattr.h>
#include <unistd.h>

#include "platform/os.h"
#include "tests/support/temp_folder.h"

namespace tervane {
namespace {

namespace fs = std::filesystem;
using test::ReadFile;
using test::TempFolder;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

constexpr const char* kSkipped = "skipped: needs ";

void TellSkipped(const std::string& what) { std::cout << kSkipped << what << '\n'; }

/// Names in a folder, sorted; a forgotten temporary file shows here.
std::vector<std::string> NamesIn(const std::string& folder) {
  std::vector<std::string> names;
  for (const fs::directory_entry& entry : fs::directory_iterator(folder)) names.push_back(entry.path().filename());
  std::sort(names.begin(), names.end());
  return names;
}

unsigned PermissionsOf(const std::string& path) {
  return static_cast<unsigned>(fs::symlink_status(path).permissions()) & 07777u;
}

/// Runs what would spoil this process (limits, users, mounts) in a child. The answer is empty when all went as
/// expected, else it tells what did not.
std::string InChild(const std::function<std::string()>& run) {
  int ends[2];
  if (pipe(ends) != 0) return "no pipe";
  std::cout.flush();
  const pid_t child = fork();
  if (child == 0) {
    const std::string answer = run();
    const ssize_t written = write(ends[1], answer.data(), answer.size());
    _exit(written == static_cast<ssize_t>(answer.size()) ? 0 : 1);
  }
  close(ends[1]);
  std::string answer;
  char buffer[4096];
  for (ssize_t size; (size = read(ends[0], buffer, sizeof buffer)) > 0;) {
    answer.append(buffer, static_cast<std::size_t>(size));
  }
  close(ends[0]);
  int status = 0;
  waitpid(child, &status, 0);
  if (status != 0) answer += " child ended with status " + std::to_string(status);
  return answer;
}

void ExpectInChild(const std::function<std::string()>& run) {
  const std::string answer = InChild(run);
  if (answer.starts_with(kSkipped)) {
    std::cout << answer << '\n';
  } else {
    EXPECT_EQ(answer, "");
  }
}

/// As a user for whom permissions count: root ignores them.
void ExpectAsOrdinaryUser(const std::function<std::string()>& run) {
  ExpectInChild([&]() -> std::string {
    constexpr unsigned kNobody = 65534;
    if (geteuid() == 0 && (setgroups(0, nullptr) != 0 || setgid(kNobody) != 0 || setuid(kNobody) != 0)) {
      return std::string(kSkipped) + "a user for whom permissions count";
    }
    umask(022);
    return run();
  });
}

/// Empty when the operation failed with both texts in its message, else what it said.
std::string ExpectedError(const FileResult& result, const std::string& path, const std::string& reason) {
  const bool isExpected =
      result.error.find(path) != std::string::npos && result.error.find(reason) != std::string::npos;
  return isExpected ? "" : "said '" + result.error + "' instead of '" + reason + "' ";
}

TEST(Files, WrittenBytesAreReadBack) {
  const TempFolder folder;
  const std::string path = folder.File("x.tvd");
  for (const std::string& content : {std::string("first\n"), std::string(3'000'000, 'x'), std::string(),
                                     std::string("\0\r\n\xFF", 4), std::string("last")}) {
    const FileResult result = WriteFileAtomically(path, content);
    EXPECT_EQ(result.error, "");
    EXPECT_EQ(result.note, "");
    FileContent read;
    EXPECT_EQ(ReadWholeFile(path, read).error, "");
    EXPECT_EQ(read.Text(), content);
    EXPECT_THAT(NamesIn(folder.Path()), ElementsAre("x.tvd"));
  }
}

TEST(Files, ABareNameIsWrittenToTheWorkingFolder) {
  const TempFolder folder;
  ExpectInChild([&]() -> std::string {
    if (chdir(folder.Path().c_str()) != 0) return "no folder";
    return WriteFileAtomically("x.tvd", "new").error;
  });
  EXPECT_EQ(ReadFile(folder.File("x.tvd")), "new");
}

TEST(Files, NamesOfEveryLengthAndScriptAreWritten) {
  const TempFolder folder;
  std::string umlauts;
  for (int i = 0; i < 127; ++i) umlauts += "ö";
  for (const std::string& name : {std::string(255, 'n'), "x" + umlauts, std::string("  x y.tvd"), std::string("ä\n")}) {
    const std::string path = folder.File(name);
    EXPECT_EQ(WriteFileAtomically(path, "old").error, "");
    EXPECT_EQ(WriteFileAtomically(path, "new").error, "");
    EXPECT_EQ(ReadFile(path), "new");
  }
  EXPECT_EQ(NamesIn(folder.Path()).size(), 4u);
}

TEST(Files, ANewFileGetsThePermissionsThatTheMaskAllows) {
  const TempFolder folder;
  const std::string path = folder.File("x.tvd");
  const mode_t old = umask(027);
  const FileResult result = WriteFileAtomically(path, "new");
  umask(old);
  EXPECT_EQ(result.error, "");
  EXPECT_EQ(PermissionsOf(path), 0640u);
}

TEST(Files, PermissionsOfAnOldFileAreKept) {
  for (const unsigned permissions : {0600u, 0640u, 0664u, 0777u}) {
    const TempFolder folder;
    const std::string path = folder.Write("x.tvd", "old");
    fs::permissions(path, static_cast<fs::perms>(permissions));
    EXPECT_EQ(WriteFileAtomically(path, "new").error, "");
    EXPECT_EQ(PermissionsOf(path), permissions);
    EXPECT_EQ(ReadFile(path), "new");
  }
}

TEST(Files, OwnerAndGroupOfAnOldFileAreKept) {
  const TempFolder folder;
  const std::string path = folder.Write("x.tvd", "old");
  if (chown(path.c_str(), 1234, 4321) != 0) return TellSkipped("the right to give files away");
  fs::permissions(path, static_cast<fs::perms>(0660));
  EXPECT_EQ(WriteFileAtomically(path, "new").note, "");
  struct stat info {};
  ASSERT_EQ(stat(path.c_str(), &info), 0);
  EXPECT_EQ(info.st_uid, 1234u);
  EXPECT_EQ(info.st_gid, 4321u);
  EXPECT_EQ(info.st_mode & 07777u, 0660u);
}

TEST(Files, WhoMayNotGiveAFileAwayIsToldSoAndNobodyElseGetsAccess) {
  const TempFolder folder;
  if (geteuid() != 0) return TellSkipped("root, to make a file of another user");
  const std::string path = folder.Write("x.tvd", "old");
  // Others may read and write, the group may do so too and execute: the new group must not get that.
  fs::permissions(path, static_cast<fs::perms>(0776));
  fs::permissions(folder.Path(), fs::perms::all);
  ExpectAsOrdinaryUser([&] {
    const FileResult result = WriteFileAtomically(path, "new");
    return result.note.find("owner, group") != std::string::npos ? "" : result.error + " note: " + result.note;
  });
  EXPECT_EQ(ReadFile(path), "new");
  EXPECT_EQ(PermissionsOf(path), 0766u);
}

TEST(Files, ExtendedAttributesOfAnOldFileAreKept) {
  const TempFolder folder;
  const std::string path = folder.Write("x.tvd", "old");
  if (setxattr(path.c_str(), "user.origin", "survey", 6, 0) != 0) return TellSkipped("extended attributes");
  EXPECT_EQ(WriteFileAtomically(path, "new").note, "");
  char value[16] = {};
  EXPECT_EQ(getxattr(path.c_str(), "user.origin", value, sizeof value), 6);
  EXPECT_STREQ(value, "survey");
}

TEST(Files, ASymbolicLinkStaysAndItsTargetIsReplaced) {
  const TempFolder folder;
  const std::string target = folder.Write("real/x.tvd", "old");
  fs::create_symlink("real/x.tvd", folder.File("relative"));
  fs::create_symlink(target, folder.File("absolute"));
  fs::create_symlink("relative", folder.File("chain"));
  fs::create_directory_symlink("real", folder.File("linked"));
  for (const char* name : {"relative", "absolute", "chain", "linked/x.tvd", "linked/../chain"}) {
    EXPECT_EQ(WriteFileAtomically(folder.File(name), name).error, "");
    EXPECT_EQ(ReadFile(target), name);
    EXPECT_THAT(NamesIn(folder.File("real")), ElementsAre("x.tvd"));
  }
  EXPECT_THAT(NamesIn(folder.Path()), ElementsAre("absolute", "chain", "linked", "real", "relative"));
  EXPECT_TRUE(fs::is_symlink(folder.File("relative")));
  EXPECT_EQ(fs::read_symlink(folder.File("chain")), "relative");
}

TEST(Files, ALinkToNothingCreatesItsTarget) {
  const TempFolder folder;
  fs::create_symlink("x.tvd", folder.File("link"));
  EXPECT_EQ(WriteFileAtomically(folder.File("link"), "new").error, "");
  EXPECT_EQ(ReadFile(folder.File("x.tvd")), "new");
  EXPECT_TRUE(fs::is_symlink(folder.File("link")));
}

TEST(Files, WhatIsNoRegularFileIsRefusedAtOnce) {
  const TempFolder folder;
  fs::create_directory(folder.File("folder"));
  ASSERT_EQ(mkfifo(folder.File("fifo").c_str(), 0600), 0);
  fs::create_symlink("b", folder.File("a"));
  fs::create_symlink("a", folder.File("b"));
  fs::create_symlink("folder", folder.File("link to folder"));
  folder.Write("file", "old");
  const std::vector<std::string> before = NamesIn(folder.Path());
  struct Case {
    std::string path;
    const char* whyNotWritten;
    const char* whyNotRead;
  };
  const Case cases[] = {
      {folder.File("folder"), "is a folder", "is a folder"},
      {folder.File("folder/"), "is a folder", "is a folder"},
      {folder.File("link to folder"), "is a folder", "is a folder"},
      {folder.File("fifo"), "not a regular file", "not a regular file"},
      {"/dev/null", "not a regular file", "not a regular file"},
      {folder.File("a"), "lead in a circle", "lead in a circle"},
      {folder.File("file/x"), "a part of the path is a file", "a part of the path is a file"},
      {folder.File("missing/x"), "/missing does not exist", "it does not exist"},
      {folder.File("missing/"), "the name of the file is missing", "it does not exist"},
      {folder.File(std::string(256, 'n')), "the name is too long", "the name is too long"},
      {folder.File("file") + std::string("\0x", 2), "zero character", "zero character"},
      {"", "the name is empty", "the name is empty"},
  };
  for (const Case& c : cases) {
    const FileResult written = WriteFileAtomically(c.path, "new");
    EXPECT_THAT(written.error, HasSubstr("cannot write " + c.path + ": "));
    EXPECT_THAT(written.error, HasSubstr(c.whyNotWritten));
    FileContent content;
    const FileResult read = ReadWholeFile(c.path, content);
    EXPECT_THAT(read.error, HasSubstr("cannot read " + c.path + ": "));
    EXPECT_THAT(read.error, HasSubstr(c.whyNotRead));
    EXPECT_EQ(content.size, 0u);
  }
  EXPECT_EQ(NamesIn(folder.Path()), before);
  EXPECT_THAT(NamesIn(folder.File("folder")), IsEmpty());
}

TEST(Files, OtherHardLinksKeepTheOldContentAndTheNoteSaysSo) {
  const TempFolder folder;
  const std::string path = folder.Write("x.tvd", "old");
  fs::create_hard_link(path, folder.File("other"));
  const FileResult result = WriteFileAtomically(path, "new");
  EXPECT_EQ(result.error, "");
  EXPECT_THAT(result.note, HasSubstr("hard link"));
  EXPECT_EQ(ReadFile(path), "new");
  EXPECT_EQ(ReadFile(folder.File("other")), "old");
}

TEST(Files, AFileInAReadOnlyFolderStays) {
  const TempFolder folder;
  const std::string path = folder.Write("data/x.tvd", "old");
  fs::permissions(path, static_cast<fs::perms>(0666));
  fs::permissions(folder.File("data"), static_cast<fs::perms>(0555));
  ExpectAsOrdinaryUser(
      [&] { return ExpectedError(WriteFileAtomically(path, "new"), path, "no permission to create"); });
  fs::permissions(folder.File("data"), fs::perms::owner_all);
  EXPECT_EQ(ReadFile(path), "old");
}

TEST(Files, AWriteProtectedFileIsRespected) {
  const TempFolder folder;
  const std::string path = folder.Write("x.tvd", "old");
  fs::permissions(path, static_cast<fs::perms>(0444));
  fs::permissions(folder.Path(), fs::perms::all);
  ExpectAsOrdinaryUser([&] { return ExpectedError(WriteFileAtomically(path, "new"), path, "write-protected"); });
  EXPECT_EQ(ReadFile(path), "old");
  EXPECT_THAT(NamesIn(folder.Path()), ElementsAre("x.tvd"));
}

TEST(Files, AFileThatTheUserMayNotReadIsToldSo) {
  const TempFolder folder;
  const std::string path = folder.Write("x.tvd", "old");
  fs::permissions(path, fs::perms::none);
  ExpectAsOrdinaryUser([&] {
    FileContent content;
    return ExpectedError(ReadWholeFile(path, content), path, "permission denied");
  });
}

/// Runs with a file system of 64 KB of its own at the folder, which vanishes with the child.
void ExpectOnSmallDisk(const std::string& folder, const std::function<std::string()>& run) {
  ExpectInChild([&]() -> std::string {
    const bool isMounted = unshare(CLONE_NEWNS) == 0 &&
                           mount("none", "/", nullptr, MS_REC | MS_PRIVATE, nullptr) == 0 &&
                           mount("tmpfs", folder.c_str(), "tmpfs", 0, "size=64k") == 0;
    return isMounted ? run() : std::string(kSkipped) + "the right to mount a file system";
  });
}

TEST(Files, OneLargeWriteToAFullDiskLeavesTheOldFile) {
  const TempFolder folder;
  const std::string path = folder.File("x.tvd");
  ExpectOnSmallDisk(folder.Path(), [&] {
    const std::string old(16'000, 'o');
    std::string failure = WriteFileAtomically(path, old).error;
    failure += ExpectedError(WriteFileAtomically(path, std::string(1'000'000, 'n')), path, "no space left");
    failure +=
        ExpectedError(WriteFileAtomically(folder.File("new"), std::string(1'000'000, 'n')), "new", "no space left");
    failure += ExpectedError(CopyToNewFile("/proc/self/exe", folder.File("copy")), "copy", "no space left");
    if (ReadFile(path) != old) failure += " the old file changed";
    if (NamesIn(folder.Path()) != std::vector<std::string>{"x.tvd"}) failure += " something is left";
    return failure;
  });
}

TEST(Files, RepeatedSavesOfAGrowingFileEndInAnErrorThatLosesNothing) {
  const TempFolder folder;
  const std::string path = folder.File("x.tvd");
  ExpectOnSmallDisk(folder.Path(), [&]() -> std::string {
    std::string saved;
    FileResult result;
    for (std::string next(1000, 'a'); next.size() < 100'000; next.append(1000, 'b')) {
      result = WriteFileAtomically(path, next);
      if (!result.Ok()) break;
      saved = next;
    }
    std::string failure = ExpectedError(result, path, "no space left");
    if (saved.empty() || ReadFile(path) != saved) failure += " the last saved content is lost";
    if (NamesIn(folder.Path()) != std::vector<std::string>{"x.tvd"}) failure += " something is left";
    return failure + WriteFileAtomically(path, "short again").error;
  });
}

TEST(Files, ALimitOnTheSizeOfFilesIsAnErrorAndLeavesTheOldFile) {
  const TempFolder folder;
  const std::string path = folder.Write("x.tvd", "old");
  ExpectInChild([&]() -> std::string {
    os::PrepareProcess();
    const rlimit limit{4096, 4096};
    if (setrlimit(RLIMIT_FSIZE, &limit) != 0) return "no limit";
    return ExpectedError(WriteFileAtomically(path, std::string(100'000, 'n')), path, "limit on the size of files");
  });
  EXPECT_EQ(ReadFile(path), "old");
  EXPECT_THAT(NamesIn(folder.Path()), ElementsAre("x.tvd"));
}

TEST(Files, WhatAKilledProcessLeftIsRemovedByTheNextWriteOfTheSameFile) {
  const TempFolder folder;
  const std::string path = folder.Write("x.tvd", "old");
  // The signal of a size limit kills the child in the middle of its write.
  const std::string answer = InChild([&]() -> std::string {
    const rlimit limit{4096, 4096};
    setrlimit(RLIMIT_FSIZE, &limit);
    const rlimit noCore{0, 0};
    setrlimit(RLIMIT_CORE, &noCore);
    signal(SIGXFSZ, SIG_DFL);
    return WriteFileAtomically(path, std::string(100'000, 'n')).error;
  });
  EXPECT_THAT(answer, HasSubstr("child ended"));
  EXPECT_EQ(ReadFile(path), "old");
  ASSERT_EQ(NamesIn(folder.Path()).size(), 2u);

  folder.Write(".x.tvd.mine.tmp", "a file of the user");
  EXPECT_EQ(WriteFileAtomically(folder.File("y.tvd"), "another file").error, "");
  EXPECT_EQ(NamesIn(folder.Path()).size(), 4u);
  EXPECT_EQ(WriteFileAtomically(path, "new").error, "");
  EXPECT_THAT(NamesIn(folder.Path()), ElementsAre(".x.tvd.mine.tmp", "x.tvd", "y.tvd"));
}

TEST(Files, WritesAtTheSameTimeNeverShowAHalfFile) {
  const TempFolder folder;
  const std::string path = folder.File("x.tvd");
  const std::string contents[] = {std::string(50'000, 'a'), std::string(90'000, 'b')};
  ASSERT_EQ(WriteFileAtomically(path, contents[0]).error, "");
  std::atomic<int> failures{0};
  std::vector<std::thread> writers;
  for (const std::string& content : contents) {
    writers.emplace_back([&] {
      for (int i = 0; i < 30; ++i) failures += WriteFileAtomically(path, content).Ok() ? 0 : 1;
    });
  }
  for (int i = 0; i < 300; ++i) {
    FileContent read;
    ASSERT_EQ(ReadWholeFile(path, read).error, "");
    ASSERT_TRUE(read.Text() == contents[0] || read.Text() == contents[1]) << read.size;
  }
  for (std::thread& writer : writers) writer.join();
  EXPECT_EQ(failures, 0);
  EXPECT_THAT(NamesIn(folder.Path()), ElementsAre("x.tvd"));
}

TEST(Files, AFileThatGrowsWhileItIsReadIsTakenAsItStoodAtSomeMoment) {
  const TempFolder folder;
  const std::string path = folder.Write("log", "");
  std::atomic<bool> isDone{false};
  std::thread writer([&] {
    const int log = open(path.c_str(), O_WRONLY | O_APPEND);
    while (!isDone && write(log, "line....", 8) == 8) continue;
    close(log);
  });
  std::size_t last = 0;
  for (int i = 0; i < 200; ++i) {
    FileContent read;
    EXPECT_EQ(ReadWholeFile(path, read).error, "");
    EXPECT_GE(read.size, last);
    EXPECT_EQ(read.size % 8, 0u);
    last = read.size;
  }
  isDone = true;
  writer.join();
}

TEST(Files, ACopyGoesOnlyToANewNameAndKeepsPermissions) {
  const TempFolder folder;
  const std::string from = folder.Write("x.tvd", "content");
  fs::permissions(from, static_cast<fs::perms>(0600));
  const std::string to = folder.File("x.v10.tvd");
  EXPECT_EQ(CopyToNewFile(from, to).error, "");
  EXPECT_EQ(ReadFile(to), "content");
  EXPECT_EQ(PermissionsOf(to), 0600u);

  const std::string taken = folder.Write("taken", "precious");
  fs::create_symlink("nothing", folder.File("link"));
  for (const std::string& name : {taken, folder.File("link"), folder.Path(), from}) {
    EXPECT_THAT(CopyToNewFile(from, name).error, HasSubstr("exists already"));
  }
  EXPECT_THAT(CopyToNewFile(folder.File("missing"), folder.File("y")).error, HasSubstr("does not exist"));
  EXPECT_THAT(CopyToNewFile(from, folder.File("missing/y")).error, HasSubstr("/missing does not exist"));
  EXPECT_EQ(ReadFile(taken), "precious");
  EXPECT_THAT(NamesIn(folder.Path()), ElementsAre("link", "taken", "x.tvd", "x.v10.tvd"));
}

TEST(Files, RenamingToATakenNameFails) {
  const TempFolder folder;
  const std::string from = folder.Write("from", "new");
  const std::string to = folder.Write("to", "old");
  std::error_code error;
  os::RenameToNew(from, to, error);
  EXPECT_EQ(error, std::errc::file_exists);
  EXPECT_EQ(ReadFile(to), "old");
}

TEST(Files, EverythingAtAPathExistsAndLinksLeadToTheSameFile) {
  const TempFolder folder;
  const std::string path = folder.Write("x", "");
  fs::create_symlink("x", folder.File("link"));
  fs::create_symlink("nothing", folder.File("broken"));
  EXPECT_TRUE(FileExists(path));
  EXPECT_TRUE(FileExists(folder.Path()));
  EXPECT_TRUE(FileExists(folder.File("broken")));
  EXPECT_FALSE(FileExists(folder.File("nothing")));
  EXPECT_FALSE(FileExists(folder.File("x/y")));
  EXPECT_TRUE(IsSameFile(path, folder.File("link")));
  EXPECT_TRUE(IsSameFile(path, folder.Path() + "/./x"));
  EXPECT_FALSE(IsSameFile(path, folder.Write("y", "")));
  EXPECT_FALSE(IsSameFile(path, folder.File("broken")));
}

TEST(Files, TheProcessKnowsItselfAndItsMemory) {
  EXPECT_TRUE(os::IsProcessAlive(os::ProcessId()));
  EXPECT_FALSE(os::IsProcessAlive(0));
  EXPECT_FALSE(os::IsProcessAlive(0xFFFFFFFFu));
  EXPECT_GT(os::ResidentMemory(), 100'000u);
  EXPECT_GE(os::PeakResidentMemory(), os::ResidentMemory() / 2);
}

}  // namespace
}  // namespace tervane
