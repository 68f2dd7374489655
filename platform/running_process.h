// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Programs that run, as lines that a person can read in a lock, an autosave or the state of a run.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace tervane {

/// A running program: of a user, on a host, with a number that is told from later ones by the time of its start.
struct RunningProcess {
  std::string user;
  std::string host;
  std::uint32_t process = 0;
  std::string started;

  static RunningProcess This();
  bool IsOnThisHost() const;
  bool IsThis() const;
  /// False when it runs no more; a process on another host counts as running.
  bool MayRun() const;
};

/// A line "NAME: VALUE" with its line end; control characters of the value are written as %XX.
std::string NamedLine(std::string_view name, std::string_view value);
/// The value of the first line of that name, or nothing.
std::optional<std::string> NamedValue(std::string_view lines, std::string_view name);

/// The process as such lines, each name behind `prefix`; and back, nothing when host and process do not stand there.
std::string ProcessLines(const RunningProcess& process, const std::string& prefix = {});
std::optional<RunningProcess> ProcessOfLines(std::string_view lines, const std::string& prefix = {});

}  // namespace tervane
