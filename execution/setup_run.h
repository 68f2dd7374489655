// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// One run of an engine: how it is started, followed and stopped. The engine is a child of a small runner program, which
// outlives the program that started it; all that is known of the run is in files.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "core/engine_shell.h"
#include "execution/engine_search.h"
#include "execution/run_state.h"

namespace tervane {

/// What a run is started with.
struct RunRequest {
  std::string setup;         ///< The file as it stands on disk.
  std::string resultFolder;  ///< Made where it is missing.
  std::string engine;        ///< Path of the program.
  std::string options;       ///< Separated by blanks; may be empty.
  std::string extraLog;      ///< May be empty.
  std::string report;        ///< What the run must leave; may be empty.
  // For the passport; a run that makes no results has none.

  std::vector<std::string> inputs = {};  ///< What it reads.
  std::string setupText = {};            ///< The setup, with names of files from the folder of the results.
};

/// The request that a document's start comes to; nothing, with the problem, when the engine is not there.
std::optional<RunRequest> RequestOf(const CYbSimpleLaunch& launch, const std::string& resultFolder,
                                    const EnginePlaces& places, std::string& problem);

/// A run that this or another program started. Each `Look` reads the files anew; nothing waits.
class SetupRun {
 public:
  /// Starts the engine. False with the problem when it could not be started, also because another run of this setup
  /// goes on; what the engine itself meets at its start shows at a later look.
  bool Start(const RunRequest& request, std::string& problem);
  /// Takes the run in the files: one that goes on, or one whose end was not reported yet. False when there is none.
  bool Find(const RunFiles& files);

  const RunFiles& Files() const { return files_; }
  /// Reads the state. False when it has ended: then it stays as it is.
  bool Look();
  const RunState& State() const { return state_; }
  RunOutcome Outcome() const { return outcome_; }

  /// Asks the engine and all that it has started to end; those still running a few seconds later are killed. A
  /// second call kills without waiting. Returns why it cannot be done from here, or "".
  std::string Stop();
  /// Notes in the files that the user knows how it ended.
  void MarkReported();

 private:
  bool ReadState();
  void SendStops();

  RunFiles files_;
  RunState state_;
  RunOutcome outcome_ = RunOutcome::GoingOn;
  os::DetachedProgram runner_;  ///< Of a run that was started here.
  int stopsWanted_ = 0, stopsSent_ = 0;
};

}  // namespace tervane
