// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "cli/verify_run.h"

#include <vector>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/command_line.h"
#include "cli/difference_text.h"
#include "cli/json.h"
#include "cli/setup_file.h"
#include "execution/run_passport.h"
#include "platform/paths.h"

namespace tervane {

namespace {

void PrintJson(const RunPassport& passport, const std::vector<InputChange>& changes,
               const std::vector<SetupDifference>& differences, Streams streams) {
  std::vector<std::string> inputs, ofSetup;
  for (const InputChange& change : changes)
    inputs.push_back(JsonObject({{"file", JsonQuoted(change.path)}, {"text", JsonQuoted(NameOf(change.fate))}}));
  for (const SetupDifference& difference : differences) ofSetup.push_back(DifferenceJson(difference));
  const auto optional = [](const std::string& text) { return text.empty() ? std::string() : JsonQuoted(text); };
  fmt::print(streams.out, "{}\n",
             JsonObject({{"begun", JsonQuoted(passport.begun)},
                         {"ended", optional(passport.ended)},
                         {"outcome", optional(passport.outcome)},
                         {"engine", JsonQuoted(passport.engine)},
                         {"options", optional(passport.options)},
                         {"user", JsonQuoted(passport.user)},
                         {"host", JsonQuoted(passport.host)},
                         {"inputs", JsonArray(inputs)},
                         {"differences", JsonArray(ofSetup)}}));
}

}  // namespace

int VerifyRun(const std::string& setup, bool json, Streams streams) {
  CFlowModelDoc document;
  if (!OpenSetup(document, setup, streams)) return kCouldNot;
  const PassportFiles files = PassportFilesOf(ResolvedPath(document.getResultFolder(), {}), document.PathName());
  std::string problem;
  const std::optional<RunPassport> passport = ReadPassport(files.passport, problem);
  if (!passport) {
    fmt::print(streams.err, "{}: {}\n", setup,
               problem.empty() ? "there are no results of a run that left a passport" : problem);
    return kCouldNot;
  }
  std::vector<InputChange> changes = ChangedInputs(*passport, false);
  std::vector<SetupDifference> differences;
  CFlowModelDoc before;
  if (FileExists(files.setup) && before.OnOpenDocument(files.setup)) {
    differences = CompareDocuments(before, document);
    // Its text may be another and mean the same.
    std::erase_if(changes, [&](const InputChange& change) {
      return change.path == passport->setup && change.fate == InputFate::Changed && differences.empty();
    });
  }
  const bool isSame = changes.empty() && differences.empty();
  if (json) {
    PrintJson(*passport, changes, differences, streams);
    return isSame ? kDone : kFindings;
  }
  fmt::print(streams.err, "{}: the results are of the run that began {} UTC on host {}. {}\n", setup, passport->begun,
             passport->host, passport->outcome.empty() ? "Its end is not known." : passport->outcome);
  for (const InputChange& change : changes) fmt::print(streams.out, "{}: {}\n", change.path, NameOf(change.fate));
  for (const SetupDifference& difference : differences) fmt::print(streams.out, "{}\n", DifferenceLine(difference));
  if (isSame) fmt::print(streams.err, "{}: setup and inputs are as they were\n", setup);
  return isSame ? kDone : kFindings;
}

}  // namespace tervane
