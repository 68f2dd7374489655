// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/files.h"

#include <algorithm>
#include <atomic>
#include <csignal>
#include <filesystem>
#include <fstream>
#include <functional>
#include <iostream>
#include <system_error>
#include <thread>
#include <vector>

#include <gmock/gmock.h>
#include <grp.h>
#include <sched.h>
#include <sys/mount.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>

#include "platform/os.h"
#include "tests/support/temp_folder.h"

namespace tervane::files_test {
namespace {

namespace fs = std::filesystem;
using test::ReadFile;
using test::TempFolder;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

void ReportSkipped(const std::string& what) { std::cout << "skipped: needs " << what << '\n'; }

unsigned PermissionsOf(const std::string& path) {
  return static_cast<unsigned>(fs::symlink_status(path).permissions()) & 07777u;
}
void SetPermissions(const std::string& path, unsigned permissions) {
  fs::permissions(path, static_cast<fs::perms>(permissions));
}

void ExpectError(const FileResult& result, const std::string& path, const std::string& reason) {
  EXPECT_THAT(result.error, testing::AllOf(HasSubstr(path), HasSubstr(reason)));
}

/// Expects the same in a child, for what would spoil this process: limits, users, mounts.
void InChild(const std::function<void()>& expect) {
  EXPECT_EXIT((expect(), std::cout.flush(), _exit(testing::Test::HasFailure())), testing::ExitedWithCode(0), "");
}

/// As a user for whom permissions count: root ignores them.
void AsOrdinaryUser(const std::function<void()>& expect) {
  InChild([&] {
    constexpr unsigned kNobody = 65534;
    if (geteuid() == 0 && (setgroups(0, nullptr) != 0 || setgid(kNobody) != 0 || setuid(kNobody) != 0))
      return ReportSkipped("a user for whom permissions count");
    umask(022);
    expect();
  });
}

class Files : public testing::Test {
 public:
  TempFolder folder;
  std::string path = folder.File("x.tvd");

