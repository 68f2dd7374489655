// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <cstdio>
#include <new>

#include "execution/engine_runner.h"
#include "platform/os.h"

int main(int argc, char** argv) {
  tervane::os::PrepareProcess();
  try {
    return tervane::RunEngineAndWait({argv + 1, argv + argc});
  } catch (const std::bad_alloc&) {
    std::fputs("tervane_runner: there is not enough memory to watch a run\n", stderr);
    return tervane::kRunnerMisused;
  }
}
