// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Modules: libraries of the program's own that are loaded when they are first needed. What they bring along (netCDF,
// HDF5, PROJ, GDAL) would otherwise be loaded at every start.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace tervane {

struct ProgramModule {
  void* entry = nullptr;  ///< Its function; null with a problem.
  std::string problem;
};

/// Loads a module from the program's folder; for an engine from the one above it, where the programs are, and for a
/// test of the build from theirs. `purpose` is a part of the message when it is missing: "reads rasters".
ProgramModule LoadProgramModule(std::string_view name, const char* entryName, std::string_view purpose);
/// What is said of a module that is there and refuses to serve.
std::string OtherVersionOf(std::string_view name);

/// A member of the struct of a library's functions, for a list of their names.
#define TERVANE_CALL_POINTER(name) decltype(&::name) name;

/// The functions of a library, as a struct of pointers that a module fills (platform/module_export.h).
template <class Calls>
struct LateCalls {
  const Calls* calls = nullptr;
  std::string problem;  ///< Why there are none.
};

/// The module's function takes the size of the struct, so that a module of another build is refused.
template <class Calls>
LateCalls<Calls> LoadCalls(std::string_view name, const char* entryName, std::string_view purpose) {
  ProgramModule module = LoadProgramModule(name, entryName, purpose);
  if (!module.entry) return {nullptr, std::move(module.problem)};
  const auto entry = reinterpret_cast<const Calls* (*)(std::size_t)>(module.entry);
  const Calls* const calls = entry(sizeof(Calls));
  return {calls, calls ? std::string() : OtherVersionOf(name)};
}

}  // namespace tervane