  /// Names in the folder, sorted; a forgotten temporary file shows here.
  std::vector<std::string> Names(const std::string& below = ".") const {
    std::vector<std::string> names;
    for (const fs::directory_entry& entry : fs::directory_iterator(folder.File(below)))
      names.push_back(entry.path().filename());
    std::sort(names.begin(), names.end());
    return names;
  }
  static void ExpectWrites(const std::string& path, const std::string& content) {
    EXPECT_EQ(WriteFileAtomically(path, content).error, "");
    EXPECT_EQ(ReadFile(path), content);
  }
};

TEST_F(Files, WrittenBytesAreReadBack) {
  for (const std::string& content : {std::string("first\n"), std::string(3'000'000, 'x'), std::string(),
                                     std::string("\0\r\n\xFF", 4), std::string("last")}) {
    const FileResult result = WriteFileAtomically(path, content);
    EXPECT_EQ(result.error + result.note, "");
    FileContent read;
    EXPECT_EQ(ReadWholeFile(path, read).error, "");
    EXPECT_EQ(read.Text(), content);
    EXPECT_THAT(Names(), ElementsAre("x.tvd"));
  }
}

TEST_F(Files, NamesOfEveryLengthAndScriptAreWrittenAlsoToTheWorkingFolder) {
  std::string umlauts = "x";
  for (int i = 0; i < 127; ++i) umlauts += "ö";
  for (const std::string& name : {std::string(255, 'n'), umlauts, std::string("  x y.tvd"), std::string("ä\n")})
    for (const char* content : {"old", "new"}) ExpectWrites(folder.File(name), content);
  InChild([&] {
    ASSERT_EQ(chdir(folder.Path().c_str()), 0);
    ExpectWrites("x.tvd", "new");
  });
  EXPECT_EQ(ReadFile(path), "new");
  EXPECT_EQ(Names().size(), 5u);
}

TEST_F(Files, PermissionsOfAnOldFileAreKeptAndANewOneGetsThoseOfTheMask) {
  const mode_t mask = umask(027);
  ExpectWrites(path, "new");
  umask(mask);
  EXPECT_EQ(PermissionsOf(path), 0640u);
  for (const unsigned permissions : {0600u, 0640u, 0664u, 0777u}) {
    SetPermissions(path, permissions);
    ExpectWrites(path, std::to_string(permissions));
    EXPECT_EQ(PermissionsOf(path), permissions);
  }
}

TEST_F(Files, OwnerGroupAndExtendedAttributesOfAnOldFileAreKept) {
  folder.Write("x.tvd", "old");
  const bool hasAttribute = setxattr(path.c_str(), "user.origin", "survey", 6, 0) == 0;
  const bool isGiven = chown(path.c_str(), 1234, 4321) == 0;
  SetPermissions(path, 0660);
  EXPECT_EQ(WriteFileAtomically(path, "new").note, "");
  if (!hasAttribute) ReportSkipped("extended attributes");
  if (!isGiven) ReportSkipped("the right to give files away");
  char value[16] = {};
  EXPECT_EQ(getxattr(path.c_str(), "user.origin", value, sizeof value), hasAttribute ? 6 : -1);
  EXPECT_STREQ(value, hasAttribute ? "survey" : "");
  struct stat info {};
  ASSERT_EQ(stat(path.c_str(), &info), 0);
  EXPECT_EQ(info.st_uid, isGiven ? 1234u : geteuid());
  EXPECT_EQ(info.st_gid, isGiven ? 4321u : getegid());
  EXPECT_EQ(info.st_mode & 07777u, 0660u);
}

TEST_F(Files, WhoMayNotGiveAFileAwayIsToldSoAndNobodyElseGetsAccess) {
  if (geteuid() != 0) return ReportSkipped("root, to make a file of another user");
  folder.Write("x.tvd", "old");
  // Others may read and write, the group may do so too and execute: the new group must not get that.
  SetPermissions(path, 0776);
  SetPermissions(folder.Path(), 0777);
  AsOrdinaryUser([&] { EXPECT_THAT(WriteFileAtomically(path, "new").note, HasSubstr("owner, group")); });
  EXPECT_EQ(ReadFile(path), "new");
  EXPECT_EQ(PermissionsOf(path), 0766u);
}

TEST_F(Files, ASymbolicLinkStaysAndItsTargetIsReplacedOrMade) {
  const std::string target = folder.Write("real/x.tvd", "old");
  fs::create_symlink("real/x.tvd", folder.File("relative"));
  fs::create_symlink(target, folder.File("absolute"));
  fs::create_symlink("relative", folder.File("chain"));
  fs::create_directory_symlink("real", folder.File("linked"));
  for (const char* name : {"relative", "absolute", "chain", "linked/x.tvd", "linked/../chain"}) {
    ExpectWrites(folder.File(name), name);
    EXPECT_EQ(ReadFile(target), name);
    EXPECT_THAT(Names("real"), ElementsAre("x.tvd"));
  }
  EXPECT_THAT(Names(), ElementsAre("absolute", "chain", "linked", "real", "relative"));
  EXPECT_TRUE(fs::is_symlink(folder.File("relative")));
  EXPECT_EQ(fs::read_symlink(folder.File("chain")), "relative");
  fs::remove(target);
  ExpectWrites(folder.File("chain"), "new");
  EXPECT_EQ(ReadFile(target), "new");
  EXPECT_TRUE(fs::is_symlink(folder.File("relative")));
  // Other hard links keep the old content, and the note says so.
  fs::create_hard_link(target, folder.File("hard"));
  EXPECT_THAT(WriteFileAtomically(target, "newer").note, HasSubstr("hard link"));
  EXPECT_EQ(ReadFile(folder.File("hard")), "new");
}

TEST_F(Files, WhatIsNoRegularFileIsRefusedAtOnce) {
  fs::create_directory(folder.File("folder"));
  ASSERT_EQ(mkfifo(folder.File("fifo").c_str(), 0600), 0);
  fs::create_symlink("b", folder.File("a"));
  fs::create_symlink("a", folder.File("b"));
  fs::create_symlink("folder", folder.File("link to folder"));
  folder.Write("file", "old");
  const std::vector<std::string> before = Names();
  struct Case {
    std::string path;
    const char* whyNotWritten;
    const char* whyNotRead = nullptr;  ///< The same where it is not given.
  };
  const Case cases[] = {{folder.File("folder"), "is a folder"},
                        {folder.File("folder/"), "is a folder"},
                        {folder.File("link to folder"), "is a folder"},
                        {folder.File("fifo"), "not a regular file"},
                        {"/dev/null", "not a regular file"},
                        {folder.File("a"), "lead in a circle"},
                        {folder.File("file/x"), "a part of the path is a file"},
                        {folder.File("missing/x"), "/missing does not exist", "it does not exist"},
                        {folder.File("missing/"), "the name of the file is missing", "it does not exist"},
                        {folder.File(std::string(256, 'n')), "the name is too long"},
                        {folder.File("file") + std::string("\0x", 2), "zero character"},
                        {"", "the name is empty"}};
  for (const Case& c : cases) {
    FileContent content;
    ExpectError(WriteFileAtomically(c.path, "new"), "cannot write " + c.path + ": ", c.whyNotWritten);
    ExpectError(ReadWholeFile(c.path, content), "cannot read " + c.path + ": ",
                c.whyNotRead ? c.whyNotRead : c.whyNotWritten);
    EXPECT_EQ(content.size, 0u);
  }
  EXPECT_EQ(Names(), before);
  EXPECT_THAT(Names("folder"), IsEmpty());
}

TEST_F(Files, PermissionsAreRespectedAndTheFileStays) {
  struct Case {
    unsigned ofFolder, ofFile;
    const char *whyNotWritten, *whyNotRead;  ///< Empty where it may be done.
  };
  const Case cases[] = {{0555, 0666, "no permission to create", ""},
                        {0777, 0444, "write-protected", ""},
                        {0777, 0000, "", "permission denied"}};
  for (const Case& c : cases) {
    const std::string file = folder.Write("data/x.tvd", "old");
    SetPermissions(file, c.ofFile);
    SetPermissions(folder.File("data"), c.ofFolder);
    AsOrdinaryUser([&] {
      FileContent content;
      if (*c.whyNotWritten) ExpectError(WriteFileAtomically(file, "new"), file, c.whyNotWritten);
      if (*c.whyNotRead) ExpectError(ReadWholeFile(file, content), file, c.whyNotRead);
    });
    SetPermissions(folder.File("data"), 0777);
    SetPermissions(file, 0666);
    EXPECT_EQ(ReadFile(file), "old");
    EXPECT_THAT(Names("data"), ElementsAre("x.tvd"));
  }
}

TEST_F(Files, AFullDiskLeavesTheOldFile) {
  InChild([&] {
    // A file system of 64 KB of its own, which vanishes with the child.
    if (unshare(CLONE_NEWNS) != 0 || mount("none", "/", nullptr, MS_REC | MS_PRIVATE, nullptr) != 0 ||
        mount("tmpfs", folder.Path().c_str(), "tmpfs", 0, "size=64k") != 0)
      return ReportSkipped("the right to mount a file system");
    std::string saved;
    FileResult result;
    for (std::string next(1000, 'a'); result.Ok() && next.size() < 100'000; next.append(1000, 'b'))
      if (result = WriteFileAtomically(path, next); result.Ok()) saved = next;
    ExpectError(result, path, "no space left");
    const std::string large(1'000'000, 'n');
    ExpectError(WriteFileAtomically(path, large), path, "no space left");
    ExpectError(WriteFileAtomically(folder.File("new"), large), "new", "no space left");
    ExpectError(CopyToNewFile("/proc/self/exe", folder.File("copy")), "copy", "no space left");
    EXPECT_EQ(ReadFile(path), saved);
    EXPECT_THAT(Names(), ElementsAre("x.tvd"));
    ExpectWrites(path, "short again");
  });
}

TEST_F(Files, ALimitOnTheSizeOfFilesIsAnErrorAndWhatAKilledProcessLeftIsRemovedByTheNextWrite) {
  folder.Write("x.tvd", "old");
  const auto writeLimited = [&](bool isKilled) {
    os::PrepareProcess();
    const rlimit limit{4096, 4096}, noCore{0, 0};
    ASSERT_EQ(setrlimit(RLIMIT_FSIZE, &limit) | setrlimit(RLIMIT_CORE, &noCore), 0);
    if (isKilled) signal(SIGXFSZ, SIG_DFL);  // In the middle of its write.
    ExpectError(WriteFileAtomically(path, std::string(100'000, 'n')), path, "limit on the size of files");
  };
  InChild([&] { writeLimited(false); });
  EXPECT_THAT(Names(), ElementsAre("x.tvd"));
  EXPECT_EXIT(writeLimited(true), testing::KilledBySignal(SIGXFSZ), "");
  EXPECT_EQ(ReadFile(path), "old");
  ASSERT_EQ(Names().size(), 2u);

  folder.Write(".x.tvd.mine.tmp", "a file of the user");
  ExpectWrites(folder.File("y.tvd"), "another file");
  EXPECT_EQ(Names().size(), 4u);
  ExpectWrites(path, "new");
  EXPECT_THAT(Names(), ElementsAre(".x.tvd.mine.tmp", "x.tvd", "y.tvd"));
}

TEST_F(Files, WritesAtTheSameTimeNeverShowAHalfFile) {
  const std::string contents[] = {std::string(50'000, 'a'), std::string(90'000, 'b')};
  ExpectWrites(path, contents[0]);
  std::atomic<int> failures{0};
  std::vector<std::thread> writers;
  for (const std::string& content : contents) {
    writers.emplace_back([&] {
      for (int i = 0; i < 30; ++i) failures += WriteFileAtomically(path, content).Ok() ? 0 : 1;
    });
  }
  for (int i = 0; i < 300; ++i) {
    FileContent read;
    EXPECT_EQ(ReadWholeFile(path, read).error, "");
    EXPECT_TRUE(read.Text() == contents[0] || read.Text() == contents[1]) << read.size;
  }
  for (std::thread& writer : writers) writer.join();
  EXPECT_EQ(failures, 0);
  EXPECT_THAT(Names(), ElementsAre("x.tvd"));
}

TEST_F(Files, AFileThatGrowsWhileItIsReadIsTakenAsItStoodAtSomeMoment) {
  std::atomic<bool> isDone{false};
  std::thread writer([&] {
    for (std::ofstream log(path); !isDone;) log << "line...." << std::flush;
  });
  for (std::size_t i = 0, last = 0; i < 200;) {
    FileContent read;
    if (!ReadWholeFile(path, read).Ok() && i == 0) continue;  // Not there yet.
    EXPECT_TRUE(read.size >= last && read.size % 8 == 0) << read.size;
    last = read.size;
    ++i;
  }
  isDone = true;
  writer.join();
}

TEST_F(Files, ACopyGoesOnlyToANewNameAndKeepsPermissions) {
  folder.Write("x.tvd", "content");
  SetPermissions(path, 0600);
  const std::string to = folder.File("x.v10.tvd");
  EXPECT_EQ(CopyToNewFile(path, to).error, "");
  EXPECT_EQ(ReadFile(to), "content");
  EXPECT_EQ(PermissionsOf(to), 0600u);

  const std::string taken = folder.Write("taken", "precious");
  fs::create_symlink("nothing", folder.File("link"));
  for (const std::string& name : {taken, folder.File("link"), folder.Path(), path})
    EXPECT_THAT(CopyToNewFile(path, name).error, HasSubstr("exists already"));
  EXPECT_THAT(CopyToNewFile(folder.File("missing"), folder.File("y")).error, HasSubstr("does not exist"));
  EXPECT_THAT(CopyToNewFile(path, folder.File("missing/y")).error, HasSubstr("/missing does not exist"));
  std::error_code error;
  os::RenameToNew(path, taken, error);
  EXPECT_EQ(error, std::errc::file_exists);
  EXPECT_EQ(ReadFile(taken), "precious");
  EXPECT_THAT(Names(), ElementsAre("link", "taken", "x.tvd", "x.v10.tvd"));
}

TEST_F(Files, EverythingAtAPathExistsAndLinksLeadToTheSameFile) {
  folder.Write("x.tvd", "");
  fs::create_symlink("x.tvd", folder.File("link"));
  fs::create_symlink("nothing", folder.File("broken"));
  for (const char* name : {"x.tvd", ".", "link", "broken"}) EXPECT_TRUE(FileExists(folder.File(name))) << name;
  for (const char* name : {"nothing", "x.tvd/y"}) EXPECT_FALSE(FileExists(folder.File(name))) << name;
  for (const char* name : {"link", "./x.tvd"}) EXPECT_TRUE(IsSameFile(path, folder.File(name))) << name;
  folder.Write("y", "");
  for (const char* name : {"y", "broken"}) EXPECT_FALSE(IsSameFile(path, folder.File(name))) << name;
}

TEST(Process, KnowsItselfAndItsMemory) {
  EXPECT_TRUE(os::IsProcessAlive(os::ProcessId()));
  EXPECT_FALSE(os::IsProcessAlive(0) || os::IsProcessAlive(0xFFFFFFFFu));
  EXPECT_GT(os::ResidentMemory(), 100'000u);
  EXPECT_GE(os::PeakResidentMemory(), os::ResidentMemory() / 2);
}

}  // namespace
}  // namespace tervane::files_test
