// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/engine_script.h"

#include <filesystem>

namespace tervane::test {

std::string WriteProgram(const TempFolder& folder, std::string_view name, std::string_view bytes) {
  const std::string path = folder.Write(name, bytes);
  std::filesystem::permissions(path, std::filesystem::perms::owner_all);
  return path;
}

std::string WriteEngine(const TempFolder& folder, std::string_view name, std::string_view commands) {
  return WriteProgram(folder, name, "#!/bin/sh\n" + std::string(commands) + "\n");
}

}  // namespace tervane::test
