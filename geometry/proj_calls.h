// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The functions of PROJ that we call. A module has them, which is loaded when a projection is first asked for.
#pragma once

#include <memory>
#include <string>

#include <proj.h>

#include "platform/program_module.h"

namespace tervane::projections {

#define TERVANE_PROJ_CALLS(CALL)             \
  CALL(proj_as_wkt)                          \
  CALL(proj_clone)                           \
  CALL(proj_context_create)                  \
  CALL(proj_context_destroy)                 \
  CALL(proj_context_set_enable_network)      \
  CALL(proj_coord)                           \
  CALL(proj_create)                          \
  CALL(proj_create_crs_to_crs_from_pj)       \
  CALL(proj_create_from_name)                \
  CALL(proj_crs_get_sub_crs)                 \
  CALL(proj_crs_info_list_destroy)           \
  CALL(proj_get_crs_info_list_from_database) \
  CALL(proj_destroy)                         \
  CALL(proj_errno)                           \
  CALL(proj_errno_reset)                     \
  CALL(proj_get_name)                        \
  CALL(proj_get_source_crs)                  \
  CALL(proj_get_type)                        \
  CALL(proj_identify)                        \
  CALL(proj_int_list_destroy)                \
  CALL(proj_is_crs)                          \
  CALL(proj_is_equivalent_to_with_ctx)       \
  CALL(proj_list_destroy)                    \
  CALL(proj_list_get)                        \
  CALL(proj_list_get_count)                  \
  CALL(proj_log_level)                       \
  CALL(proj_normalize_for_visualization)     \
  CALL(proj_trans)

/// A pointer for each function, under the function's name.
struct Calls {
  TERVANE_PROJ_CALLS(TERVANE_CALL_POINTER)
};

inline constexpr const char* kModuleName = "tervane_proj";
inline constexpr const char* kEntryName = "TervaneProjCalls";

/// The functions; loads the module. Without it nothing may be called.
const Calls& Library();
/// Why there is no library; empty when it is there. To be asked before the first call of a file or text.
const std::string& WhyNoLibrary();

struct ContextCloser {
  void operator()(PJ_CONTEXT* context) const;
};
using Context = std::unique_ptr<PJ_CONTEXT, ContextCloser>;

/// A context of the library that writes nothing and asks no network; null without the library.
Context MakeContext();

}  // namespace tervane::projections
