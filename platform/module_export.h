// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What the sources of modules share; programs include platform/program_module.h instead.
#pragma once

#include <cstddef>

#ifdef _WIN32
#define TERVANE_EXPORT __declspec(dllexport)
#else
#define TERVANE_EXPORT __attribute__((visibility("default")))
#endif

/// Of a list of calls, with which `Calls` was declared too (TERVANE_CALL_POINTER).
#define TERVANE_CALL_ADDRESS(name) .name = &::name,

/// The whole of a module that brings the functions of a library: its function `entry`, as `LoadCalls` asks for it.
#define TERVANE_EXPORT_CALLS(entry, Calls, LIST)                   \
  extern "C" TERVANE_EXPORT const Calls* entry(std::size_t size) { \
    static constexpr Calls kCalls{LIST(TERVANE_CALL_ADDRESS)};     \
    return size == sizeof kCalls ? &kCalls : nullptr;              \
  }
