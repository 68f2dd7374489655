// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <ostream>
#include <string>
#include <vector>

#include "engine/engine_program.h"

namespace tervane {

/// `PTRetrieval_Launch SETUP.tvd /Engine KIND /SelPostProc JOB`: tells what the extraction jobs of a setup would take
/// out of the results of particle tracking, and makes no file. KIND is 0 for registrations and 1 for pathlines, JOB the
/// number of a job or -1 for all.
EngineStatus RunExtractionProgram(const std::vector<std::string>& arguments, std::ostream& out);

}  // namespace tervane
