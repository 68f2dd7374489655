// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <iostream>

#include "cli/command_line.h"
#include "platform/os.h"
#include "platform/os_process.h"

int main(int argc, char** argv) {
  tervane::os::PrepareProcess();
  std::ios::sync_with_stdio(false);
  const int status = tervane::RunCommandLine({argv + 1, argv + argc}, std::cout, std::cerr);
  if (status == tervane::kInterrupted) tervane::os::EndAsRequested();
  return status;
}
