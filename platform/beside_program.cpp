// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/beside_program.h"

#include <array>
#include <filesystem>
#include <span>

#include <fmt/format.h>

#include "platform/os.h"
#include "platform/paths.h"

namespace tervane {

std::string FindBesideProgram(std::string_view name) {
  const std::string code = os::CodePath(), folder(FolderOf(code));
  // A library may stand in a folder of its own; a program has all beside it.
  constexpr std::array places{"/", "/tervane/", "/../", "/../bin/", "/../../bin/"};
  const std::size_t count = code == os::ProgramPath() ? 1 : places.size();
  std::error_code ignored;
  for (const char* place : std::span(places).first(count))
    if (std::string path = fmt::format("{}{}{}", folder, place, name);
        std::filesystem::exists(NativePath(path), ignored))
      return path;
  return {};
}

}  // namespace tervane
