// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The lock that keeps two editors from writing one setup: a small file beside it that names the holder of the setup.
#pragma once

#include <optional>
#include <string>

#include "platform/running_process.h"

namespace tervane {

/// Who has a setup open.
struct LockHolder {
  std::string file;                       ///< The lock.
  std::optional<RunningProcess> process;  ///< Nothing where the lock does not tell: then `whyUnknown` does.
  std::string whyUnknown;
  bool isForOneChange = false;  ///< It reads, changes and writes the setup, and is done.
};

/// The same as a sentence: "anna has it open on host gauss (process 4711)", with what to do where that editor cannot be
/// asked whether it still runs.
std::string HolderSentence(const LockHolder& holder);

/// The holder of the setup, under any of its names; nothing when there is none.
std::optional<LockHolder> HolderOf(const std::string& setup);

/// A lock that is held. Released by the destructor, and by the end of the process: the lock of a process that no longer
/// runs is stale.
class SetupLock {
 public:
  SetupLock() = default;
  SetupLock(SetupLock&& other) noexcept { *this = std::move(other); }
  SetupLock& operator=(SetupLock&& other) noexcept;
  SetupLock(const SetupLock&) = delete;
  SetupLock& operator=(const SetupLock&) = delete;
  ~SetupLock() { Release(); }

  enum class Outcome { Taken, Held, CannotWrite };
  /// What for: to have the setup open, or to read, change and write it, which is soon done.
  enum class Purpose { Editing, OneChange };
  /// Takes the lock of a setup, which need not exist. A second one of this process is refused like any other; a holder
  /// that makes one change is waited for.
  Outcome Take(const std::string& setup, Purpose purpose = Purpose::Editing);
  /// Why it was not taken, as a sentence for the user.
  const std::string& Reason() const { return reason_; }
  bool IsTaken() const { return !file_.empty(); }
  void Release();

 private:
  std::string file_;
  std::string content_;
  std::string reason_;
};

}  // namespace tervane
