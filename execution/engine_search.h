// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <string_view>
#include <system_error>

namespace tervane {

/// The setting of the programs, and the variable of the environment, that tell where engines lie.
inline constexpr const char *kEnginePathSetting = "EnginePath", *kEnginesVariable = "TERVANE_ENGINES";

/// Where engines are looked for, in this order. The first two may name several folders, separated as in PATH.
struct EnginePlaces {
  std::string setting;      ///< The value of the setting.
  std::string environment;  ///< The value of the variable.
  std::string beside;       ///< The folder `engines` beside the program.

  /// The places of this program and environment.
  static EnginePlaces Here(const std::string& setting);
  /// Folders that were named for one run, separated as in PATH: an engine that is not there is not looked for
  /// elsewhere.
  static EnginePlaces Only(const std::string& folders) { return {folders, {}, {}}; }
  bool IsOnly() const { return environment.empty() && beside.empty(); }
};

/// The path of an engine by its file name, which may stand with or without ".exe" in the call and on disk. Empty with
/// the reason, and what to do, when there is none that may be started.
std::string FindEngine(std::string_view name, const EnginePlaces& places, std::string& problem);

/// Why a program could not be started, with what to do: not only the system's word for it.
std::string WhyNotStarted(const std::string& program, const std::error_code& error);

}  // namespace tervane
