// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "engine/engine_program.h"

#include <new>

#include <fmt/format.h>

#include "document/flow_model_document.h"
#include "engine/engine_output.h"
#include "engine/preprocessor.h"
#include "execution/execute_flags.h"
#include "simspec/model_components.h"

namespace tervane {

namespace {

/// What a run does.
struct Tasks {
  bool preprocessing = false, waterMovement = false, waterQuality = false;
};

Tasks TasksOf(const std::string& option, const CFlowModelDoc& document) {
  if (option == "/PP") return {true, false, false};
  if (option == "/WM") return {false, true, false};
  if (option == "/WQ") return {false, false, true};
  const auto* flags = document.Root().Important(kExecuteFlags);
  const auto* components = document.Root().Important(kModelComponents);
  if (!flags || !components) return {true, false, false};
  return {flags->PP != 0, flags->WM != 0, flags->WQ != 0 && components->WQ != 0};
}

EngineStatus Run(const std::vector<std::string>& arguments, EngineOutput& log) {
  std::string setup, option;
  for (const std::string& argument : arguments) {
    const bool isOption = argument == "/PP" || argument == "/WM" || argument == "/WQ";
    std::string& place = isOption ? option : setup;
    if (!place.empty() || argument.empty()) {
      log.Error({}, "usage: Tvn_Simulation SETUP.tvd [/PP | /WM | /WQ]");
      return kEngineCouldNot;
    }
    place = argument;
  }
  if (setup.empty()) {
    log.Error({}, "usage: Tvn_Simulation SETUP.tvd [/PP | /WM | /WQ]");
    return kEngineCouldNot;
  }
  log.Progress(0, "Reading the setup");
  CFlowModelDoc document;
  if (!document.OnOpenDocument(setup)) {
    log.Error({}, document.Error());
    return kEngineFailed;
  }
  const Tasks tasks = TasksOf(option, document);
  if (tasks.preprocessing && !Preprocessor(document, log).Run()) return kEngineFailed;
  if (tasks.waterMovement || tasks.waterQuality) {
    log.Error({}, fmt::format("this engine preprocesses a setup and simulates no water: there is no {} simulation{}",
                              tasks.waterMovement ? "water movement" : "water quality",
                              tasks.preprocessing ? "; the preprocessing was done" : ""));
    return kEngineFailed;
  }
  log.Progress(100, "Done");
  return kEngineDone;
}

}  // namespace

EngineStatus RunEngineProgram(const std::vector<std::string>& arguments, std::ostream& out) {
  EngineOutput log(out);
  try {
    return Run(arguments, log);
  } catch (const std::bad_alloc&) {
    log.Error({}, "there is not enough memory for this setup");
    return kEngineCouldNot;
  }
}

}  // namespace tervane
