// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/netcdf_calls.h"

#ifdef _WIN32
#define TERVANE_EXPORT __declspec(dllexport)
#else
#define TERVANE_EXPORT __attribute__((visibility("default")))
#endif

extern "C" TERVANE_EXPORT const tervane::netcdf::Calls* TervaneNetcdfCalls(std::size_t size) {
  static constexpr tervane::netcdf::Calls kCalls{
#define TERVANE_ADDRESS(name) .name = &::name,
      TERVANE_NETCDF_CALLS(TERVANE_ADDRESS)
#undef TERVANE_ADDRESS
  };
  return size == sizeof kCalls ? &kCalls : nullptr;
}
