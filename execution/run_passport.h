// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The passport of a run: what it was made of, beside its results. So a figure can be traced to the setup and the files
// behind it, and results whose inputs have changed since are known.
#pragma once

#include <cstdint>
#include <filesystem>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "execution/run_state.h"
#include "platform/files.h"
#include "platform/progress.h"

namespace tervane {

/// A file that the run reads, as it was at its begin.
struct PassportInput {
  std::string path;
  std::string size;      ///< In bytes; empty for a file that was not there.
  std::string modified;  ///< "2026-11-26 14:00:05.123456789" UTC.
  std::string hash;      ///< See `HashFile`; empty as long as it is not known.
  std::string problem;   ///< Why it never will be: "it changed while the run went on".
};

/// As passports tell times, with all digits that the file system has.
std::string TextOfTime(std::filesystem::file_time_type time);

struct RunPassport {
  std::string id;  ///< That of the run's state.
  std::string setup, engine, options;
  std::string program;  ///< What wrote it: "Tervane 0.1.0".
  std::string user, host;
  std::string begun, ended;  ///< "2026-11-26 14:00:05" UTC; the end is empty until it is known.
  std::string outcome;       ///< A sentence; empty until it is known.
  std::vector<PassportInput> inputs;

  bool HasAllHashes() const;
};

/// Where it lies beside the results.
struct PassportFiles {
  std::string passport;  ///< BASENAME_Passport.kvf
  std::string setup;     ///< BASENAME_Passport.tvd: the setup as it was.
};
PassportFiles PassportFilesOf(std::string_view resultFolder, std::string_view setup);

/// What is known at the begin of a run.
RunPassport PassportOf(const RunState& state, const std::vector<std::string>& inputs);
FileResult WritePassport(const RunPassport& passport, const std::string& path);
/// Nothing with the problem, which is empty where there is no passport.
std::optional<RunPassport> ReadPassport(const std::string& path, std::string& problem);

/// Hashes the inputs that have none yet and that are as they were at the begin.
void HashInputs(RunPassport& passport, ProgressPart progress = {});
/// Puts the end of the run and the hashes into the passport on disk, unless that is of another run by now.
void FinishPassport(RunPassport passport, const RunState& state, const std::string& path);

/// What has become of an input since.
enum class InputFate { Same, Changed, Gone, New, Unknown };
struct InputChange {
  std::string path;
  InputFate fate = InputFate::Same;
};
/// "has changed", "is gone"; for a file that is the same nothing.
std::string_view NameOf(InputFate fate);

/// What is no longer as it was. A file whose size and time are the same is taken as the same; of another one with the
/// same size the hash decides, which takes as long as reading it, or with `isQuick` the time.
std::vector<InputChange> ChangedInputs(const RunPassport& passport, bool isQuick, ProgressPart progress = {});

}  // namespace tervane
