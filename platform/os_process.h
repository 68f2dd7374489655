// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Programs that this one starts, and how they are ended. Beside platform/os.h the only place that calls the operating
// system directly; each call has its counterpart for Windows.
#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <system_error>
#include <vector>

namespace tervane::os {

/// True when a regular file stands there that the user may start.
bool MayStart(const std::string& path);

struct ProgramStart {
  std::string program;
  std::vector<std::string> arguments;
  std::string folder;  ///< In which it works; empty for that of this process.
  std::string output;  ///< A file; all that the program prints goes to its end. Empty: it goes nowhere.
};

/// How a program ended: by itself with a status, or by a signal (on Windows by an exception, told as its number).
struct ProcessEnd {
  int status = 0;
  int signal = 0;  ///< 0 when it ended by itself.

  bool operator==(const ProcessEnd&) const = default;
};
/// "segmentation fault"
std::string SignalText(int signal);

/// A program that goes on when this process and its terminal are no more.
class DetachedProgram {
 public:
  DetachedProgram() = default;
  DetachedProgram(DetachedProgram&& other) noexcept { *this = std::move(other); }
  DetachedProgram& operator=(DetachedProgram&& other) noexcept;
  DetachedProgram(const DetachedProgram&) = delete;
  DetachedProgram& operator=(const DetachedProgram&) = delete;
  ~DetachedProgram();

  static DetachedProgram Start(const ProgramStart& start, std::error_code& error);
  /// How it ended, or nothing while it runs. Never waits.
  std::optional<ProcessEnd> End();
  /// Waits until the program's window takes input, for ten seconds at most, and then sends all windows the message of
  /// that name. False when it never did. Where programs send no messages to windows there is nothing to wait for.
  bool AnnounceWhenReady(const std::string& message);

 private:
  std::uint32_t id_ = 0;
  void* handle_ = nullptr;  ///< Of Windows.
  std::optional<ProcessEnd> end_;
};

/// The folder of the program that serves a class of objects, as it is registered with Windows: "{5EBEA2A1-...}". Empty
/// where there is none, and on other systems.
std::string RegisteredServerFolder(const std::string& classId);

/// A program with all that it starts in turn, also what these leave behind, so that all can be ended together. A
/// process has one such tree at a time, and starts nothing else.
class ProgramTree {
 public:
  ProgramTree() = default;
  ProgramTree(const ProgramTree&) = delete;
  ProgramTree& operator=(const ProgramTree&) = delete;
  ~ProgramTree();

  void Start(const ProgramStart& start, std::error_code& error);
  std::uint32_t Id() const { return id_; }
  /// Returns at the program's end, at a request to end this process, or when the time is over.
  void Wait(std::chrono::milliseconds most);
  /// How the program itself ended; nothing while it runs.
  const std::optional<ProcessEnd>& End();
  /// How many processes of the tree run, the program among them.
  std::size_t Count();
  /// Asks all of them to end; a process that ignores the request runs on.
  void AskToEnd();
  void Kill();

 private:
  std::uint32_t id_ = 0;
  void* program_ = nullptr;  ///< Of Windows.
  void* job_ = nullptr;
  std::optional<ProcessEnd> end_;
};

/// From now on a request to end this process (Ctrl-C, a polite kill, the closing of its terminal) is kept for the two
/// calls below; one that was ignored before stays ignored.
void KeepEndRequests();
/// How many came since this was asked last.
int TakeEndRequests();
/// Ends this process the way the latest request would have done, so that a shell loop around it ends as well.
[[noreturn]] void EndAsRequested();

/// Asks another process that keeps such requests to end.
void RequestEnd(std::uint32_t processId);
/// Ends a process and those that have its process group, politely or not.
void EndGroup(std::uint32_t processId, bool politely);

}  // namespace tervane::os
