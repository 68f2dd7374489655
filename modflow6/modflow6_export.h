// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A setup with a Modflow engine as a model of MODFLOW 6, in a folder of its own.
#pragma once

#include <string>

#include "modelcells/model_layers.h"
#include "modelcells/work_log.h"
#include "modflow6/export_report.h"
#include "platform/files.h"

namespace tervane {

class CYbSEKvfGlobalBase;

}

namespace tervane::modflow6 {

struct Modflow6Options {
  enum class Arrays { Text, Binary } arrays = Arrays::Text;
  ModelLayers::ThinCells thinCells = ModelLayers::ThinCells::EndLower;
  bool force = false;  ///< Replaces the files of a model that is there.
};

inline constexpr const char* kReportFile = "export-report.txt";

/// Writes the model of a setup of that name, with a file `kReportFile` that tells for each input what became of it. An
/// error says why there is no model and what to do, a note how many inputs were changed or left out; without success,
/// also when cancelled, the folder is as it was.
FileResult ExportModflow6(CYbSEKvfGlobalBase& root, const std::string& setupName, const std::string& folder,
                          const Modflow6Options& options, WorkLog& log, ExportReport& report);

}  // namespace tervane::modflow6
