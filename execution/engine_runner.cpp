// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "execution/engine_runner.h"

#include <chrono>
#include <filesystem>
#include <sstream>
#include <thread>

#include <fmt/format.h>

#include "execution/engine_search.h"
#include "execution/run_passport.h"
#include "execution/run_state.h"
#include "platform/beside_program.h"
#include "platform/files.h"
#include "platform/os.h"
#include "platform/paths.h"

namespace tervane {

namespace {

using namespace std::chrono_literals;
using Clock = std::chrono::steady_clock;

/// How long a process that was asked to end may take to do so.
constexpr auto kGrace = 5s;
/// How long processes of an engine that has ended may go on.
constexpr auto kGraceOfLeft = 2s;
/// How long the program that begins the run may take to let go of the state.
constexpr auto kPatience = 2000ms;
/// Less is a full disk.
constexpr std::uintmax_t kLeastSpace = 64u << 10;

std::string LogBeside(const std::string& statePath) {
  return fmt::format("{}/{}.log", FolderOf(statePath), BaseNameOf(statePath));
}

/// An empty log. The old one is another file, so that its present readers are not confused.
std::string MakeLog(const std::string& path) {
  if (const std::string why = WhyNoOwnFile(path); !why.empty())
    return fmt::format("the log {} cannot be written: {}", path, why);
  std::error_code error;
  std::filesystem::remove(NativePath(path), error);
  os::File::CreateNew(path, os::File::Access::AsMaskAllows, error);
  return error ? fmt::format("the log {} cannot be written: {}", path, error.message()) : std::string();
}

os::ProgramStart StartOf(const RunState& state, const std::string& log) {
  os::ProgramStart start{state.engine, {state.setup}, std::string(FolderOf(state.setup)), log};
  std::istringstream options(state.options);
  for (std::string option; options >> option;) start.arguments.push_back(option);
  return start;
}

/// Waits until nothing of the tree runs, or for as long as told.
bool WaitForAll(os::ProgramTree& tree, Clock::duration most) {
  const auto end = Clock::now() + most;
  while (tree.Count() > 0) {
    if (Clock::now() >= end) return false;
    tree.Wait(50ms);
  }
  return true;
}

/// Waits for the engine's end, and stops it when somebody asks for that.
void WaitForEnd(os::ProgramTree& tree, HeldRunState& held, RunState& state) {
  std::string ignored;
  int requests = 0;
  auto killAt = Clock::time_point::max();
  while (!tree.End()) {
    tree.Wait(state.isStopped ? 100ms : 5000ms);
    requests += os::TakeEndRequests();
    if (requests > 0 && !state.isStopped) {
      state.isStopped = true;
      held.Write(state, ignored);
      tree.AskToEnd();
      killAt = Clock::now() + kGrace;
    }
    if (requests > 1 || Clock::now() >= killAt) tree.Kill();
  }
}

/// Notes what the run reads while it goes on.
class PassportNotes {
 public:
  explicit PassportNotes(const std::string& statePath, const RunState& state)
      : path_(PassportFilesOf(FolderOf(statePath), state.setup).passport) {
    std::string ignored;
    passport_ = ReadPassport(path_, ignored);
    if (passport_ && passport_->id != state.id) passport_.reset();
    if (passport_) hashing_ = std::thread([this] { HashInputs(*passport_); });
  }
  /// Waits for what is still to be read.
  void Finish(const RunState& state) {
    if (!passport_) return;
    hashing_.join();
    FinishPassport(std::move(*passport_), state, path_);
  }

 private:
  std::string path_;
  std::optional<RunPassport> passport_;
  std::thread hashing_;
};

/// Ends what the engine has left.
void EndLeftProcesses(os::ProgramTree& tree, RunState& state) {
  if (WaitForAll(tree, kGraceOfLeft)) return;
  if (!state.isStopped) state.leftProcesses = static_cast<int>(tree.Count());
  tree.AskToEnd();
  if (!WaitForAll(tree, kGraceOfLeft)) tree.Kill();
}

}  // namespace

std::string RunnerProgram() {
#ifdef _WIN32
  constexpr std::string_view name = "tervane_runner.exe";
#else
  constexpr std::string_view name = "tervane_runner";
#endif
  const std::string found = FindBesideProgram(name);
  return found.empty() ? fmt::format("{}/{}", FolderOf(os::CodePath()), name) : found;
}

int RunEngineAndWait(const std::vector<std::string>& arguments) {
  os::KeepEndRequests();
  if (arguments.size() != 2) return kRunnerMisused;
  std::optional<HeldRunState> hold(std::in_place);
  HeldRunState& held = *hold;
  std::string ignored;
  if (held.Hold(arguments[0], kPatience, ignored) != HeldRunState::Outcome::Held) return kRunnerOvertaken;
  std::optional<RunState> begun = held.Read();
  if (!begun || begun->id != arguments[1] || begun->HasEnded()) return kRunnerOvertaken;
  RunState& state = *begun;
  state.runner = RunningProcess::This();
  if (!held.Write(state, ignored)) return kRunnerCannotWrite;

  PassportNotes notes(arguments[0], state);
  const std::string log = LogBeside(arguments[0]);
  const FileStamp reportBefore = StampOf(state.report);
  os::ProgramTree tree;
  state.problem = MakeLog(log);
  if (state.problem.empty()) {
    std::error_code error;
    tree.Start(StartOf(state, log), error);
    if (error) state.problem = WhyNotStarted(state.engine, error);
  }
  if (state.problem.empty()) {
    state.program = RunningProcess::This();
    state.program->process = tree.Id();
    state.program->started = os::ProcessStartTime(tree.Id());
    held.Write(state, ignored);
    WaitForEnd(tree, held, state);
    state.end = *tree.End();
  }
  const std::int64_t ended = NowInMilliseconds();
  if (state.program) EndLeftProcesses(tree, state);
  state.ended = ended;
  const FileStamp report = StampOf(state.report);
  state.leftReport = report.exists && !(report == reportBefore);
  std::error_code error;
  const std::filesystem::space_info space = std::filesystem::space(NativePath(FolderOf(arguments[0])), error);
  state.isDiskFull = !error && space.available < kLeastSpace;
  const bool isWritten = held.Write(state, ignored);
  // Inputs that take longer to read than the engine ran hold nobody up.
  hold.reset();
  notes.Finish(state);
  return isWritten ? kRunnerDone : kRunnerCannotWrite;
}

}  // namespace tervane
