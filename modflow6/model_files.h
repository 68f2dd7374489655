// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <vector>

#include "modelcells/work_log.h"
#include "modflow6/flow_model.h"
#include "modflow6/modflow6_export.h"

namespace tervane::modflow6 {

/// Writes all files of a model into a folder that is there and empty. Arrays that differ from cell to cell stand in
/// files of their own, row by row from the north. `written` gets the files' names, relative to the folder. An error
/// leaves what was written so far; `kCancelled` when the work was no longer wanted.
FileResult WriteModelFiles(const FlowModel& model, const std::string& folder, Modflow6Options::Arrays arrays,
                           WorkLog& log, std::vector<std::string>& written);

}  // namespace tervane::modflow6
