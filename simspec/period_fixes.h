// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "core/fixes.h"

namespace tervane {

/// Of dates of a simulation on flow results that lie outside the simulation of flow: the nearest within it.
extern const FixKind kDateWithinSimulation;

}  // namespace tervane
