// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <iostream>

#include "cli/command_line.h"
#include "platform/os.h"

int main(int argc, char** argv) {
  tervane::os::PrepareProcess();
  std::ios::sync_with_stdio(false);
  return tervane::RunCommandLine({argv + 1, argv + argc}, std::cout, std::cerr);
}
