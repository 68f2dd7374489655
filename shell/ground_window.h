// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/units.h"
#include "shell/document_frame.h"

namespace tervane {

class ReliefWindow;

/// Opens a window with the ground of a setup seen from the side: its layers, lenses, wells.
ReliefWindow* OpenGroundWindow(DocumentFrame& frame, Host& host, const DisplayUnits& units);

}  // namespace tervane
