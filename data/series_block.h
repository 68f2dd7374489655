// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <span>
#include <string>
#include <vector>

#include "platform/progress.h"

namespace tervane {

/// Reads series of a netCDF file together, each as `DataFile::Read` gives it in the file's unit: a file that holds the
/// values of all its series step by step is walked through once, where one series after the other would take as many
/// walks. "" or why not; then `values` holds nothing of use.
std::string ReadSeriesTogether(const std::string& path, std::span<const int> items,
                               std::vector<std::vector<float>>& values, ProgressPart progress = {});

}  // namespace tervane
