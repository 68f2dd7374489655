// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "cli/parts/outcome.h"

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/parts/setup_file.h"
#include "platform/files.h"

namespace tervane {

int Refuse(Streams streams, const std::string& reason) {
  fmt::print(streams.err, "{}\n", reason);
  return kCouldNot;
}

bool RefuseToReplace(const std::string& file, bool force, Streams streams) {
  if (RefuseHeld(file, force, streams)) return true;
  if (force || !FileExists(file)) return false;
  fmt::print(streams.err, "{} exists; choose another name, or add --force to replace it\n", file);
  return true;
}

}  // namespace tervane
