// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <iostream>

#include "engine/extraction/extraction_program.h"

int main(int argc, char** argv) {
  return tervane::RunExtractionProgram(std::vector<std::string>(argv + 1, argv + argc), std::cout);
}
