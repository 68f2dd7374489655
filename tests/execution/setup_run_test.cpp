// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "execution/setup_run.h"

#include <chrono>
#include <csignal>
#include <filesystem>
#include <functional>
#include <thread>

#include <gmock/gmock.h>
#include <sys/resource.h>
#include <sys/stat.h>

#include "execution/run_follower.h"
#include "platform/files.h"
#include "tests/support/engine_script.h"
#include "tests/support/temp_folder.h"

namespace tervane::setup_run_test {
namespace {

using namespace std::chrono_literals;
using test::ReadFile;
using testing::AllOf;
using testing::HasSubstr;
using testing::MatchesRegex;

bool Soon(const std::function<bool()>& condition) {
  const auto end = std::chrono::steady_clock::now() + 20s;
  while (!condition()) {
    if (std::chrono::steady_clock::now() > end) return false;
    std::this_thread::sleep_for(5ms);
  }
  return true;
}

class Running : public testing::Test {
 protected:
  Running() { folder.Write("basin/karup.tvd", "a setup"); }
  ~Running() override {
    for (const std::uint32_t child : Children()) EXPECT_FALSE(os::IsProcessAlive(child)) << "left running: " << child;
  }

  RunRequest Request(const std::string& engine, const std::string& options = "") const {
    return {folder.File("basin/karup.tvd"), folder.File("basin/results"), engine, options, "", ""};
  }
  SetupRun Started(const RunRequest& request) {
    SetupRun run;
    std::string problem;
    EXPECT_TRUE(run.Start(request, problem)) << problem;
    return run;
  }
  SetupRun Started(const std::string& commands) {
    return Started(Request(test::WriteEngine(folder, "Engine", commands)));
  }
  std::string Ended(SetupRun& run) {
    EXPECT_TRUE(Soon([&] { return !run.Look(); }));
    return OutcomeSentence(run.State());
  }
  /// What the scripts have started and told with `echo $! >>children`.
  std::vector<std::uint32_t> Children() const {
    std::vector<std::uint32_t> children;
    if (!FileExists(folder.File("basin/children"))) return children;
    std::istringstream numbers(ReadFile(folder.File("basin/children")));
    for (std::uint32_t child = 0; numbers >> child;) children.push_back(child);
    return children;
  }
  bool HasBegun(const char* file = "basin/begun") const {
    return Soon([&] { return FileExists(folder.File(file)); });
  }

