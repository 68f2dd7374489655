// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "execution/run_state.h"

#include <charconv>
#include <filesystem>
#include <thread>

#include <fmt/format.h>

#include "platform/dates.h"
#include "platform/files.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

constexpr std::string_view kFirstLine = "A run of a Tervane setup. The program that runs it keeps this file.\n";
/// More than any state holds; reserved from the first moment.
constexpr std::size_t kSize = 32768;

constexpr std::int64_t kLongestStart = 60'000;

std::string Time(std::int64_t milliseconds) {
  return CYbDateTime::FromSecondsSinceEpoch(milliseconds / 1000).Format("%Y-%m-%d %H:%M:%S");
}

template <class Number>
Number NumberOf(std::string_view lines, std::string_view name) {
  const std::string text = NamedValue(lines, name).value_or("");
  Number value = 0;
  std::from_chars(text.data(), text.data() + text.size(), value);
  return value;
}

std::string TextOf(const RunState& state) {
  std::string lines = NamedLine("run", state.id) + NamedLine("setup", state.setup) + NamedLine("engine", state.engine) +
                      NamedLine("options", state.options) + NamedLine("extra log", state.extraLog) +
                      NamedLine("report", state.report) + NamedLine("begun", std::to_string(state.begun)) +
                      NamedLine("begun at (UTC)", Time(state.begun)) + ProcessLines(state.starter, "starter ");
  if (state.runner) lines += ProcessLines(*state.runner, "runner ");
  if (state.program) lines += ProcessLines(*state.program, "program ");
  if (state.isStopped) lines += NamedLine("stopped", "yes");
  if (state.HasEnded()) {
    lines += NamedLine("ended", std::to_string(state.ended)) + NamedLine("ended at (UTC)", Time(state.ended)) +
             NamedLine("problem", state.problem) + NamedLine("exit status", std::to_string(state.end.status)) +
             NamedLine("signal", std::to_string(state.end.signal)) +
             NamedLine("left report", state.leftReport ? "yes" : "no") +
             NamedLine("left processes", std::to_string(state.leftProcesses)) +
             NamedLine("disk full", state.isDiskFull ? "yes" : "no") +
             NamedLine("told", state.isReported ? "yes" : "no");
  }
  // Who reads while it is written finds that the two do not fit.
  return fmt::format("{}{}{}", kFirstLine, NamedLine("check", fmt::format("{:016x}", HashOf(lines))), lines);
}

std::optional<RunState> StateOf(std::string_view text) {
  if (!text.starts_with(kFirstLine)) return std::nullopt;
  text.remove_prefix(kFirstLine.size());
  const std::size_t end = text.find('\n');
  const std::string check = NamedValue(text, "check").value_or("");
  if (end == std::string_view::npos) return std::nullopt;
  const std::string_view lines = text.substr(end + 1, text.find("\n\n", end) - end);
  if (check != fmt::format("{:016x}", HashOf(lines))) return std::nullopt;
  const auto value = [&](std::string_view name) { return NamedValue(lines, name).value_or(""); };
  RunState state;
  state.id = value("run");
  state.setup = value("setup");
  state.engine = value("engine");
  state.options = value("options");
  state.extraLog = value("extra log");
  state.report = value("report");
  state.starter = ProcessOfLines(lines, "starter ").value_or(RunningProcess{});
  state.runner = ProcessOfLines(lines, "runner ");
  state.program = ProcessOfLines(lines, "program ");
  state.begun = NumberOf<std::int64_t>(lines, "begun");
  state.ended = NumberOf<std::int64_t>(lines, "ended");
  state.problem = value("problem");
  state.end = {NumberOf<int>(lines, "exit status"), NumberOf<int>(lines, "signal")};
  state.isStopped = value("stopped") == "yes";
  state.leftReport = value("left report") == "yes";
  state.leftProcesses = NumberOf<int>(lines, "left processes");
  state.isDiskFull = value("disk full") == "yes";
  state.isReported = value("told") == "yes";
  return state;
}

}  // namespace

RunFiles RunFilesOf(std::string_view resultFolder, std::string_view setup) {
  const std::string stem = ResolvedPath(fmt::format("{}_Run", BaseNameOf(setup)), AbsoluteFromHere(resultFolder));
  return {stem + ".txt", stem + ".log"};
}

std::int64_t NowInMilliseconds() {
  return std::chrono::duration_cast<std::chrono::milliseconds>(std::chrono::system_clock::now().time_since_epoch())
      .count();
}

bool MayStillRun(const RunState& state) {
  if (state.HasEnded()) return false;
  // A runner begins at once, or never.
  if (!state.runner) return state.starter.MayRun() && NowInMilliseconds() - state.begun < kLongestStart;
  return state.runner->MayRun() || (state.program && state.program->MayRun());
}

std::optional<RunState> ReadRunState(const std::string& path, std::string& problem) {
  problem.clear();
  FileContent content;
  if (const FileResult result = ReadWholeFile(path, content); !result.Ok()) {
    if (FileExists(path)) problem = result.error;
    return std::nullopt;
  }
  std::optional<RunState> state = StateOf(content.Text());
  if (!state) problem = fmt::format("{} cannot be understood; remove it when no engine runs this setup", path);
  return state;
}

