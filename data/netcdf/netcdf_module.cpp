// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/netcdf_calls.h"
#include "platform/module_export.h"

TERVANE_EXPORT_CALLS(TervaneNetcdfCalls, tervane::netcdf::Calls, TERVANE_NETCDF_CALLS)
