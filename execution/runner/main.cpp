// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "execution/engine_runner.h"
#include "platform/os.h"

int main(int argc, char** argv) {
  tervane::os::PrepareProcess();
  return tervane::RunEngineAndWait({argv + 1, argv + argc});
}
