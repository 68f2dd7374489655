// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The C++ half of the Python module: handles of setups and nodes, data files, runs. The package over it has the
// docstrings, and gives these plain values their classes. The interpreter's lock is held while nodes are touched, so
// that a setup is used by one thread at a time; it is released while data files are read and written.
#pragma once

#include <memory>
#include <string>

#include <pybind11/pybind11.h>

#include "access/open_setup.h"

namespace tervane::python {

/// Raises the exception of that name of the package: "SetupError", "KeyNotFound", "ValueRefused", "UnitError",
/// "StaleNode".
[[noreturn]] void Raise(const char* exception, const std::string& text);
/// Raises a `SetupError` unless the problem is empty.
inline void RaiseProblem(const std::string& problem) {
  if (!problem.empty()) Raise("SetupError", problem);
}

/// A node of a setup; keeps the setup alive.
struct Node {
  std::shared_ptr<OpenSetup> setup;
  std::shared_ptr<HeldNode> held;

  /// Raises where it is gone.
  CYbSEKvfBase& Get() const;
};

/// Each adds what a source has.
void BindSetups(pybind11::module_& module);
void BindDataFiles(pybind11::module_& module);
void BindRuns(pybind11::module_& module);
void BindClimate(pybind11::module_& module);

}  // namespace tervane::python
