// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Writes what a preprocessor leaves beside a setup, for the pictures of the manual: the folder of the results and the
// base name of the setup are named on the command line.
#include <cstdio>
#include <exception>

#include "tests/support/preprocessed_run.h"

int main(int argc, char** argv) {
  if (argc != 3) return 2;
  try {
    tervane::test::WritePreprocessedRun(argv[1], argv[2]);
  } catch (const std::exception& error) {
    std::fprintf(stderr, "%s\n", error.what());
    return 1;
  }
  return 0;
}
