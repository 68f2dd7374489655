// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <vector>

#include "core/host.h"

namespace tervane {

/// The record of one start of an engine.
struct CYbSimpleLaunch {
  std::string Engine;    ///< File name of the program, without a folder.
  std::string Input;     ///< The file that it runs.
  std::string Options;   ///< Separated by blanks; may be empty.
  std::string ExtraLog;  ///< A second log that the engine writes; may be empty.
  std::string Report;    ///< A file that the engine must leave; may be empty.

  // What a shell may keep with a start. The document sets none of it.

  static constexpr int UNABLE_TO_EXEC = -2048;  ///< The exit code of what could not be started.

  std::string EMailAddress, SMSAddress;  ///< Who is told of the end.
  int ExitCode = 0;
  int ProcessId = 0;
  int RefreshInterval = 0;  ///< Of the progress, in seconds.
  int UseGPU = 0;           ///< The engine is to use graphics processors.
  std::vector<int> GPUDevices;
  int NoOfSubdomains = 1;
};

/// The program that has a document open, as the document asks it to run an engine.
class EngineShell {
 public:
  virtual ~EngineShell() = default;

  virtual Host& Outside() = 0;
  /// True when the document is not on disk as it is in memory.
  virtual bool HasChanges() const = 0;
  /// Saves to the present path, asks for one if there is none. False when it failed or the user gave up.
  virtual bool DoFileSave() = 0;
  virtual bool IsShiftHeld() const = 0;
  /// Starts an engine that ends on its own; what can go wrong is told to the user.
  virtual void Start(const CYbSimpleLaunch& launch, bool showsProgress) = 0;
  virtual bool IsExecuting() const = 0;
};

}  // namespace tervane
