// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/setup_lock.h"

#include <filesystem>
#include <optional>
#include <thread>
#include <vector>

#include <fmt/format.h>
#include <gmock/gmock.h>
#include <unistd.h>

#include "platform/files.h"
#include "platform/os.h"
#include "tests/support/temp_folder.h"

namespace tervane::setup_lock_test {
namespace {

namespace fs = std::filesystem;
using test::ReadFile;
using test::TempFolder;
using testing::AllOf;
using testing::HasSubstr;
using Outcome = SetupLock::Outcome;

class Lock : public testing::Test {
 public:
  TempFolder folder;
  std::string setup = folder.File("a.tvd");
  std::string file = folder.File(".a.tvd.lock");

  std::string Content(const std::string& host, std::uint32_t process, const std::string& started) const {
    return ProcessLines({"anna", host, process, started});
  }
};

TEST_F(Lock, IsTakenOnceAndGivenBack) {
  std::optional<SetupLock> first(std::in_place);
  SetupLock second;
  ASSERT_EQ(first->Take(setup), Outcome::Taken);
  EXPECT_THAT(ReadFile(file),
              AllOf(HasSubstr("host: " + os::HostName() + "\n"), HasSubstr(fmt::format("process: {}\n", getpid()))));
  EXPECT_EQ(second.Take(setup), Outcome::Held);
  EXPECT_THAT(second.Reason(), HasSubstr("another window"));
  EXPECT_FALSE(second.IsTaken());
  first.reset();
  EXPECT_FALSE(FileExists(file));
  EXPECT_EQ(second.Take(setup), Outcome::Taken);
  // Nothing but the lock: what it was made of is gone.
  EXPECT_EQ(std::distance(fs::directory_iterator(folder.Path()), {}), 1);
}

TEST_F(Lock, IsOneForAllNamesOfAFile) {
  folder.Write("b/a.tvd", "");
  fs::create_symlink(folder.File("b/a.tvd"), folder.File("link.tvd"));
  fs::create_directory_symlink(folder.File("b"), folder.File("c"));
  const std::string longName(250, 'n');
  SetupLock lock, longLock, other;
  ASSERT_EQ(lock.Take(folder.File("link.tvd")), Outcome::Taken);
  ASSERT_EQ(longLock.Take(folder.File(longName)), Outcome::Taken) << longLock.Reason();
  for (const std::string& name :
       {std::string("b/a.tvd"), std::string("c/a.tvd"), std::string("b/../link.tvd"), longName}) {
    EXPECT_TRUE(HolderOf(folder.File(name))) << name;
    EXPECT_EQ(other.Take(folder.File(name)), Outcome::Held) << name;
  }
  EXPECT_FALSE(HolderOf(folder.File("a.tvd")));
}

TEST_F(Lock, IsTakenOverWhenItsProcessRunsNoMoreAndFromNobodyElse) {
  std::uint32_t dead = 0;
  for (dead = 4'000'000; os::IsProcessAlive(dead);) ++dead;
  const std::string here = os::HostName();
  const auto parent = static_cast<std::uint32_t>(getppid());
  struct Case {
    std::string content;
    Outcome outcome;
    std::string reason;
  };
  const Case cases[] = {
      {Content(here, dead, "1"), Outcome::Taken, ""},
      {Content(here, parent, "an earlier start"), Outcome::Taken, ""},
      {Content(here, parent, os::ProcessStartTime(parent)), Outcome::Held,
       fmt::format("anna has it open on host {} (process {})", here, parent)},
      {Content(here, parent, ""), Outcome::Held, "anna has it open"},
      {Content("gauss.x", dead, "1"), Outcome::Held,
       "on host gauss.x (process " + std::to_string(dead) + "); remove " + file},
      {"", Outcome::Taken, ""},
      {std::string("\0\xFF\x01", 3), Outcome::Held, file + " cannot be understood"},
      {"my notes\n", Outcome::Held, file + " cannot be understood"},
      {"host: " + here + "\nprocess: -1\n", Outcome::Held, file + " cannot be understood"},
      {"host: " + here + "\nprocess: 99999999999\n", Outcome::Held, file + " cannot be understood"},
      {Content(here, dead, "1") + std::string(100'000, 'x'), Outcome::Held, file + " cannot be understood"},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.content.substr(0, 200));
    folder.Write(".a.tvd.lock", c.content);
    SetupLock lock;
    EXPECT_EQ(HolderOf(setup).has_value(), c.outcome == Outcome::Held);
    EXPECT_EQ(lock.Take(setup), c.outcome);
    EXPECT_THAT(lock.Reason(), HasSubstr(c.reason));
    EXPECT_EQ(ReadFile(file) == c.content, c.outcome == Outcome::Held);
  }
  fs::remove(file);
  fs::create_directory(file);
  EXPECT_EQ(SetupLock().Take(setup), Outcome::Held);
}

TEST_F(Lock, OfNobodyIsTakenOverByOneAlone) {
  for (int round = 0; round < 30; ++round) {
    folder.Write(".a.tvd.lock", Content(os::HostName(), static_cast<std::uint32_t>(getpid()), "an earlier start"));
    std::vector<SetupLock> locks(6);
    std::vector<std::thread> editors;
    for (SetupLock& lock : locks) editors.emplace_back([&] { lock.Take(setup); });
    for (std::thread& editor : editors) editor.join();
    EXPECT_EQ(std::count_if(locks.begin(), locks.end(), [](const SetupLock& lock) { return lock.IsTaken(); }), 1);
  }
}

TEST_F(Lock, RemovedByHandItBelongsToWhoTakesItNext) {
  SetupLock first, second;
  ASSERT_EQ(first.Take(setup), Outcome::Taken);
  fs::remove(file);
  ASSERT_EQ(second.Take(setup), Outcome::Taken);
  first.Release();
  EXPECT_TRUE(HolderOf(setup));
}

TEST_F(Lock, OfOneChangeIsWaitedFor) {
  SetupLock first, second, third;
  ASSERT_EQ(first.Take(setup, SetupLock::Purpose::OneChange), Outcome::Taken);
  EXPECT_TRUE(HolderOf(setup)->isForOneChange);
  std::thread change([&] {
    std::this_thread::sleep_for(std::chrono::milliseconds(50));
    first.Release();
  });
  EXPECT_EQ(second.Take(setup), Outcome::Taken) << second.Reason();
  change.join();
  EXPECT_EQ(third.Take(setup, SetupLock::Purpose::OneChange), Outcome::Held);  // An editor is not.
}

TEST_F(Lock, IsNotLookedForBehindALink) {
  const std::string elsewhere = folder.Write("elsewhere", "");
  fs::create_symlink(elsewhere, file);
  SetupLock lock;
  EXPECT_EQ(lock.Take(setup), Outcome::Held);
  EXPECT_THAT(lock.Reason(), HasSubstr(".a.tvd.lock cannot be understood"));
  EXPECT_TRUE(fs::is_symlink(file));
}

TEST_F(Lock, TellsWhyItCannotBeWritten) {
  folder.Write("file", "");
  for (const char* name : {"missing/a.tvd", "file/a.tvd"}) {
    SetupLock lock;
    EXPECT_EQ(lock.Take(folder.File(name)), Outcome::CannotWrite);
    EXPECT_THAT(lock.Reason(), HasSubstr(".a.tvd.lock cannot be written: "));
    EXPECT_FALSE(HolderOf(folder.File(name)));
  }
}

}  // namespace
}  // namespace tervane::setup_lock_test
