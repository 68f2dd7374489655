// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <iostream>

#include "engine/engine_program.h"

int main(int argc, char** argv) {
  return tervane::RunEngineProgram(std::vector<std::string>(argv + 1, argv + argc), std::cout);
}
