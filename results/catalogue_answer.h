// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

namespace tervane {

/// What a catalogue was asked; without an error the value stands. Errors are a programmer's: a code that does not
/// exist, features that do not go together.
template <class Value>
struct CatalogueAnswer {
  Value value = {};
  std::string error = {};

  bool Ok() const { return error.empty(); }
};

}  // namespace tervane
