// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What is known of a run: a small file beside the results that the runner keeps, so that a run outlives the program
// that started it, and its end is noticed later.
#pragma once

#include <chrono>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "platform/os.h"
#include "platform/os_process.h"
#include "platform/running_process.h"

namespace tervane {

/// The files that a run of a setup leaves beside its results. Setups that share them would share their results too.
struct RunFiles {
  std::string state;  ///< BASENAME_Run.txt
  std::string log;    ///< BASENAME_Run.log: all that the engine prints.
};
RunFiles RunFilesOf(std::string_view resultFolder, std::string_view setup);

/// Milliseconds since 1970, of the clock on the wall: a run may outlive the machine's other clocks.
std::int64_t NowInMilliseconds();

struct RunState {
  std::string id;  ///< Tells this run from all others.
  std::string setup, engine, options;
  std::string extraLog;  ///< A second log that the engine writes; may be empty.
  std::string report;    ///< A file that the run is expected to leave; may be empty.
  RunningProcess starter;
  std::optional<RunningProcess> runner;   ///< Nothing until it has begun.
  std::optional<RunningProcess> program;  ///< The engine; nothing until it was started.
  std::int64_t begun = 0;
  std::int64_t ended = 0;  ///< 0 until the end.
  std::string problem;     ///< Why the engine could not be started.
  os::ProcessEnd end;      ///< Of the engine, once `ended` is set.
  bool isStopped = false;  ///< Somebody asked it to end.
  bool leftReport = false;
  int leftProcesses = 0;    ///< How many of its processes the engine had not waited for.
  bool isDiskFull = false;  ///< At its end.
  bool isReported = false;  ///< The user knows of its end.

  bool HasEnded() const { return ended != 0; }
};

/// False when neither its end is known nor anything of it can still run.
bool MayStillRun(const RunState& state);

/// The state, or nothing: with a problem when there is one that cannot be read or understood, which may be because it
/// is just being written.
std::optional<RunState> ReadRunState(const std::string& path, std::string& problem);

/// The state file held open for writing, so that nobody else begins a run. It is written in place, with room reserved:
/// the end of a run can be recorded on a full disk.
class HeldRunState {
 public:
  enum class Outcome { Held, HeldByOther, CannotWrite };
  /// Takes hold of the file, which need not exist. Waits at most so long for another to let go of it: a runner does
  /// so a moment after it has told of the end.
  Outcome Hold(const std::string& path, std::chrono::milliseconds patience, std::string& problem);
  /// What stands there; nothing in a new file, and in one that cannot be understood.
  std::optional<RunState> Read();
  /// False with the problem when it could not be written; a file that held nothing before is then removed.
  bool Write(const RunState& state, std::string& problem);

 private:
  std::string path_;
  os::File file_;
  bool isEmpty_ = false;  ///< Nothing has been written yet.
};

/// How a run ended, or that it goes on.
enum class RunOutcome { GoingOn, Done, Failed, Stopped, NotStarted, Unknown };
/// "done", "not started"
std::string_view OutcomeName(RunOutcome outcome);
RunOutcome OutcomeOf(const RunState& state);
/// The same as a sentence for the user: "The engine crashed after 12 s: segmentation fault (signal 11)."
std::string OutcomeSentence(const RunState& state);

/// "0.4 s", "12 s", "3 min 05 s", "2 h 05 min"
std::string DurationText(std::int64_t milliseconds);

}  // namespace tervane
