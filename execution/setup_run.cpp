// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "execution/setup_run.h"

#include <atomic>
#include <filesystem>

#include <fmt/format.h>

#include "execution/engine_runner.h"
#include "execution/engine_search.h"
#include "execution/run_passport.h"
#include "platform/dates.h"
#include "platform/files.h"
#include "platform/paths.h"

namespace tervane {

namespace {

/// How long the runner of a run that has ended may take to let go of the state.
constexpr std::chrono::milliseconds kPatienceWithRunner{500};

std::string NewId() {
  static std::atomic<unsigned> counter{0};
  return fmt::format("{}-{}-{}", NowInMilliseconds(), os::ProcessId(), ++counter);
}

std::string RunsAlready(const RunFiles& files, const std::optional<RunState>& state) {
  if (!state) return fmt::format("this setup is being run already: {} is in use", files.state);
  const std::string since = CYbDateTime::FromSecondsSinceEpoch(state->begun / 1000).Format("%Y-%m-%d %H:%M");
  std::string sentence = fmt::format(
      "this setup is being run already, by {} on host {} since {} UTC: wait for the end of that run, or stop "
      "it",
      state->starter.user, state->starter.host, since);
  if (!state->starter.IsOnThisHost())
    sentence += fmt::format("; remove {} when nothing of it runs there any more", files.state);
  return sentence;
}

bool MayRun(const std::optional<RunningProcess>& process) { return process && process->MayRun(); }

}  // namespace

std::optional<RunRequest> RequestOf(const CYbSimpleLaunch& launch, const std::string& resultFolder,
                                    const EnginePlaces& places, std::string& problem) {
  const std::string engine = FindEngine(launch.Engine, places, problem);
  if (engine.empty()) return std::nullopt;
  return RunRequest{launch.Input, resultFolder, engine, launch.Options, launch.ExtraLog, launch.Report};
}

bool SetupRun::Start(const RunRequest& request, std::string& problem) {
  std::error_code error;
  std::filesystem::create_directories(NativePath(request.resultFolder), error);
  if (error) {
    problem = fmt::format("the folder of the results, {}, cannot be made: {}", request.resultFolder, error.message());
    return false;
  }
  const std::string setup = AbsoluteFromHere(request.setup);
  files_ = RunFilesOf(request.resultFolder, setup);
  state_ = {};
  {
    HeldRunState held;
    const HeldRunState::Outcome outcome = held.Hold(files_.state, kPatienceWithRunner, problem);
    if (outcome == HeldRunState::Outcome::CannotWrite) return false;
    const std::optional<RunState> earlier = held.Read();
    if (outcome == HeldRunState::Outcome::HeldByOther || (earlier && MayStillRun(*earlier))) {
      problem = RunsAlready(files_, earlier);
      return false;
    }
    state_.id = NewId();
    state_.setup = setup;
    state_.engine = request.engine;
    state_.options = request.options;
    state_.extraLog = request.extraLog;
    state_.report = request.report;
    state_.starter = RunningProcess::This();
    state_.begun = NowInMilliseconds();
    if (!held.Write(state_, problem)) return false;
    if (!request.inputs.empty()) {
      const PassportFiles passport = PassportFilesOf(request.resultFolder, setup);
      // Results without a passport are better than no results; an old one would speak of others.
      if (!WriteFileAtomically(passport.setup, request.setupText).Ok() ||
          !WritePassport(PassportOf(state_, request.inputs), passport.passport).Ok())
        std::filesystem::remove(NativePath(passport.passport), error);
    }
  }
  outcome_ = RunOutcome::GoingOn;
  stopsWanted_ = stopsSent_ = 0;
  const std::string runner = RunnerProgram();
  runner_ = os::DetachedProgram::Start({runner, {files_.state, state_.id}, std::string(FolderOf(setup)), {}}, error);
  if (!error) return true;
  state_.problem = problem = WhyNotStarted(runner, error);
  state_.ended = NowInMilliseconds();
  outcome_ = RunOutcome::NotStarted;
  MarkReported();
  return false;
}

bool SetupRun::Find(const RunFiles& files) {
  std::string problem;
  std::optional<RunState> found = ReadRunState(files.state, problem);
  if (!found || found->isReported) return false;
  files_ = files;
  state_ = *found;
  runner_ = {};
  outcome_ = RunOutcome::GoingOn;
  stopsWanted_ = stopsSent_ = 0;
  return true;
}

bool SetupRun::ReadState() {
  std::string problem;
  std::optional<RunState> read = ReadRunState(files_.state, problem);
  if (!read || read->id != state_.id) return false;
  state_ = std::move(*read);
  return state_.HasEnded();
}

bool SetupRun::Look() {
  if (outcome_ != RunOutcome::GoingOn) return false;
  // Asked in this order, since the end is written before the runner is gone.
  const std::optional<os::ProcessEnd> runnerEnd = runner_.End();
  const bool isNobodyLeft = !MayStillRun(state_);
  if (!ReadState()) {
    if (runnerEnd && !state_.runner) {
      state_.ended = NowInMilliseconds();
      state_.problem = runnerEnd->status == kRunnerOvertaken
                           ? RunsAlready(files_, std::nullopt)
                           : fmt::format("{} could not begin; it needs to write {}", RunnerProgram(), files_.state);
      outcome_ = RunOutcome::NotStarted;
      return false;
    }
    if (!isNobodyLeft || MayStillRun(state_)) {
      SendStops();
      return true;
    }
  }
  outcome_ = OutcomeOf(state_);
  return false;
}

std::string SetupRun::Stop() {
  ++stopsWanted_;
  const RunningProcess& where = state_.runner ? *state_.runner : state_.starter;
  if (!where.IsOnThisHost()) return fmt::format("the engine runs on host {}: stop it there", where.host);
  SendStops();
  return {};
}

void SetupRun::SendStops() {
  // No request can be sent before the runner has written its process to the state file.
  for (; state_.runner && stopsSent_ < stopsWanted_; ++stopsSent_) {
    if (MayRun(state_.runner))
      os::RequestEnd(state_.runner->process);
    else if (MayRun(state_.program))
      os::EndGroup(state_.program->process, stopsSent_ == 0);
  }
}

void SetupRun::MarkReported() {
  state_.isReported = true;
  HeldRunState held;
  std::string ignored;
  if (held.Hold(files_.state, kPatienceWithRunner, ignored) != HeldRunState::Outcome::Held) return;
  const std::optional<RunState> now = held.Read();
  if (now && now->id == state_.id) held.Write(state_, ignored);
}

}  // namespace tervane
