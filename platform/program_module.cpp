// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/program_module.h"

#include <fmt/format.h>

#include "platform/beside_program.h"
#include "platform/os.h"
#include "platform/paths.h"

namespace tervane {

namespace {

std::string CannotBeLoaded(std::string_view what, std::string_view reason) {
  return fmt::format("{} cannot be loaded: {}; install the program anew", what, reason);
}

}  // namespace

ProgramModule LoadProgramModule(std::string_view name, const char* entryName, std::string_view purpose) {
  const std::string fileName = os::SharedLibraryName(name);
  if (const std::string path = FindBesideProgram(fileName); !path.empty()) {
    std::string reason;
    void* const library = os::LoadSharedLibrary(path, reason);
    if (!library) return {nullptr, CannotBeLoaded(path, reason)};
    void* const entry = os::FunctionOf(library, entryName);
    return {entry, entry ? std::string() : OtherVersionOf(path)};
  }
  return {nullptr, fmt::format("{}, which {}, is missing beside the program in {}; install the program anew", fileName,
                               purpose, FolderOf(os::CodePath()))};
}

std::string OtherVersionOf(std::string_view name) {
  return CannotBeLoaded(name, "it belongs to another version of the program");
}

}  // namespace tervane
