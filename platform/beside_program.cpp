// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/beside_program.h"

#include <filesystem>

#include <fmt/format.h>

#include "platform/paths.h"

namespace tervane {

std::string FindBesideProgram(std::string_view name) {
  const std::string folder(FolderOf(os::CodePath()));
  std::error_code ignored;
  for (const char* place : {"/", "/tervane/", "/../", "/../bin/", "/../../bin/"})
    if (std::string path = fmt::format("{}{}{}", folder, place, name);
        std::filesystem::exists(NativePath(path), ignored))
      return path;
  return {};
}

}  // namespace tervane