HeldRunState::Outcome HeldRunState::Hold(const std::string& path, std::chrono::milliseconds patience,
                                         std::string& problem) {
  path_ = path;
  if (const std::string why = WhyNoOwnFile(path); !why.empty()) {
    problem = fmt::format("cannot write {}: {}; remove it, and run the setup again", path, why);
    return Outcome::CannotWrite;
  }
  std::error_code error;
  file_ = os::File::OpenOrCreate(path, error);
  if (error) {
    problem = fmt::format("cannot write {}: {}", path, error.message());
    return Outcome::CannotWrite;
  }
  std::string begin(kFirstLine.size(), '\0');
  begin.resize(file_.Read(begin.data(), begin.size(), error));
  isEmpty_ = begin.empty();
  // What a power cut left of a state may be empty or of zeros.
  if (begin != kFirstLine && begin.find_first_not_of('\0') != std::string::npos) {
    problem = fmt::format("{} is none of the files that a run keeps: rename it, and run the setup again", path);
    return Outcome::CannotWrite;
  }
  // Where the file system knows no locks, the content alone tells whether a run goes on.
  const auto end = std::chrono::steady_clock::now() + patience;
  while (!file_.TryLock(error) && !error) {
    if (std::chrono::steady_clock::now() >= end) return Outcome::HeldByOther;
    std::this_thread::sleep_for(std::chrono::milliseconds(2));
  }
  return Outcome::Held;
}

std::optional<RunState> HeldRunState::Read() {
  std::string problem;
  return ReadRunState(path_, problem);
}

bool HeldRunState::Write(const RunState& state, std::string& problem) {
  std::string text = TextOf(state);
  text.resize(std::max(text.size() + 1, kSize), '\n');
  std::error_code error;
  file_.Seek(0, error);
  if (!error) file_.WriteAll(text, error);
  if (!error) file_.Flush(error);
  if (!error) {
    isEmpty_ = false;
    return true;
  }
  problem = fmt::format("cannot write {}: {}", path_, error.message());
  // What holds no state of an earlier run, and now no whole one, would tell nobody anything.
  std::error_code ignored;
  if (isEmpty_) std::filesystem::remove(NativePath(path_), ignored);
  return false;
}

// ---- Outcomes

std::string_view OutcomeName(RunOutcome outcome) {
  switch (outcome) {
    case RunOutcome::GoingOn:
      return "going on";
    case RunOutcome::Done:
      return "done";
    case RunOutcome::Failed:
      return "failed";
    case RunOutcome::Stopped:
      return "stopped";
    case RunOutcome::NotStarted:
      return "not started";
    case RunOutcome::Unknown:
      return "unknown";
  }
  return {};
}

RunOutcome OutcomeOf(const RunState& state) {
  if (!state.HasEnded()) return MayStillRun(state) ? RunOutcome::GoingOn : RunOutcome::Unknown;
  if (!state.problem.empty()) return RunOutcome::NotStarted;
  if (state.isStopped) return RunOutcome::Stopped;
  const bool isDone = state.end == os::ProcessEnd{} && (state.report.empty() || state.leftReport);
  return isDone ? RunOutcome::Done : RunOutcome::Failed;
}

std::string OutcomeSentence(const RunState& state) {
  const std::string duration = DurationText(state.ended - state.begun);
  std::string sentence;
  switch (OutcomeOf(state)) {
    case RunOutcome::GoingOn:
      return fmt::format("The engine {} runs.", FileNameOf(state.engine));
    case RunOutcome::NotStarted:
      return state.problem;
    case RunOutcome::Unknown:
      return "Nobody knows how the run ended: the program that watched it was ended too. The log tells how far it "
             "came.";
    case RunOutcome::Done:
      sentence = fmt::format("The run is done after {}.", duration);
      break;
    case RunOutcome::Stopped:
      sentence = fmt::format("The run was stopped after {}. Its results are not complete.", duration);
      break;
    case RunOutcome::Failed:
      if (state.end.signal != 0)
        sentence = fmt::format("The engine crashed after {}: {} (signal {}). The end of its log may tell why.",
                               duration, os::SignalText(state.end.signal), state.end.signal);
      else if (state.end.status != 0)
        sentence = fmt::format("The engine failed after {} with exit status {}. The end of its log may tell why.",
                               duration, state.end.status);
      else
        sentence = fmt::format(
            "The engine ended after {} without an error (exit status 0), but it has not written its report {}.",
            duration, state.report);
      break;
  }
  if (state.isDiskFull)
    sentence += fmt::format(" There is no space left on the disk of {}: results and log may be cut off.", state.setup);
  if (state.leftProcesses > 0)
    sentence += fmt::format(" It left {} of its processes running; they were ended.", state.leftProcesses);
  return sentence;
}

std::string DurationText(std::int64_t milliseconds) {
  milliseconds = std::max<std::int64_t>(milliseconds, 0);
  const std::int64_t seconds = milliseconds / 1000;
  if (seconds < 10) return fmt::format("{}.{} s", seconds, milliseconds % 1000 / 100);
  if (seconds < 60) return fmt::format("{} s", seconds);
  if (seconds < 3600) return fmt::format("{} min {:02} s", seconds / 60, seconds % 60);
  return fmt::format("{} h {:02} min", seconds / 3600, seconds % 3600 / 60);
}

}  // namespace tervane
