// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "cli/parts/outcome.h"

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/parts/setup_file.h"
#include "platform/files.h"
#include "platform/text.h"

namespace tervane {

int Refuse(Streams streams, const std::string& reason) {
  fmt::print(streams.err, "{}\n", reason);
  return kCouldNot;
}

std::string Suggestion(const std::string& typed, const std::vector<std::string>& names) {
  const std::string* nearest = nullptr;
  std::size_t least = typed.size() / 3 + 2;
  for (const std::string& name : names) {
    if (EqualIgnoringCase(name, typed)) return fmt::format("; did you mean {}?", name);
    const std::size_t distance = EditDistance(name, typed);
    if (distance >= least) continue;
    least = distance;
    nearest = &name;
  }
  return nearest ? fmt::format("; did you mean {}?", *nearest) : std::string();
}

bool RefuseToReplace(const std::string& file, bool force, Streams streams) {
  if (RefuseHeld(file, force, streams)) return true;
  if (force || !FileExists(file)) return false;
  fmt::print(streams.err, "{} exists; choose another name, or add --force to replace it\n", file);
  return true;
}

}  // namespace tervane
