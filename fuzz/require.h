// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdlib>
#include <iostream>
#include <string_view>

namespace tervane::fuzz {

/// Ends the process when a rule is broken, so that the fuzzer keeps the input.
inline void Require(bool holds, std::string_view rule, std::string_view found = {}) {
  if (holds) return;
  std::cerr << "broken rule: " << rule << ": " << found << std::endl;
  std::abort();
}

}  // namespace tervane::fuzz
