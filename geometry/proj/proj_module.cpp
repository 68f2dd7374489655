// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/proj_calls.h"
#include "platform/module_export.h"

TERVANE_EXPORT_CALLS(TervaneProjCalls, tervane::projections::Calls, TERVANE_PROJ_CALLS)
