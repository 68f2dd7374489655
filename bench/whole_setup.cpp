// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "bench/whole_setup.h"

namespace tervane::bench {

std::string TextOf(const CFlowModelDoc& setup) {
  std::string text, error;
  if (!setup.BuildText("/setups", text, error)) fmt::print("WRONG: not saved: {}\n", error);
  return text;
}

int NodesBelow(const CYbSEKvfBase& node) {
  int count = 0;
  for (CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child))
    count += 1 + NodesBelow(*child);
  return count;
}

}  // namespace tervane::bench
