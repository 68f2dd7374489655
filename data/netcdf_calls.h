// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The functions of netCDF and HDF5 that we call. A module has them, which is loaded when a data file is first asked
// for: both would take some milliseconds of every start.
#pragma once

#include <string>

#include <hdf5.h>
#include <netcdf.h>

#include "platform/program_module.h"

namespace tervane::netcdf {

#define TERVANE_NETCDF_CALLS(CALL) \
  CALL(nc__create)                 \
  CALL(nc__open)                   \
  CALL(nc_close)                   \
  CALL(nc_copy_att)                \
  CALL(nc_def_dim)                 \
  CALL(nc_def_var)                 \
  CALL(nc_def_var_chunking)        \
  CALL(nc_def_var_deflate)         \
  CALL(nc_enddef)                  \
  CALL(nc_free_string)             \
  CALL(nc_get_att_double)          \
  CALL(nc_get_att_string)          \
  CALL(nc_get_att_text)            \
  CALL(nc_get_var)                 \
  CALL(nc_get_var_double)          \
  CALL(nc_get_vara_double)         \
  CALL(nc_get_vara_float)          \
  CALL(nc_inq)                     \
  CALL(nc_inq_att)                 \
  CALL(nc_inq_attname)             \
  CALL(nc_inq_dim)                 \
  CALL(nc_inq_dimids)              \
  CALL(nc_inq_format)              \
  CALL(nc_inq_grps)                \
  CALL(nc_inq_unlimdim)            \
  CALL(nc_inq_var)                 \
  CALL(nc_inq_var_chunking)        \
  CALL(nc_inq_var_deflate)         \
  CALL(nc_inq_vardimid)            \
  CALL(nc_inq_varid)               \
  CALL(nc_inq_varnatts)            \
  CALL(nc_inq_varndims)            \
  CALL(nc_put_att_double)          \
  CALL(nc_put_att_float)           \
  CALL(nc_put_att_int)             \
  CALL(nc_put_att_text)            \
  CALL(nc_put_var)                 \
  CALL(nc_put_var1_double)         \
  CALL(nc_put_var_double)          \
  CALL(nc_put_vara_double)         \
  CALL(nc_put_vara_float)          \
  CALL(nc_set_fill)                \
  CALL(nc_strerror)                \
  CALL(H5Eset_auto2)

/// A pointer for each function, under the function's name.
struct Calls {
  TERVANE_NETCDF_CALLS(TERVANE_CALL_POINTER)
};

inline constexpr const char* kModuleName = "tervane_netcdf";
inline constexpr const char* kEntryName = "TervaneNetcdfCalls";

/// The functions; loads the module. Without it nothing may be called.
const Calls& Library();
/// Why there is no library; empty when it is there. To be asked before the first call of a file or text.
const std::string& WhyNoLibrary();

}  // namespace tervane::netcdf