  test::TempFolder folder;
};

TEST_F(Running, TheEngineGetsSetupAndOptionsInTheSetupsFolderAndItsWordsAreKept) {
  const std::string engine =
      test::WriteEngine(folder, "my engines/Engine", "echo \"$#: $1 $2 $3\"; pwd; echo oops >&2");
  SetupRun run = Started(Request(engine, "/Engine  1"));
  EXPECT_THAT(Ended(run), MatchesRegex("The run is done after 0\\.[0-9] s\\."));
  EXPECT_EQ(ReadFile(run.Files().log),
            "3: " + folder.File("basin/karup.tvd") + " /Engine 1\n" + folder.File("basin") + "\noops\n");
  EXPECT_EQ(run.Files().log, folder.File("basin/results/karup_Run.log"));
}

TEST_F(Running, HowTheEngineEndedIsToldInWords) {
  struct Case {
    const char *commands, *sentence;
    RunOutcome outcome;
  };
  for (const Case& c : {
           Case{"echo report >report", "The run is done after .*", RunOutcome::Done},
           Case{"true", "The engine ended after .*exit status 0.*not written its report .*report\\.",
                RunOutcome::Failed},
           Case{"echo report >report; exit 3", "The engine failed after .* exit status 3\\..*", RunOutcome::Failed},
           Case{"kill -SEGV $$", "The engine crashed after .*: segmentation fault \\(signal 11\\).*",
                RunOutcome::Failed},
           Case{"ulimit -f 1; cat /dev/zero >big", "The engine crashed .*file size limit.*|.*exit status 1.*",
                RunOutcome::Failed},
       }) {
    RunRequest request = Request(test::WriteEngine(folder, "Engine", c.commands));
    request.report = folder.File("basin/report");
    SetupRun run = Started(request);
    EXPECT_THAT(Ended(run), testing::ContainsRegex(c.sentence)) << c.commands;
    EXPECT_EQ(run.Outcome(), c.outcome) << c.commands;
  }
}

TEST_F(Running, AnEngineThatCannotBeStartedTellsWhy) {
  std::string foreign = ReadFile(os::ProgramPath()).substr(0, 4096);
  foreign[18] = foreign[18] == '\xB7' ? '\x3E' : '\xB7';
  const std::pair<std::string, const char*> cases[] = {
      {foreign, "another processor"},
      {std::string("MZ") + std::string(100, '\0'), "program for Windows"},
      {"echo hello\n", "#!/bin/sh"},
      {"", "the file is empty"},
      {"#!/no/such/program\n", "its first line"},
  };
  for (const auto& [bytes, why] : cases) {
    SetupRun run = Started(Request(test::WriteProgram(folder, "Engine", bytes)));
    EXPECT_THAT(Ended(run), AllOf(HasSubstr(folder.File("Engine") + " cannot be started: "), HasSubstr(why)));
    EXPECT_EQ(run.Outcome(), RunOutcome::NotStarted);
  }
}

TEST_F(Running, AStopReachesAllThatTheEngineHasStarted) {
  SetupRun run = Started(
      "sleep 1000 & echo $! >>children; setsid sleep 1000 & echo $! >>children\n"
      "(trap '' TERM; sleep 1000 & echo $! >>children; touch begun; wait) & echo $! >>children; wait");
  ASSERT_TRUE(HasBegun());
  EXPECT_EQ(run.Stop(), "");
  EXPECT_THAT(Ended(run), HasSubstr("The run was stopped after"));
  EXPECT_EQ(Children().size(), 4u);
}

TEST_F(Running, AnEngineThatDoesNotListenIsEndedByForce) {
  SetupRun run = Started("trap '' TERM; touch begun; while :; do sleep 0.05; done");
  ASSERT_TRUE(HasBegun());
  EXPECT_TRUE(run.Look());
  run.Stop();
  std::this_thread::sleep_for(200ms);
  EXPECT_TRUE(run.Look());
  run.Stop();  // at once
  const auto begin = std::chrono::steady_clock::now();
  Ended(run);
  EXPECT_LT(std::chrono::steady_clock::now() - begin, 3s);
  EXPECT_EQ(run.Outcome(), RunOutcome::Stopped);
  EXPECT_EQ(run.State().end.signal, SIGKILL);
}

TEST_F(Running, WhatAnEngineLeavesRunningIsEndedAndTold) {
  SetupRun run = Started("sleep 1000 & echo $! >children; echo done");
  EXPECT_THAT(Ended(run), AllOf(HasSubstr("The run is done"), HasSubstr("It left 1 of its processes running")));
  EXPECT_EQ(Children().size(), 1u);
}

TEST_F(Running, OneSetupRunsOnlyOnce) {
  SetupRun first = Started("touch begun; while [ ! -e go ]; do sleep 0.02; done");
  ASSERT_TRUE(HasBegun());
  SetupRun second;
  std::string problem;
  EXPECT_FALSE(second.Start(Request(folder.File("Engine")), problem));
  EXPECT_THAT(problem, HasSubstr("this setup is being run already, by "));
  EXPECT_TRUE(first.Look());
  folder.Write("basin/go", "");
  Ended(first);
  EXPECT_EQ(first.Outcome(), RunOutcome::Done);
  EXPECT_TRUE(second.Start(Request(folder.File("Engine")), problem)) << problem;
  Ended(second);
}

TEST_F(Running, AnotherProgramFindsTheRunAndIsToldOfItsEndOnce) {
  SetupRun first = Started("touch begun; while [ ! -e go ]; do sleep 0.02; done; exit 5");
  ASSERT_TRUE(HasBegun());
  SetupRun found;
  ASSERT_TRUE(found.Find(first.Files()));
  EXPECT_TRUE(found.Look());
  folder.Write("basin/go", "");
  EXPECT_THAT(Ended(found), HasSubstr("exit status 5"));
  SetupRun later;
  EXPECT_TRUE(later.Find(first.Files()));
  found.MarkReported();
  EXPECT_FALSE(later.Find(first.Files()));
}

TEST_F(Running, WithoutItsRunnerTheEngineGoesOnAndCanBeStopped) {
  SetupRun run = Started("echo $$ >>children; touch begun; while [ ! -e go ]; do sleep 0.02; done");
  ASSERT_TRUE(HasBegun());
  ASSERT_TRUE(Soon([&] { return run.Look() && run.State().program; }));
  kill(static_cast<pid_t>(run.State().runner->process), SIGKILL);
  std::this_thread::sleep_for(100ms);
  EXPECT_TRUE(run.Look());
  SetupRun second;
  std::string problem;
  EXPECT_FALSE(second.Start(Request(folder.File("Engine")), problem));
  run.Stop();
  EXPECT_THAT(Ended(run), HasSubstr("Nobody knows how the run ended"));
}

TEST_F(Running, AFileOfTheUsersUnderTheNameOfTheStateStays) {
  const std::string own = folder.Write("basin/results/karup_Run.txt", "notes of mine");
  SetupRun run;
  std::string problem;
  EXPECT_FALSE(run.Start(Request(test::WriteEngine(folder, "Engine", "true")), problem));
  EXPECT_THAT(problem, HasSubstr("karup_Run.txt is none of the files that a run keeps"));
  EXPECT_EQ(ReadFile(own), "notes of mine");
}

TEST_F(Running, WhatIsNoRegularFileUnderTheNamesOfARunIsNeitherWrittenNorWaitedFor) {
  const std::string engine = test::WriteEngine(folder, "Engine", "echo words");
  const std::string elsewhere = folder.Write("elsewhere", "");
  const struct {
    const char* name;
    bool isLink;
    const char* problem;
  } cases[] = {{"karup_Run.txt", false, "karup_Run.txt: it is not a regular file"},
               {"karup_Run.txt", true, "karup_Run.txt: it is a symbolic link"},
               {"karup_Run.log", false, "karup_Run.log cannot be written: it is not a regular file"},
               {"karup_Run.log", true, "karup_Run.log cannot be written: it is a symbolic link"}};
  for (const auto& c : cases) {
    const std::string path = folder.File(std::string("basin/results/") + c.name);
    std::filesystem::create_directories(folder.File("basin/results"));
    if (c.isLink)
      std::filesystem::create_symlink(elsewhere, path);
    else
      ASSERT_EQ(mkfifo(path.c_str(), 0600), 0);
    SetupRun run;
    std::string problem;
    if (run.Start(Request(engine), problem)) problem = Ended(run);
    EXPECT_THAT(problem, HasSubstr(c.problem));
    EXPECT_EQ(ReadFile(elsewhere), "");
    EXPECT_FALSE(std::filesystem::is_regular_file(std::filesystem::symlink_status(path)));
    std::filesystem::remove_all(folder.File("basin/results"));
  }
}

TEST_F(Running, AFullDiskLeavesNoEmptyState) {
  const rlimit limit{1024, RLIM_INFINITY};
  rlimit before;
  os::PrepareProcess();
  getrlimit(RLIMIT_FSIZE, &before);
  const std::string engine = test::WriteEngine(folder, "Engine", "true");
  setrlimit(RLIMIT_FSIZE, &limit);
  SetupRun run;
  std::string problem;
  EXPECT_FALSE(run.Start(Request(engine), problem));
  setrlimit(RLIMIT_FSIZE, &before);
  EXPECT_THAT(problem, HasSubstr("cannot write"));
  EXPECT_FALSE(FileExists(folder.File("basin/results/karup_Run.txt")));
  Ended(run = Started(Request(engine)));
}

TEST_F(Running, AStateThatIsNotWholeIsNoState) {
  SetupRun run = Started("true");
  Ended(run);
  std::string text = ReadFile(run.Files().state);
  text[text.find("status: 0") + 8] = '7';
  folder.Write("basin/results/karup_Run.txt", text);
  std::string problem;
  EXPECT_FALSE(ReadRunState(run.Files().state, problem));
  EXPECT_THAT(problem, HasSubstr("karup_Run.txt cannot be understood"));
}

TEST_F(Running, AFollowerBringsLogProgressAndMessages) {
  const std::string commands =
      "echo 'progress 10 first'; echo 'error: SimSpec/SimTitle:Title: bad'; echo 'progress 20 second'\n"
      "echo extra >karupFvrProgress.log; i=0; while [ $i -lt 30000 ]; do echo \"line $i of a log\"; i=$((i+1)); done\n"
      "i=0; while [ $i -lt 1000 ]; do echo 'warning: again'; i=$((i+1)); done; printf last";
  RunRequest request = Request(test::WriteEngine(folder, "Engine", commands));
  request.extraLog = folder.File("basin/karupFvrProgress.log");
  // What an earlier run left in the log is none of this one's.
  folder.Write("basin/results/karup_Run.log", "error: earlier\n");
  RunFollower follower(Started(request));
  RunNews all;
  EXPECT_TRUE(Soon([&] {
    RunNews news = follower.Take();
    all.log.Add(std::move(news.log));
    all.extraLog.Add(std::move(news.extraLog));
    all.messages.insert(all.messages.end(), news.messages.begin(), news.messages.end());
    if (news.progress) all.progress = news.progress;
    return news.outcome != RunOutcome::GoingOn;
  }));
  // Lines that only tell how far it is stay out.
  ASSERT_EQ(all.log.Count(), 31002u);
  EXPECT_EQ(all.log.Line(0), "error: SimSpec/SimTitle:Title: bad");
  EXPECT_EQ(all.log.Line(30000), "line 29999 of a log");
  EXPECT_EQ(all.log.Line(31001), "last");
  ASSERT_EQ(all.extraLog.Count(), 1u);
  EXPECT_EQ(all.extraLog.Line(0), "extra");
  EXPECT_EQ(all.progress, (EngineProgress{20, "second"}));
  EXPECT_EQ(all.messages.size(), RunFollower::kMostMessages);
  EXPECT_EQ(all.messages[0], (EngineMessage{true, "SimSpec/SimTitle:Title", "bad"}));
}

TEST(RunState, DurationsAreToldAsPeopleTellThem) {
  const std::pair<std::int64_t, const char*> cases[] = {
      {-5, "0.0 s"}, {450, "0.4 s"}, {12'900, "12 s"}, {192'000, "3 min 12 s"}, {7'500'000, "2 h 05 min"}};
  for (const auto& [milliseconds, text] : cases) EXPECT_EQ(DurationText(milliseconds), text);
}

}  // namespace
}  // namespace tervane::setup_run_test
