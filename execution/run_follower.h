// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <condition_variable>
#include <cstddef>
#include <mutex>
#include <optional>
#include <string>
#include <thread>
#include <vector>

#include "execution/engine_line.h"
#include "execution/run_log.h"
#include "execution/setup_run.h"

namespace tervane {

/// What a run has brought since somebody asked last.
struct RunNews {
  LogTail log;  ///< Without the lines of its progress.
  LogTail extraLog;
  std::optional<EngineProgress> progress;  ///< The latest; nothing when there was none.
  std::vector<EngineMessage> messages;
  std::string trouble;  ///< A stop that could not be asked for.
  RunState state;
  RunOutcome outcome = RunOutcome::GoingOn;  ///< Another one once the log was read to its end.
};

/// Follows a run in a thread of its own, so that neither an engine that prints without end nor a slow disk blocks the
/// view of the run.
class RunFollower {
 public:
  /// Messages of an engine beyond this number are in the log only.
  static constexpr std::size_t kMostMessages = 500;

  explicit RunFollower(SetupRun run);
  ~RunFollower();
  RunFollower(const RunFollower&) = delete;
  RunFollower& operator=(const RunFollower&) = delete;

  /// Once the end was handed out here, the files tell that the user knows of it.
  RunNews Take();
  void Stop();
  /// Waits until the files were read once, at most this long.
  void WaitForFirstLook(std::chrono::milliseconds most);

 private:
  void Follow();
  /// True when there is more to read at once.
  bool ReadLog();
  bool ReadExtraLog();
  /// Takes what the engine says in them; gives the lines for the log, where those that only tell how far it is are
  /// left out.
  LogPiece Understand(LogPiece lines);

  SetupRun run_;
  LogReader log_;
  LineCutter lines_;
  std::optional<LogReader> extraLog_;
  LineCutter extraLines_;
  std::size_t messages_ = 0;

  std::mutex mutex_;
  std::condition_variable changed_;
  RunNews news_;
  int stops_ = 0;
  bool isLeft_ = false, hasLooked_ = false, isEndTaken_ = false;
  std::thread thread_;
};

}  // namespace tervane
