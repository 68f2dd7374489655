// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Autosaves: a setup with its unsaved changes, kept beside it (NAME.tvd~) or in a folder of the user's. A comment in
// front names the setup and the process that wrote it, so that autosaves left by a crash are found again.
#pragma once

#include <chrono>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "platform/files.h"
#include "platform/running_process.h"

namespace tervane {

/// An autosave that holds what no file holds, of an editor that runs no more.
struct Recovery {
  std::string autosave;
  std::string setup;  ///< Absolute; empty when it was never saved.
  std::chrono::system_clock::time_point time;
};

/// What an autosave left for a setup that is about to be opened, the newest; nothing when there is none.
std::optional<Recovery> FindRecovery(const std::string& setup, const std::string& recoveryFolder);
/// What autosaves left in that folder, the newest first: of setups that were never saved, and of those beside which no
/// autosave could stand.
std::vector<Recovery> FindRecoveries(const std::string& recoveryFolder);
/// The user does not want it. False, with the reason, when it could not be removed.
bool DiscardRecovery(const Recovery& recovery, std::string& error);

// ---- For the session

/// The content of an autosave.
struct AutosaveContent {
  std::string setup;       ///< Absolute; empty when it was never saved.
  std::string basedOn;     ///< Hash of the file that was changed; empty when there was none.
  RunningProcess process;  ///< Who wrote it.
  std::string text;        ///< The setup.
};

/// False when it cannot be read or is no autosave (other programs, too, name their copies NAME~).
bool ReadAutosave(const std::string& path, AutosaveContent& content, std::string& error);
/// Replaces it in one step, readable by its owner alone; on failure the older one stands.
FileResult WriteAutosave(const std::string& path, const AutosaveContent& content);

/// Where the autosave of a setup stands.
std::string AutosaveBeside(const std::string& setup);
/// A name in the recovery folder at which nothing stands; `setup` may be empty.
std::string NewAutosaveName(const std::string& setup, const std::string& recoveryFolder);
/// False where something stands that is to be kept: unsaved changes that wait for their user, or no autosave at all.
bool MayReplaceAutosave(const std::string& path, const std::string& setup);

}  // namespace tervane
